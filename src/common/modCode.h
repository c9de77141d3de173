#pragma once
// SQL literals. Every value that reaches a statement passes through here: keys go in as
// decimal digits, everything else as one of these literals, so no text typed by a
// person can end a literal and start SQL of its own.

#include <cstdint>
#include <string>

#include "platform/vb/Variant.h"

namespace common {

// Literal kinds: how SqlValue writes a value.
enum SqlKind : int32_t {
  kSqlDate = 1,        // date and time
  kSqlNumber = 2,      // number, unquoted
  kSqlText = 3,        // text; empty gives null
  kSqlTextEmpty = 4,   // text; empty gives ''
  kSqlDateTime = 5,    // date and time (as 1)
  kSqlLikePattern = 6, // LIKE pattern: every word may be separated by anything
};

// The SQL literal of a value. Unknown kinds give "" (not "null").
std::string SqlValue(const vb::Variant& value, int32_t kind);

// Text made safe inside a quoted literal: each apostrophe becomes "' + CHAR(39) + '",
// which the server joins back into one apostrophe.
std::string Trtf(const std::string& text);

// The value's text with every one-character `from` replaced by the one-character `to`;
// "" when either is not exactly one character.
std::string ReplaceChar(const vb::Variant& value, const std::string& from, const std::string& to);

}  // namespace common
