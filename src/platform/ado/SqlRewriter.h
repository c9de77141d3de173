#pragma once
// The token walk that every translation of the component's SQL Server dialect shares:
// operands and additive chains, CONVERT's arguments, SELECT TOP, table hints, string
// literals and the one-statement rule. A dialect says, through the hooks, how it writes
// what differs. Internal to the data access layer.

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "platform/ado/SqlTokenizer.h"
#include "platform/ado/SqlTranslator.h"

namespace ado::sql {

inline constexpr size_t kNoToken = static_cast<size_t>(-1);

// Appends pieces with single blanks, none around "." or inside parentheses' edges.
class Output {
 public:
  void Add(std::string_view piece);
  std::string Take() { return std::move(text_); }

 private:
  std::string text_;
};

class Rewriter {
 public:
  explicit Rewriter(const std::vector<Token>& ts) : ts_(ts) {}
  virtual ~Rewriter() = default;
  Rewriter(const Rewriter&) = delete;
  Rewriter& operator=(const Rewriter&) = delete;

  // The tokens [b, e) in the target dialect.
  std::string Range(size_t b, size_t e);

 protected:
  struct Span {
    size_t b, e;
  };
  enum class CastKind { Integer, Decimal, Text };

  // @@name (IDENTITY, TRANCOUNT, ...), matched ignoring case.
  virtual std::string Variable(const Token& name) = 0;
  // A function's own name in the dialect (ISNULL, CHAR, ...), or nullopt to keep it.
  virtual std::optional<std::string> FunctionName(const Token& name) = 0;
  // term (("+" | "-") term)* with at least one "+"; ops[n] joins terms[n] and terms[n+1].
  virtual std::string AdditiveChain(const std::vector<Span>& terms, const std::vector<char>& ops) = 0;
  // CONVERT(DATETIME, 'text', style): the text already in the form "yyyy-mm-dd hh:mm:ss".
  virtual std::string DateLiteral(const std::string& stored, bool dateOnly) = 0;
  // CONVERT(DATETIME, expr, style) for any other expression.
  virtual std::string DateExpression(const std::string& expr) = 0;
  // CONVERT(type, expr) to a number or a text; type spans the type and its arguments.
  virtual std::string Cast(CastKind kind, Span type, const std::string& expr) = 0;
  // WITH (hints) after a table: the hints are always dropped from the text.
  virtual void TableHints(Span) {}
  // Writes the token at i when the dialect has its own way; kNoToken to let the walk do it.
  virtual size_t EmitOwn(size_t, size_t, Output&) { return kNoToken; }

  const Token& T(size_t i) const { return ts_[i]; }
  size_t Count() const { return ts_.size(); }
  bool Sym(size_t i, size_t e, std::string_view s) const {
    return i < e && T(i).kind == TokenKind::Symbol && T(i).text == s;
  }
  bool IsOperandEnd(size_t i) const;
  size_t MatchParen(size_t open, size_t e) const;
  // The arguments of the call whose "(" is at open, split at its top-level commas.
  std::vector<Span> Arguments(size_t open, size_t close) const;
  static bool IsTableHint(const Token& t);
  // Where the operand starting at i ends: a term, or an additive chain of them.
  size_t Term(size_t i, size_t e) const;
  size_t AdditiveEnd(size_t i, size_t e) const;

 private:
  struct Chain {
    std::string text;
    size_t end;
  };

  bool TermMayStart(size_t i, size_t b) const { return i == b || !IsOperandEnd(i - 1); }
  size_t MatchCase(size_t c, size_t e) const;
  size_t NameChain(size_t i, size_t e) const;
  size_t Primary(size_t i, size_t e) const;
  std::optional<Chain> FindAdditiveChain(size_t i, size_t e);
  size_t Emit(size_t i, size_t e, Output& out);
  bool OnlyHints(size_t b, size_t e) const;
  size_t Select(size_t i, size_t e, Output& out);
  size_t Convert(size_t i, size_t e, Output& out);

  const std::vector<Token>& ts_;
};

// Keywords after which an expression starts: none of them ends an operand.
bool IsOperatorKeyword(const Token& t);

// The tokens of one statement; TranslateError for text that does not tokenize.
std::vector<Token> TokensOf(std::string_view tsql);

}  // namespace ado::sql
