#include "platform/ado/PostgresDialect.h"

#include <algorithm>
#include <array>
#include <string>
#include <vector>

#include "platform/ado/SqlRewriter.h"
#include "platform/ado/SqlTokenizer.h"

namespace ado::sql {

namespace {

bool IsComparison(const Token& t) {
  if (t.kind != TokenKind::Symbol) return false;
  for (std::string_view op : {"=", "<>", "!=", "<", ">", "<=", ">=", "!<", "!>"})
    if (t.text == op) return true;
  return false;
}

bool IsArithmetic(const Token& t) {
  if (t.kind != TokenKind::Symbol) return false;
  for (std::string_view op : {"+", "-", "*", "/", "%"})
    if (t.text == op) return true;
  return false;
}

bool IsWholeNumber(const Token& t) {
  return t.kind == TokenKind::Number && !t.text.empty() &&
         std::all_of(t.text.begin(), t.text.end(), [](char c) { return c >= '0' && c <= '9'; });
}

bool IsTextType(const Token& t) {
  for (std::string_view name : {"CHAR", "VARCHAR", "NCHAR", "NVARCHAR", "TEXT", "NTEXT"})
    if (t.Is(name)) return true;
  return false;
}

// CHAR(n) reads n in the Windows Latin-1 code page, whose 128 to 159 are not Unicode's.
int CodePoint1252(int n) {
  static constexpr std::array<int, 32> kHigh = {
      0x20AC, 0x81,   0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021, 0x02C6, 0x2030, 0x0160,
      0x2039, 0x0152, 0x8D,   0x017D, 0x8F,   0x90,   0x2018, 0x2019, 0x201C, 0x201D, 0x2022,
      0x2013, 0x2014, 0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0x9D,   0x017E, 0x0178};
  return n >= 128 && n < 160 ? kHigh[static_cast<size_t>(n - 128)] : n;
}

// [Name] or "Name" as the folded, quoted name the schema's unquoted names became.
std::string FoldedName(const Token& t) {
  const char close = t.text.front() == '[' ? ']' : '"';
  std::string_view inner(t.text);
  inner = inner.substr(1, inner.size() - 2);
  std::string out = "\"";
  for (size_t k = 0; k < inner.size(); ++k) {
    char c = inner[k];
    if (c == close && k + 1 < inner.size() && inner[k + 1] == close) ++k;  // doubled closer
    if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
    out += c;
    if (c == '"') out += '"';
  }
  return out + "\"";
}

// A LIKE pattern with [sets] as a SIMILAR TO pattern escaped with "\": the characters
// that are operators there and plain text in LIKE are escaped.
std::string SimilarPattern(const std::string& like) {
  std::string out;
  bool inSet = false;
  for (char c : like) {
    if (inSet) {
      if (c == '\\') out += '\\';
      out += c;
      if (c == ']') inSet = false;
      continue;
    }
    if (c == '[') inSet = true;
    else if (std::string_view("|*+?{}()\\").find(c) != std::string_view::npos) out += '\\';
    out += c;
  }
  return out;
}

class PostgresRewriter : public Rewriter {
 public:
  PostgresRewriter(const std::vector<Token>& ts, int tranCount) : Rewriter(ts), tranCount_(tranCount) {}

  bool ForUpdate() const { return forUpdate_; }

 protected:
  std::string Variable(const Token& name) override {
    if (name.Is("@@IDENTITY")) return "dv_identity()";
    if (name.Is("@@TRANCOUNT")) return std::to_string(tranCount_);
    throw TranslateError(name.text + " is not supported on this server.");
  }

  std::optional<std::string> FunctionName(const Token& name) override {
    if (name.Is("ISNULL")) return "COALESCE";
    return std::nullopt;
  }

  // "+" joins texts when a text is certain on either side; otherwise it stays, and the
  // schema's text + text operator joins two text columns while numbers still add.
  std::string AdditiveChain(const std::vector<Span>& terms, const std::vector<char>& ops) override {
    std::string acc = Range(terms[0].b, terms[0].e);
    bool accText = IsText(terms[0]);
    bool accNumber = IsNumberLiteral(terms[0]);
    for (size_t n = 0; n < ops.size(); ++n) {
      const Span& term = terms[n + 1];
      std::string piece = Range(term.b, term.e);
      if (ops[n] == '-') {
        acc += " - " + piece;
        accText = accNumber = false;
        continue;
      }
      // A number beside a text adds on SQL Server (the text is read as a number).
      bool join = (accText || IsText(term)) && !accNumber && !IsNumberLiteral(term);
      acc += (join ? " || " : " + ") + piece;
      accText = join;
      accNumber = false;
    }
    return acc;
  }

