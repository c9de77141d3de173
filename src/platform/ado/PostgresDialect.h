#pragma once
// Translates the SQL Server dialect the component speaks into PostgreSQL, for a
// database made with db/postgresql/schema.sql. Like the embedded engine's translation it
// works on tokens, so literals and comments pass untouched, and it takes one statement
// per call:
//
//   CONVERT(DATETIME, '2009-12-31 0:00:00', 102)  TIMESTAMP '2009-12-31 00:00:00'
//   CONVERT(decimal(9,2), x), CONVERT(varchar, x) CAST(x AS numeric(9,2)), CAST(x AS varchar(30))
//   SELECT TOP n ...                              SELECT ... LIMIT n
//   @@IDENTITY                                    dv_identity(): NULL before any insert
//   @@TRANCOUNT                                   the engine's own count, as a literal
//   CHAR(n), ISNULL(a, b), N'text', [Name]        chr(n), COALESCE(a, b), 'text', "name"
//   'text' + x, CHAR(n) + x, CONVERT(varchar..)+x  'text' || x ...; column + column stays
//                                                 "+", an operator of the schema's
//   codigo = 211, x IN (1, 2)                     codigo = '211', x IN ('1', '2'): the
//                                                 server reads the literal as the
//                                                 column's type, text or number
//   a LIKE p                                      a LIKE p ESCAPE '': "\" is no escape
//   WITH (UPDLOCK, HOLDLOCK) after a table        dropped; UPDLOCK adds FOR UPDATE to
//                                                 the SELECT
//
// GETDATE(), year(), month() and day() are functions of the schema. Unquoted names fold
// to lower case on the server; quoted and bracketed ones are folded here, as SQL Server
// finds them regardless of case.

#include <string_view>

#include "platform/ado/SqlTranslator.h"

namespace ado::sql {

// tranCount is the engine's transaction depth, written in place of @@TRANCOUNT. The
// statement is always meant to be sent (tranCountColumn stays empty), so that
// "SELECT @@TRANCOUNT as flTrans" still finds out whether the server is there.
Translation TranslateToPostgres(std::string_view tsql, int tranCount);

}  // namespace ado::sql
