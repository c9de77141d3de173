#pragma once
// Basic's conversion and test functions, with Basic's rules: CLng rounds halves to the
// even neighbour and raises overflow (6); a Null where a value is needed raises 94; a
// text that is no number raises type mismatch (13). Texts are read and written with the
// regional symbols.

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "platform/vb/Variant.h"

namespace vb {

int32_t CLng(const Variant& v);
double CDbl(const Variant& v);
float CSng(const Variant& v);
bool CBool(const Variant& v);
std::string CStr(const Variant& v);
Date CDate(const Variant& v);

bool IsNumeric(const Variant& v);
bool IsDate(const Variant& v);
inline bool IsNull(const Variant& v) { return v.IsNull(); }
inline bool IsEmpty(const Variant& v) { return v.IsEmpty(); }

// Reads a number written with the regional symbols ("1.234,50", "-12,5", "€ 3,00").
std::optional<double> ParseRegionalNumber(std::string_view text);
// Reads a number written the way SQL writes it: optional sign, digits, optional "."
// and decimals, optional exponent. Nothing else, not even blanks.
std::optional<double> ParseInvariantNumber(std::string_view text);
// Reads "dd-mm-yyyy", "dd/mm/yyyy", "yyyy-mm-dd", each with an optional time.
std::optional<Date> ParseDate(std::string_view text);

// Rounds to the nearest whole number, halves to the even neighbour.
double RoundHalfEven(double x);
// Rounds to a number of decimals, halves to the even neighbour (Basic's Round).
double Round(double x, int decimals = 0);

// Blanks (spaces only, as Basic) removed from the left, the right or both ends.
std::string LTrim(std::string_view s);
std::string RTrim(std::string_view s);
std::string Trim(std::string_view s);

int Year(const Variant& v);
int Month(const Variant& v);
int Day(const Variant& v);

// Basic's Len, counted in characters of the UTF-8 text.
int32_t Len(std::string_view s);

}  // namespace vb
