#include "platform/ado/SqlTokenizer.h"

#include <cctype>

#include "platform/ado/ConnectionString.h"

namespace ado::sql {

bool Token::Is(std::string_view s) const {
  if (kind == TokenKind::Symbol) return text == s;
  if (kind == TokenKind::Word) return EqualsNoCase(text, s);
  return false;
}

namespace {

bool IsWordStart(unsigned char c) { return std::isalpha(c) || c == '_' || c == '@' || c == '#' || c >= 0x80; }
bool IsWordChar(unsigned char c) { return std::isalnum(c) || c == '_' || c == '@' || c == '#' || c == '$' || c >= 0x80; }

class Scanner {
 public:
  explicit Scanner(std::string_view sql) : s_(sql) {}

  std::vector<Token> Run() {
    std::vector<Token> out;
    bool space = false;
    while (pos_ < s_.size()) {
      if (SkipBlankOrComment()) {
        space = true;
        continue;
      }
      size_t start = pos_;
      Token t = Next();
      t.spaceBefore = space;
      t.offset = start;
      space = false;
      out.push_back(std::move(t));
    }
    return out;
  }

 private:
  char At(size_t i) const { return i < s_.size() ? s_[i] : '\0'; }

  bool SkipBlankOrComment() {
    unsigned char c = static_cast<unsigned char>(s_[pos_]);
    if (std::isspace(c)) {
      ++pos_;
      return true;
    }
    if (c == '-' && At(pos_ + 1) == '-') {
      while (pos_ < s_.size() && s_[pos_] != '\n') ++pos_;
      return true;
    }
    if (c == '/' && At(pos_ + 1) == '*') {
      // Comments nest on the server, so they do here.
      int depth = 0;
      while (pos_ < s_.size()) {
        if (s_[pos_] == '/' && At(pos_ + 1) == '*') {
          ++depth;
          pos_ += 2;
        } else if (s_[pos_] == '*' && At(pos_ + 1) == '/') {
          pos_ += 2;
          if (--depth == 0) return true;
        } else {
          ++pos_;
        }
      }
      throw TokenizeError("Missing end comment mark '*/'.");
    }
    return false;
  }

  Token Next() {
    char c = s_[pos_];
    if (c == '\'') return StringLiteral();
    if ((c == 'N' || c == 'n') && At(pos_ + 1) == '\'') {
      ++pos_;
      return StringLiteral();
    }
    if (c == '"') return Quoted('"', '"');
    if (c == '[') return Quoted('[', ']');
    if (std::isdigit(static_cast<unsigned char>(c)) ||
        (c == '.' && std::isdigit(static_cast<unsigned char>(At(pos_ + 1)))))
      return NumberLiteral();
    if (IsWordStart(static_cast<unsigned char>(c))) return WordToken();
    return SymbolToken();
  }

  Token StringLiteral() {
    size_t start = pos_++;
    std::string value;
    while (true) {
      if (pos_ >= s_.size())
        throw TokenizeError("Unclosed quotation mark after the character string '" + value + "'.");
      char c = s_[pos_++];
      if (c == '\'') {
        if (At(pos_) == '\'') {
          value += '\'';
          ++pos_;
          continue;
        }
        break;
      }
      value += c;
    }
    return Token{TokenKind::String, std::string(s_.substr(start, pos_ - start)), value};
  }

  Token Quoted(char open, char close) {
    size_t start = pos_++;
    while (true) {
      if (pos_ >= s_.size()) throw TokenizeError("Unclosed quoted identifier.");
      if (s_[pos_] == close) {
        if (At(pos_ + 1) == close) {
          pos_ += 2;
          continue;
        }
        ++pos_;
        break;
      }
      ++pos_;
    }
    (void)open;
    return Token{TokenKind::QuotedIdent, std::string(s_.substr(start, pos_ - start)), {}};
  }

  Token NumberLiteral() {
    size_t start = pos_;
    while (std::isdigit(static_cast<unsigned char>(At(pos_)))) ++pos_;
    if (At(pos_) == '.') {
      ++pos_;
      while (std::isdigit(static_cast<unsigned char>(At(pos_)))) ++pos_;
    }
    if ((At(pos_) == 'e' || At(pos_) == 'E') &&
        (std::isdigit(static_cast<unsigned char>(At(pos_ + 1))) ||
         ((At(pos_ + 1) == '+' || At(pos_ + 1) == '-') &&
          std::isdigit(static_cast<unsigned char>(At(pos_ + 2)))))) {
      pos_ += 2;
      while (std::isdigit(static_cast<unsigned char>(At(pos_)))) ++pos_;
    }
    return Token{TokenKind::Number, std::string(s_.substr(start, pos_ - start)), {}};
  }

  Token WordToken() {
    size_t start = pos_;
    while (pos_ < s_.size() && IsWordChar(static_cast<unsigned char>(s_[pos_]))) ++pos_;
    return Token{TokenKind::Word, std::string(s_.substr(start, pos_ - start)), {}};
  }

  Token SymbolToken() {
    static constexpr std::string_view kTwo[] = {"<=", ">=", "<>", "!=", "!<", "!>", "||"};
    for (auto two : kTwo) {
      if (s_.substr(pos_, 2) == two) {
        pos_ += 2;
        return Token{TokenKind::Symbol, std::string(two), {}};
      }
    }
    return Token{TokenKind::Symbol, std::string(1, s_[pos_++]), {}};
  }

  std::string_view s_;
  size_t pos_ = 0;
};

}  // namespace

std::vector<Token> Tokenize(std::string_view sql) { return Scanner(sql).Run(); }

std::vector<std::string> SplitStatements(std::string_view script) {
  std::vector<std::string> out;
  size_t start = 0;
  bool any = false;
  auto flush = [&](size_t end) {
    if (any) out.emplace_back(script.substr(start, end - start));
    any = false;
  };
  for (const Token& t : Tokenize(script)) {
    if (t.kind == TokenKind::Symbol && t.text == ";") {
      flush(t.offset);
      start = t.offset + 1;
    } else {
      if (!any) start = t.offset;
      any = true;
    }
  }
  flush(script.size());
  return out;
}

std::string QuoteLiteral(std::string_view text) {
  std::string out = "'";
  for (char c : text) {
    out += c;
    if (c == '\'') out += '\'';
  }
  return out + "'";
}

}  // namespace ado::sql
