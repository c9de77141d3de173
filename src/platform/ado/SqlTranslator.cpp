#include "platform/ado/SqlTranslator.h"

#include <array>
#include <cctype>
#include <vector>

#include "platform/ado/ServerDate.h"
#include "platform/ado/SqlTokenizer.h"

namespace ado::sql {

namespace {

constexpr size_t npos = static_cast<size_t>(-1);

// Keywords after which an expression starts: none of them ends an operand.
bool IsOperatorKeyword(const Token& t) {
  static constexpr std::array<std::string_view, 44> kWords = {
      "SELECT", "FROM",   "WHERE",  "AND",     "OR",       "NOT",    "ON",     "SET",
      "VALUES", "WHEN",   "THEN",   "ELSE",    "CASE",     "IN",     "IS",     "LIKE",
      "BETWEEN", "AS",    "BY",     "ORDER",   "GROUP",    "HAVING", "JOIN",   "LEFT",
      "RIGHT",  "INNER",  "OUTER",  "UNION",   "ALL",      "DISTINCT", "TOP",  "INTO",
      "UPDATE", "DELETE", "INSERT", "RETURN",  "EXISTS",   "ESCAPE", "WITH",   "LIMIT",
      "ASC",    "DESC",   "CROSS",  "EXCEPT"};
  if (t.kind != TokenKind::Word) return false;
  for (auto w : kWords)
    if (t.Is(w)) return true;
  return false;
}

bool IsTableHint(const Token& t) {
  static constexpr std::array<std::string_view, 16> kHints = {
      "NOLOCK",        "UPDLOCK",         "HOLDLOCK",       "ROWLOCK",
      "TABLOCK",       "TABLOCKX",        "PAGLOCK",        "READPAST",
      "READCOMMITTED", "READUNCOMMITTED", "REPEATABLEREAD", "SERIALIZABLE",
      "XLOCK",         "NOWAIT",          "FASTFIRSTROW",   "NOEXPAND"};
  for (auto h : kHints)
    if (t.Is(h)) return true;
  return false;
}

// Appends pieces with single blanks, none around "." or inside parentheses' edges.
class Output {
 public:
  void Add(std::string_view piece) {
    if (piece.empty()) return;
    char first = piece.front();
    char last = text_.empty() ? ' ' : text_.back();
    bool callOrName = first == '(' && (std::isalnum(static_cast<unsigned char>(last)) || last == '_');
    bool tight = text_.empty() || first == ',' || first == ')' || first == '.' || callOrName ||
                 last == '(' || last == '.';
    if (!tight) text_ += ' ';
    text_ += piece;
  }
  std::string Take() { return std::move(text_); }

 private:
  std::string text_;
};

class Translator {
 public:
  explicit Translator(const std::vector<Token>& ts) : ts_(ts) {}

  std::string Range(size_t b, size_t e) {
    Output out;
    size_t i = b;
    while (i < e) {
      if (TermMayStart(i, b)) {
        if (auto chain = AdditiveChain(i, e)) {
          out.Add(chain->text);
          i = chain->end;
          continue;
        }
      }
      i = Emit(i, e, out);
    }
    return out.Take();
  }

 private:
  struct Chain {
    std::string text;
    size_t end;
  };

  const Token& T(size_t i) const { return ts_[i]; }
  bool Sym(size_t i, size_t e, std::string_view s) const { return i < e && T(i).kind == TokenKind::Symbol && T(i).text == s; }

  bool IsOperandEnd(size_t i) const {
    const Token& t = T(i);
    switch (t.kind) {
      case TokenKind::String:
      case TokenKind::Number:
      case TokenKind::QuotedIdent:
        return true;
      case TokenKind::Word:
        return !IsOperatorKeyword(t);
      case TokenKind::Symbol:
        // "t.*" ends a name; a bare "*" is the select list's or a product.
        return t.text == ")" || (t.text == "*" && i > 0 && T(i - 1).Is("."));
    }
    return false;
  }

  bool TermMayStart(size_t i, size_t b) const { return i == b || !IsOperandEnd(i - 1); }

  size_t MatchParen(size_t open, size_t e) const {
    int depth = 0;
    for (size_t i = open; i < e; ++i) {
      if (Sym(i, e, "(")) ++depth;
      if (Sym(i, e, ")") && --depth == 0) return i;
    }
    return npos;
  }

  size_t MatchCase(size_t c, size_t e) const {
    int depth = 0;
    for (size_t i = c; i < e; ++i) {
      if (T(i).Is("CASE")) ++depth;
      if (T(i).Is("END") && --depth == 0) return i;
    }
    return npos;
  }

  size_t NameChain(size_t i, size_t e) const {
    size_t j = i + 1;
    while (j + 1 < e && Sym(j, e, ".") &&
           (T(j + 1).kind == TokenKind::Word || T(j + 1).kind == TokenKind::QuotedIdent ||
            Sym(j + 1, e, "*")))
      j += 2;
    return j;
  }

