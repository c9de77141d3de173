#include "platform/ado/SqlTranslator.h"

#include <vector>

#include "platform/ado/SqlRewriter.h"
#include "platform/ado/SqlTokenizer.h"

namespace ado::sql {

namespace {

class SqliteRewriter : public Rewriter {
 public:
  using Rewriter::Rewriter;

 protected:
  std::string Variable(const Token& name) override {
    if (name.Is("@@IDENTITY")) return "dv_identity()";
    if (name.Is("@@TRANCOUNT")) return "dv_trancount()";
    if (name.Is("@@ROWCOUNT")) return "changes()";
    throw TranslateError("Must declare the scalar variable \"" + name.text + "\".");
  }

  std::optional<std::string> FunctionName(const Token& name) override {
    if (name.Is("ISNULL")) return "IFNULL";
    return std::nullopt;
  }

  // Rewritten left to right, because "+" is addition for numbers and joining for texts,
  // decided per row by dv_plus.
  std::string AdditiveChain(const std::vector<Span>& terms, const std::vector<char>& ops) override {
    std::string acc = Range(terms[0].b, terms[0].e);
    for (size_t n = 0; n < ops.size(); ++n) {
      std::string piece = Range(terms[n + 1].b, terms[n + 1].e);
      acc = ops[n] == '+' ? "dv_plus(" + acc + ", " + piece + ")" : "(" + acc + " - " + piece + ")";
    }
    return acc;
  }

  // Dates are stored as text in this form.
  std::string DateLiteral(const std::string& stored, bool dateOnly) override {
    return QuoteLiteral(dateOnly ? stored.substr(0, 10) + " 00:00:00" : stored);
  }

  std::string DateExpression(const std::string& expr) override { return "dv_datetime(" + expr + ")"; }

  std::string Cast(CastKind kind, Span, const std::string& expr) override {
    switch (kind) {
      case CastKind::Integer: return "CAST(" + expr + " AS INTEGER)";
      case CastKind::Decimal: return "CAST(" + expr + " AS REAL)";
      case CastKind::Text: break;
    }
    return "CAST(" + expr + " AS TEXT)";
  }
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
  std::vector<Token> ts = TokensOf(tsql);
  Translation result;
  result.tranCountColumn = TranCountOnly(ts);
  result.sql = SqliteRewriter(ts).Range(0, ts.size());
  return result;
}

}  // namespace ado::sql
