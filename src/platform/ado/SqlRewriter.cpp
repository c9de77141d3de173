#include "platform/ado/SqlRewriter.h"

#include <array>
#include <cctype>

#include "platform/ado/ServerDate.h"

namespace ado::sql {

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

std::vector<Token> TokensOf(std::string_view tsql) {
  try {
    return Tokenize(tsql);
  } catch (const TokenizeError& e) {
    throw TranslateError(e.what());
  }
}

void Output::Add(std::string_view piece) {
  if (piece.empty()) return;
  char first = piece.front();
  char last = text_.empty() ? ' ' : text_.back();
  bool callOrName = first == '(' && (std::isalnum(static_cast<unsigned char>(last)) || last == '_');
  bool tight = text_.empty() || first == ',' || first == ')' || first == '.' || callOrName ||
               last == '(' || last == '.';
  if (!tight) text_ += ' ';
  text_ += piece;
}

bool Rewriter::IsTableHint(const Token& t) {
  static constexpr std::array<std::string_view, 16> kHints = {
      "NOLOCK",        "UPDLOCK",         "HOLDLOCK",       "ROWLOCK",
      "TABLOCK",       "TABLOCKX",        "PAGLOCK",        "READPAST",
      "READCOMMITTED", "READUNCOMMITTED", "REPEATABLEREAD", "SERIALIZABLE",
      "XLOCK",         "NOWAIT",          "FASTFIRSTROW",   "NOEXPAND"};
  for (auto h : kHints)
    if (t.Is(h)) return true;
  return false;
}

std::string Rewriter::Range(size_t b, size_t e) {
  Output out;
  size_t i = b;
  while (i < e) {
    if (TermMayStart(i, b)) {
      if (auto chain = FindAdditiveChain(i, e)) {
        out.Add(chain->text);
        i = chain->end;
        continue;
      }
    }
    i = Emit(i, e, out);
  }
  return out.Take();
}

bool Rewriter::IsOperandEnd(size_t i) const {
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

size_t Rewriter::MatchParen(size_t open, size_t e) const {
  int depth = 0;
  for (size_t i = open; i < e; ++i) {
    if (Sym(i, e, "(")) ++depth;
    if (Sym(i, e, ")") && --depth == 0) return i;
  }
  return kNoToken;
}

std::vector<Rewriter::Span> Rewriter::Arguments(size_t open, size_t close) const {
  std::vector<Span> args;
  size_t start = open + 1;
  int depth = 0;
  for (size_t k = open + 1; k < close; ++k) {
    if (Sym(k, close, "(")) ++depth;
    if (Sym(k, close, ")")) --depth;
    if (depth == 0 && Sym(k, close, ",")) {
      args.push_back({start, k});
      start = k + 1;
    }
  }
  args.push_back({start, close});
  return args;
}

size_t Rewriter::MatchCase(size_t c, size_t e) const {
  int depth = 0;
  for (size_t i = c; i < e; ++i) {
    if (T(i).Is("CASE")) ++depth;
    if (T(i).Is("END") && --depth == 0) return i;
  }
  return kNoToken;
}

size_t Rewriter::NameChain(size_t i, size_t e) const {
  size_t j = i + 1;
  while (j + 1 < e && Sym(j, e, ".") &&
         (T(j + 1).kind == TokenKind::Word || T(j + 1).kind == TokenKind::QuotedIdent ||
          Sym(j + 1, e, "*")))
    j += 2;
  return j;
}

size_t Rewriter::Primary(size_t i, size_t e) const {
  if (i >= e) return kNoToken;
  const Token& t = T(i);
  if (Sym(i, e, "-") || Sym(i, e, "+") || Sym(i, e, "~")) return Primary(i + 1, e);
  if (t.kind == TokenKind::String || t.kind == TokenKind::Number) return i + 1;
  if (Sym(i, e, "(")) {
    size_t close = MatchParen(i, e);
    return close == kNoToken ? kNoToken : close + 1;
  }
  if (t.kind == TokenKind::QuotedIdent) return NameChain(i, e);
  if (t.kind != TokenKind::Word) return kNoToken;
  if (t.Is("CASE")) {
    size_t end = MatchCase(i, e);
    return end == kNoToken ? kNoToken : end + 1;
  }
  if (IsOperatorKeyword(t)) return kNoToken;
  if (Sym(i + 1, e, "(")) {
    size_t close = MatchParen(i + 1, e);
    return close == kNoToken ? kNoToken : close + 1;
  }
  return NameChain(i, e);
}

size_t Rewriter::Term(size_t i, size_t e) const {
  size_t j = Primary(i, e);
  while (j != kNoToken && j < e && (Sym(j, e, "*") || Sym(j, e, "/") || Sym(j, e, "%")))
    j = Primary(j + 1, e);
  return j;
}

size_t Rewriter::AdditiveEnd(size_t i, size_t e) const {
  size_t j = Term(i, e);
  while (j != kNoToken && j < e && (Sym(j, e, "+") || Sym(j, e, "-"))) j = Term(j + 1, e);
  return j;
}

// "+" adds numbers and joins texts on SQL Server; the dialect decides how to write it.
std::optional<Rewriter::Chain> Rewriter::FindAdditiveChain(size_t i, size_t e) {
  size_t first = Term(i, e);
  if (first == kNoToken || first >= e || !(Sym(first, e, "+") || Sym(first, e, "-")))
    return std::nullopt;
  std::vector<Span> terms{{i, first}};
  std::vector<char> ops;
  size_t j = first;
  while (j < e && (Sym(j, e, "+") || Sym(j, e, "-"))) {
    size_t k = Term(j + 1, e);
    if (k == kNoToken) break;
    ops.push_back(T(j).text[0]);
    terms.push_back({j + 1, k});
    j = k;
  }
  bool anyPlus = false;
  for (char op : ops) anyPlus |= op == '+';
  if (!anyPlus) return std::nullopt;
  return Chain{AdditiveChain(terms, ops), j};
}

// Emits the token at i (or the construct starting there) and returns what follows.
size_t Rewriter::Emit(size_t i, size_t e, Output& out) {
  if (size_t next = EmitOwn(i, e, out); next != kNoToken) return next;
  const Token& t = T(i);
  if (t.kind == TokenKind::Word) {
    if (t.text.starts_with("@@")) return out.Add(Variable(t)), i + 1;
    if (t.text.starts_with("@"))
      throw TranslateError("Must declare the scalar variable \"" + t.text + "\".");
    if (t.Is("CONVERT") && Sym(i + 1, e, "(")) return Convert(i, e, out);
    if (Sym(i + 1, e, "(")) {
      if (auto name = FunctionName(t)) return out.Add(*name), i + 1;
    }
    if (t.Is("SELECT")) return Select(i, e, out);
    if (t.Is("WITH") && i > 0 && IsOperandEnd(i - 1) && Sym(i + 1, e, "(")) {
      size_t close = MatchParen(i + 1, e);
      if (close != kNoToken && OnlyHints(i + 2, close)) {
        TableHints({i + 2, close});
        return close + 1;
      }
    }
  }
  if (t.kind == TokenKind::String) return out.Add(QuoteLiteral(t.value)), i + 1;
  if (Sym(i, e, ";")) {
    for (size_t k = i + 1; k < e; ++k)
      if (!Sym(k, e, ";")) throw TranslateError("Only one statement can be run at a time.");
    return e;
  }
  out.Add(t.text);
  return i + 1;
}

bool Rewriter::OnlyHints(size_t b, size_t e) const {
  if (b >= e) return false;
  for (size_t k = b; k < e; ++k) {
    bool comma = (k - b) % 2 == 1;
    if (comma ? !Sym(k, e, ",") : !IsTableHint(T(k))) return false;
  }
  return true;
}

// SELECT [DISTINCT | ALL] TOP n ...: the limit moves to the end of this SELECT, which
// is the closing parenthesis around it or the end of the statement.
size_t Rewriter::Select(size_t i, size_t e, Output& out) {
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
    if (close == kNoToken) throw TranslateError("Incorrect syntax near 'TOP'.");
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
size_t Rewriter::Convert(size_t i, size_t e, Output& out) {
  size_t open = i + 1, close = MatchParen(open, e);
  if (close == kNoToken) throw TranslateError("Incorrect syntax near 'CONVERT'.");
  std::vector<Span> args = Arguments(open, close);
  if (args.size() < 2 || args[0].b >= args[0].e || args[1].b >= args[1].e)
    throw TranslateError("Incorrect syntax near 'CONVERT'.");
  const Token& type = T(args[0].b);
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
        throw TranslateError("Conversion failed when converting date and/or time from character string.");
      out.Add(DateLiteral(*stored, type.Is("DATE")));
    } else {
      out.Add(DateExpression(Range(eb, ee)));
    }
  } else if (is({"INT", "INTEGER", "BIGINT", "SMALLINT", "TINYINT", "BIT"})) {
    out.Add(Cast(CastKind::Integer, args[0], Range(eb, ee)));
  } else if (is({"DECIMAL", "NUMERIC", "MONEY", "SMALLMONEY", "FLOAT", "REAL"})) {
    out.Add(Cast(CastKind::Decimal, args[0], Range(eb, ee)));
  } else if (is({"CHAR", "VARCHAR", "NCHAR", "NVARCHAR", "TEXT", "NTEXT"})) {
    out.Add(Cast(CastKind::Text, args[0], Range(eb, ee)));
  } else {
    throw TranslateError("Type " + type.text + " is not a defined system type.");
  }
  return close + 1;
}

}  // namespace ado::sql
