#pragma once
// A tokenizer for the SQL the component sends. It knows string literals ('...' with
// doubled quotes, N'...'), quoted identifiers ("..." and [...]), both comment forms and
// numbers, so that nothing inside a literal or a comment is ever taken for SQL.

#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace ado::sql {

enum class TokenKind {
  Word,         // identifier or keyword, also @@name and @name
  QuotedIdent,  // "name" or [name]; text keeps its quotes
  String,       // '...'; text is the literal as written, value the decoded text
  Number,
  Symbol,       // operators and punctuation: ( ) , . ; + - * / % = < > <= >= <> != ...
};

struct Token {
  TokenKind kind;
  std::string text;   // as written (N'..' literals lose their N)
  std::string value;  // String: the decoded text; otherwise empty
  bool spaceBefore = false;  // whitespace or a comment preceded it
  size_t offset = 0;         // where it starts in the source text

  bool Is(std::string_view symbolOrWord) const;  // Symbol text, or Word ignoring case
};

struct TokenizeError : std::runtime_error {
  using std::runtime_error::runtime_error;
};

// Comments are dropped (they count as whitespace). Throws TokenizeError for an
// unterminated literal, quoted name or comment.
std::vector<Token> Tokenize(std::string_view sql);

// The statements of a script, split at the ";" outside literals and comments; empty
// statements are dropped.
std::vector<std::string> SplitStatements(std::string_view script);

// A string literal for text: quoted, apostrophes doubled.
std::string QuoteLiteral(std::string_view text);

}  // namespace ado::sql