  size_t Primary(size_t i, size_t e) const {
    if (i >= e) return npos;
    const Token& t = T(i);
    if (Sym(i, e, "-") || Sym(i, e, "+") || Sym(i, e, "~")) return Primary(i + 1, e);
    if (t.kind == TokenKind::String || t.kind == TokenKind::Number) return i + 1;
    if (Sym(i, e, "(")) {
      size_t close = MatchParen(i, e);
      return close == npos ? npos : close + 1;
    }
    if (t.kind == TokenKind::QuotedIdent) return NameChain(i, e);
    if (t.kind != TokenKind::Word) return npos;
    if (t.Is("CASE")) {
      size_t end = MatchCase(i, e);
      return end == npos ? npos : end + 1;
    }
    if (IsOperatorKeyword(t)) return npos;
    if (Sym(i + 1, e, "(")) {
      size_t close = MatchParen(i + 1, e);
      return close == npos ? npos : close + 1;
    }
    return NameChain(i, e);
  }

  size_t Term(size_t i, size_t e) const {
    size_t j = Primary(i, e);
    while (j != npos && j < e && (Sym(j, e, "*") || Sym(j, e, "/") || Sym(j, e, "%")))
      j = Primary(j + 1, e);
    return j;
  }

  // term (("+" | "-") term)* with at least one "+": rewritten left to right, because
  // "+" is addition for numbers and joining for texts, decided per row by dv_plus.
  std::optional<Chain> AdditiveChain(size_t i, size_t e) {
    size_t first = Term(i, e);
    if (first == npos || first >= e || !(Sym(first, e, "+") || Sym(first, e, "-")))
      return std::nullopt;
    std::vector<std::pair<size_t, size_t>> terms{{i, first}};
    std::vector<char> ops;
    size_t j = first;
    while (j < e && (Sym(j, e, "+") || Sym(j, e, "-"))) {
      size_t k = Term(j + 1, e);
      if (k == npos) break;
      ops.push_back(T(j).text[0]);
      terms.emplace_back(j + 1, k);
      j = k;
    }
    bool anyPlus = false;
    for (char op : ops) anyPlus |= op == '+';
    if (!anyPlus) return std::nullopt;
    std::string acc = Range(terms[0].first, terms[0].second);
    for (size_t n = 0; n < ops.size(); ++n) {
      std::string piece = Range(terms[n + 1].first, terms[n + 1].second);
      acc = ops[n] == '+' ? "dv_plus(" + acc + ", " + piece + ")" : "(" + acc + " - " + piece + ")";
    }
    return Chain{std::move(acc), j};
  }

  // Emits the token at i (or the construct starting there) and returns what follows.
  size_t Emit(size_t i, size_t e, Output& out) {
    const Token& t = T(i);
    if (t.kind == TokenKind::Word) {
      if (t.Is("@@IDENTITY")) return out.Add("dv_identity()"), i + 1;
      if (t.Is("@@TRANCOUNT")) return out.Add("dv_trancount()"), i + 1;
      if (t.Is("@@ROWCOUNT")) return out.Add("changes()"), i + 1;
      if (t.text.starts_with("@"))
        throw TranslateError("Must declare the scalar variable \"" + t.text + "\".");
      if (t.Is("CONVERT") && Sym(i + 1, e, "(")) return Convert(i, e, out);
      if (t.Is("ISNULL") && Sym(i + 1, e, "(")) return out.Add("IFNULL"), i + 1;
      if (t.Is("SELECT")) return Select(i, e, out);
      if (t.Is("WITH") && i > 0 && IsOperandEnd(i - 1) && Sym(i + 1, e, "(")) {
        size_t close = MatchParen(i + 1, e);
        if (close != npos && OnlyHints(i + 2, close)) return close + 1;
      }
    }
    if (t.kind == TokenKind::String) return out.Add(QuoteLiteral(t.value)), i + 1;
    if (Sym(i, e, ";")) {
      for (size_t k = i + 1; k < e; ++k)
        if (!Sym(k, e, ";"))
          throw TranslateError("Only one statement can be run at a time.");
      return e;
    }
    out.Add(t.text);
    return i + 1;
  }

  bool OnlyHints(size_t b, size_t e) const {
    if (b >= e) return false;
    for (size_t k = b; k < e; ++k) {
      bool comma = (k - b) % 2 == 1;
      if (comma ? !Sym(k, e, ",") : !IsTableHint(T(k))) return false;
    }
    return true;
  }

