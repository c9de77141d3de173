#pragma once
// Translates the SQL Server dialect the component speaks into SQL the embedded engine
// runs. It works on tokens, never on raw text, so literals and comments pass untouched:
//
//   CONVERT(DATETIME, '2009-12-31 0:00:00', 102)   the stored date text (literal) or
//                                                  dv_datetime(expr)
//   @@IDENTITY, @@TRANCOUNT, @@ROWCOUNT           dv_identity(), dv_trancount(), changes()
//   SELECT TOP n ...                               SELECT ... LIMIT n
//   a + b                                          dv_plus(a, b): adds numbers, joins texts
//   WITH (UPDLOCK, HOLDLOCK) after a table         dropped: BeginTrans already holds the
//                                                  write lock
//   ISNULL(a, b), N'text'                          IFNULL(a, b), 'text'
//
// GETDATE(), year(), month(), day() and CHAR() are functions of the engine's own.
// One statement per call: a ";" followed by more SQL is refused, so text that escaped
// its literal could never run a second statement.

#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>

namespace ado::sql {

struct Translation {
  std::string sql;
  // Set when the statement is only "SELECT @@TRANCOUNT [AS] name": the engine answers
  // it from the connection's own state without running anything.
  std::optional<std::string> tranCountColumn;
};

struct TranslateError : std::runtime_error {
  using std::runtime_error::runtime_error;
};

Translation TranslateToSqlite(std::string_view tsql);

}  // namespace ado::sql