  std::string DateLiteral(const std::string& stored, bool dateOnly) override {
    return "TIMESTAMP " + QuoteLiteral(dateOnly ? stored.substr(0, 10) + " 00:00:00" : stored);
  }

  std::string DateExpression(const std::string& expr) override {
    return "CAST(" + expr + " AS timestamp(3))";
  }

  std::string Cast(CastKind kind, Span type, const std::string& expr) override {
    const Token& name = T(type.b);
    std::vector<std::string> sizes;
    for (size_t k = type.b + 1; k < type.e; ++k)
      if (T(k).kind == TokenKind::Number || T(k).Is("MAX")) sizes.push_back(T(k).text);
    std::string target;
    switch (kind) {
      case CastKind::Integer:
        target = name.Is("BIGINT") ? "bigint" : "integer";
        break;
      case CastKind::Decimal:
        if (name.Is("MONEY") || name.Is("SMALLMONEY"))
          target = "numeric(19,4)";
        else if (name.Is("FLOAT"))
          target = "double precision";
        else if (name.Is("REAL"))
          target = "real";
        else if (sizes.empty())
          target = "numeric(18,0)";  // the server's default precision and scale
        else
          target = "numeric(" + sizes[0] + (sizes.size() > 1 ? "," + sizes[1] : "") + ")";
        break;
      case CastKind::Text:
        if (name.Is("TEXT") || name.Is("NTEXT") || (!sizes.empty() && sizes[0] == "MAX"))
          target = "text";
        else  // without a length CONVERT keeps 30 characters
          target = "varchar(" + (sizes.empty() ? std::string("30") : sizes[0]) + ")";
        break;
    }
    return "CAST(" + expr + " AS " + target + ")";
  }

  void TableHints(Span hints) override {
    for (size_t k = hints.b; k < hints.e; ++k)
      if (T(k).Is("UPDLOCK") || T(k).Is("XLOCK")) forUpdate_ = true;
  }

  size_t EmitOwn(size_t i, size_t e, Output& out) override {
    const Token& t = T(i);
    if (t.kind == TokenKind::QuotedIdent) return out.Add(FoldedName(t)), i + 1;
    if ((t.Is("CHAR") || t.Is("NCHAR")) && Sym(i + 1, e, "(") && !(i > 0 && T(i - 1).Is("AS"))) {
      size_t close = MatchParen(i + 1, e);
      if (close == i + 3 && IsWholeNumber(T(i + 2)))
        return out.Add("chr(" + std::to_string(CodePoint1252(std::stoi(T(i + 2).text))) + ")"), close + 1;
      return out.Add("chr"), i + 1;
    }
    if (t.Is("LIKE")) return Like(i, e, out);
    if (IsWholeNumber(t) && ComparedLiteral(i)) return out.Add(QuoteLiteral(t.text)), i + 1;
    bool unary = i == 0 || !IsOperandEnd(i - 1);
    if (Sym(i, e, "-") && unary && i + 1 < e && IsWholeNumber(T(i + 1)) && ComparedLiteral(i))
      return out.Add(QuoteLiteral("-" + T(i + 1).text)), i + 2;
    return kNoToken;
  }

 private:
  // A whole number compared as a whole operand, or in a list of literals after IN:
  // quoted, the server reads it as the other side's type, text or number.
  bool ComparedLiteral(size_t i) const {
    size_t last = T(i).kind == TokenKind::Number ? i : i + 1;
    bool before = i > 0 && IsComparison(T(i - 1));
    bool after = last + 1 < Count() && IsComparison(T(last + 1));
    bool arithmeticBefore = i > 0 && IsArithmetic(T(i - 1));
    bool arithmeticAfter = last + 1 < Count() && IsArithmetic(T(last + 1));
    if (before && !arithmeticAfter) return true;
    if (after && !arithmeticBefore) return true;
    return InLiteralList(i);
  }