  // SELECT [DISTINCT | ALL] TOP n ...: the limit moves to the end of this SELECT, which
  // is the closing parenthesis around it or the end of the statement.
  size_t Select(size_t i, size_t e, Output& out) {
    size_t j = i + 1;
    if (j < e && (T(j).Is("DISTINCT") || T(j).Is("ALL"))) ++j;
    if (j >= e || !T(j).Is("TOP")) {
      out.Add(T(i).text);
      return i + 1;
    }
    size_t k = j + 1;
    std::string limit;
    if (Sym(k, e, "(")) {
      size_t close = MatchParen(k, e);
      if (close == npos) throw TranslateError("Incorrect syntax near 'TOP'.");
      limit = "(" + Range(k + 1, close) + ")";
      k = close + 1;
    } else if (k < e && T(k).kind == TokenKind::Number) {
      limit = T(k).text;
      ++k;
    } else {
      throw TranslateError("Incorrect syntax near 'TOP'.");
    }
    if (k < e && (T(k).Is("PERCENT") || T(k).Is("WITH")))
      throw TranslateError("TOP with PERCENT or WITH TIES is not supported.");
    size_t scopeEnd = k;
    int depth = 0;
    for (; scopeEnd < e; ++scopeEnd) {
      if (Sym(scopeEnd, e, "(")) ++depth;
      if (Sym(scopeEnd, e, ")") && depth-- == 0) break;
      if (Sym(scopeEnd, e, ";") && depth == 0) break;
    }
    out.Add(T(i).text);
    if (j > i + 1) out.Add(T(i + 1).text);
    out.Add(Range(k, scopeEnd));
    out.Add("LIMIT " + limit);
    return scopeEnd;
  }

  // CONVERT(type, expr [, style]).
  size_t Convert(size_t i, size_t e, Output& out) {
    size_t open = i + 1, close = MatchParen(open, e);
    if (close == npos) throw TranslateError("Incorrect syntax near 'CONVERT'.");
    std::vector<std::pair<size_t, size_t>> args;
    size_t start = open + 1;
    int depth = 0;
    for (size_t k = open + 1; k < close; ++k) {
      if (Sym(k, e, "(")) ++depth;
      if (Sym(k, e, ")")) --depth;
      if (depth == 0 && Sym(k, e, ",")) {
        args.emplace_back(start, k);
        start = k + 1;
      }
    }
    args.emplace_back(start, close);
    if (args.size() < 2 || args[0].first >= args[0].second || args[1].first >= args[1].second)
      throw TranslateError("Incorrect syntax near 'CONVERT'.");
    const Token& type = T(args[0].first);
    auto [eb, ee] = args[1];
    auto is = [&](std::initializer_list<std::string_view> names) {
      for (auto n : names)
        if (type.Is(n)) return true;
      return false;
    };
    if (is({"DATETIME", "SMALLDATETIME", "DATETIME2", "DATE"})) {
      if (ee == eb + 1 && T(eb).kind == TokenKind::String) {
        auto stored = NormalizeDateTimeText(T(eb).value);
        if (!stored)
          throw TranslateError(
              "Conversion failed when converting date and/or time from character string.");
        if (type.Is("DATE")) stored = stored->substr(0, 10) + " 00:00:00";
        out.Add(QuoteLiteral(*stored));
      } else {
        out.Add("dv_datetime(" + Range(eb, ee) + ")");
      }
    } else if (is({"INT", "INTEGER", "BIGINT", "SMALLINT", "TINYINT", "BIT"})) {
      out.Add("CAST(" + Range(eb, ee) + " AS INTEGER)");
    } else if (is({"DECIMAL", "NUMERIC", "MONEY", "SMALLMONEY", "FLOAT", "REAL"})) {
      out.Add("CAST(" + Range(eb, ee) + " AS REAL)");
    } else if (is({"CHAR", "VARCHAR", "NCHAR", "NVARCHAR", "TEXT", "NTEXT"})) {
      out.Add("CAST(" + Range(eb, ee) + " AS TEXT)");
    } else {
      throw TranslateError("Type " + type.text + " is not a defined system type.");
    }
    return close + 1;
  }

  const std::vector<Token>& ts_;
};

std::optional<std::string> TranCountOnly(const std::vector<Token>& ts) {
  size_t n = ts.size();
  while (n > 0 && ts[n - 1].Is(";")) --n;
  if (n < 2 || !ts[0].Is("SELECT") || !ts[1].Is("@@TRANCOUNT")) return std::nullopt;
  if (n == 2) return std::string();
  size_t alias = ts[2].Is("AS") ? 3 : 2;
  if (alias + 1 != n) return std::nullopt;
  const Token& a = ts[alias];
  if (a.kind == TokenKind::Word) return a.text;
  if (a.kind == TokenKind::QuotedIdent || a.kind == TokenKind::String) {
    if (a.kind == TokenKind::String) return a.value;
    return a.text.substr(1, a.text.size() - 2);
  }
  return std::nullopt;
}

}  // namespace

Translation TranslateToSqlite(std::string_view tsql) {
  std::vector<Token> ts;
  try {
    ts = Tokenize(tsql);
  } catch (const TokenizeError& e) {
    throw TranslateError(e.what());
  }
  Translation result;
  result.tranCountColumn = TranCountOnly(ts);
  result.sql = Translator(ts).Range(0, ts.size());
  return result;
}

}  // namespace ado::sql
