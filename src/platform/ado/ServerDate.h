#pragma once
// Dates on the embedded engine are stored as text "yyyy-mm-dd hh:mm:ss", which sorts
// and compares as the dates do. These helpers read the forms the component writes and
// turn the stored text into the platform's Date and back.

#include <optional>
#include <string>
#include <string_view>

#include "platform/vb/Date.h"

namespace ado {

// Reads "yyyy-mm-dd", "yyyy.mm.dd", "yyyy/mm/dd" or "yyyymmdd", optionally followed by a
// time "h:mm", "h:mm:ss" or "h:mm:ss.fff" (one-digit hours allowed, fractions dropped),
// and gives the stored form. Nullopt for anything else or a day that does not exist.
std::optional<std::string> NormalizeDateTimeText(std::string_view text);

// True when text is exactly in the stored form (19 characters, digits in place).
bool LooksLikeStoredDateTime(std::string_view text);

// The stored form of a date, to the second.
std::string StoredDateTimeText(vb::Date d);
// The date of a stored text; nullopt when it is not one.
std::optional<vb::Date> DateFromStoredText(std::string_view text);

// The local wall-clock time now, in the stored form.
std::string LocalNowText();

}  // namespace ado