  bool InLiteralList(size_t i) const {
    if (i == 0 || !(T(i - 1).Is("(") || T(i - 1).Is(","))) return false;
    size_t open = i - 1;
    for (int depth = 0; open != kNoToken; --open) {
      if (T(open).Is(")")) ++depth;
      if (T(open).Is("(") && depth-- == 0) break;
      if (open == 0) return false;
    }
    if (open == 0 || !T(open - 1).Is("IN")) return false;
    size_t close = MatchParen(open, Count());
    if (close == kNoToken) return false;
    for (Span arg : Arguments(open, close)) {
      size_t b = arg.b < arg.e && T(arg.b).Is("-") ? arg.b + 1 : arg.b;
      if (b + 1 != arg.e || (T(b).kind != TokenKind::Number && T(b).kind != TokenKind::String))
        return false;
    }
    return true;
  }

  // SQL Server's LIKE has no escape character unless one is named; PostgreSQL's is "\".
  // A literal pattern with a [set] of characters, which PostgreSQL's LIKE does not
  // know, becomes SIMILAR TO, which keeps "%", "_" and the sets and, on citext, still
  // ignores case.
  size_t Like(size_t i, size_t e, Output& out) {
    size_t end = AdditiveEnd(i + 1, e);
    if (end == kNoToken) return kNoToken;
    bool escapeNamed = end < e && T(end).Is("ESCAPE");
    if (!escapeNamed && end == i + 2 && T(i + 1).kind == TokenKind::String &&
        T(i + 1).value.find('[') != std::string::npos) {
      out.Add("SIMILAR TO");
      out.Add(QuoteLiteral(SimilarPattern(T(i + 1).value)));
      out.Add("ESCAPE '\\'");
      return end;
    }
    out.Add(T(i).text);
    out.Add(Range(i + 1, end));
    if (!(end < e && T(end).Is("ESCAPE"))) out.Add("ESCAPE ''");
    return end;
  }

  bool IsNumberLiteral(Span s) const {
    size_t b = s.b < s.e && (T(s.b).Is("-") || T(s.b).Is("+")) ? s.b + 1 : s.b;
    return b + 1 == s.e && T(b).kind == TokenKind::Number;
  }

  // Certainly a text: a literal, CHAR(n), a conversion to a text type, or one of those
  // in parentheses.
  bool IsText(Span s) const {
    if (s.b >= s.e) return false;
    if (s.e == s.b + 1) return T(s.b).kind == TokenKind::String;
    const Token& first = T(s.b);
    if (Sym(s.b, s.e, "(")) return MatchParen(s.b, s.e) == s.e - 1 && JoinsText({s.b + 1, s.e - 1});
    if (first.kind != TokenKind::Word || !Sym(s.b + 1, s.e, "(") || MatchParen(s.b + 1, s.e) != s.e - 1)
      return false;
    if (first.Is("CHAR") || first.Is("NCHAR")) return true;
    std::vector<Span> args = Arguments(s.b + 1, s.e - 1);
    if (first.Is("CONVERT")) return args[0].b < args[0].e && IsTextType(T(args[0].b));
    if (first.Is("CAST")) {
      for (size_t k = args[0].b; k + 1 < args[0].e; ++k)
        if (T(k).Is("AS")) return IsTextType(T(k + 1));
    }
    return false;
  }

  // An expression whose top-level "+" has a certain text on one side.
  bool JoinsText(Span s) const {
    size_t start = s.b;
    int depth = 0;
    for (size_t k = s.b; k <= s.e; ++k) {
      if (k < s.e && Sym(k, s.e, "(")) ++depth;
      if (k < s.e && Sym(k, s.e, ")")) --depth;
      if (k == s.e || (depth == 0 && k > start && (Sym(k, s.e, "+") || Sym(k, s.e, "-")) && IsOperandEnd(k - 1))) {
        if (IsText({start, k})) return true;
        start = k + 1;
      }
    }
    return false;
  }

  int tranCount_;
  bool forUpdate_ = false;
};

}  // namespace

Translation TranslateToPostgres(std::string_view tsql, int tranCount) {
  std::vector<Token> ts = TokensOf(tsql);
  PostgresRewriter rewriter(ts, tranCount);
  Translation result;
  result.sql = rewriter.Range(0, ts.size());
  if (rewriter.ForUpdate() && !ts.empty() && ts[0].Is("SELECT")) result.sql += " FOR UPDATE";
  return result;
}

}  // namespace ado::sql
