#pragma once
// The functions and the collation the embedded engine adds to SQLite so that the SQL
// Server dialect, once translated, means what it meant on the server:
//
//   POC_CI_AS      collation: case-insensitive, accent-sensitive, Portuguese
//   like(p, t [, esc])  LIKE with the same notion of letters, [ ] classes included
//   dv_plus(a, b)  "+": numbers add, texts join, a Null gives Null, text meeting a
//                  number must read as one
//   sum(x)         amounts summed exactly to 4 decimals (see below)
//   dv_datetime(x) CONVERT(DATETIME, x, 102) for a non-literal x
//   dv_identity()  @@IDENTITY: the last key inserted on this connection, or Null
//   dv_trancount() @@TRANCOUNT
//   getdate(), year(), month(), day(), char(n)
//
// Sums: amounts are decimal(19,4) on the server, doubles here. A plain floating sum
// drifts (0.1 + 0.2 is not 0.3), so sum() rounds each addend to ten-thousandths, adds
// those as 128-bit integers and divides once at the end: the result is the double
// nearest the exact decimal sum. A sum of whole numbers stays a whole number.

struct sqlite3;

namespace ado {

class TextCollator;

// The collator must outlive the database handle.
void RegisterDialectFunctions(sqlite3* db, TextCollator* collator);

}  // namespace ado
