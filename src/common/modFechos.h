#pragma once
// Questions only the database server can answer: its clock (years and dates of the
// counters come from it, not from the workstation), whether a transaction is open on
// the shared connection (so nobody nests BeginTrans or commits what is not there), and
// whether a date lies in a closed accounting period (rows of tbFechos).

#include "platform/ado/Connection.h"
#include "platform/vb/Variant.h"

namespace common {

// The server's current date and time; Null when it cannot be asked. Nothing is
// reported: callers treat Null as "no date".
vb::Variant GetServerDate();

// Whether a transaction is open on SqlServer. A closed connection has none and is not
// asked. Errors of the question pass to the caller.
bool IsTransactionOpen();

// Whether the date lies in a closed period: on or before the last day closed by a
// closing in force (one not cancelled), up to 23:59:59 of that day. Asked afresh at
// every call. Null is never closed. Errors are reported under "modFechos" and answer
// false.
bool IsClosedDate(const vb::Variant& date, const ado::ConnectionPtr& connection);

}  // namespace common
