#include "platform/vb/Conversions.h"

#include <fmt/format.h>

#include <cctype>
#include <charconv>
#include <cmath>
#include <limits>

#include "platform/vb/Decimal.h"
#include "platform/vb/Error.h"
#include "platform/vb/Locale.h"

namespace vb {
namespace {

bool StartsWith(std::string_view s, std::string_view prefix) {
  return !prefix.empty() && s.substr(0, prefix.size()) == prefix;
}

void SkipBlanks(std::string_view& s) {
  while (!s.empty() && s.front() == ' ') s.remove_prefix(1);
}

bool IsDigit(char c) { return c >= '0' && c <= '9'; }

std::optional<double> ToDouble(const std::string& invariant) {
  double value = 0;
  const char* end = invariant.data() + invariant.size();
  auto [ptr, ec] = std::from_chars(invariant.data(), end, value);
  if (ec != std::errc() || ptr != end) return std::nullopt;
  return value;
}

std::optional<double> ParseHex(std::string_view s) {
  // "&H1F": Basic's hexadecimal literal, read as a 32-bit integer.
  s.remove_prefix(2);
  if (s.empty() || s.size() > 8) return std::nullopt;
  uint32_t value = 0;
  auto [ptr, ec] = std::from_chars(s.data(), s.data() + s.size(), value, 16);
  if (ec != std::errc() || ptr != s.data() + s.size()) return std::nullopt;
  return static_cast<double>(static_cast<int32_t>(value));
}

[[noreturn]] void TypeMismatch() { throw Error(kErrTypeMismatch); }
[[noreturn]] void InvalidUseOfNull() { throw Error(kErrInvalidUseOfNull); }

std::string FormatDouble(double d) {
  if (std::isnan(d)) return "NaN";
  if (std::isinf(d)) return d > 0 ? "Inf" : "-Inf";
  // Fifteen significant digits, as Basic's CStr; plain notation within that range.
  std::string s = fmt::format("{:.15G}", d);
  if (s.find('E') != std::string::npos) {
    const double magnitude = std::fabs(d);
    if (magnitude >= 1e-5 && magnitude < 1e15) {
      const DecimalDigits dec = ToDecimal(d, 15, Rounding::HalfEven);
      std::string frac = dec.fraction;
      while (!frac.empty() && frac.back() == '0') frac.pop_back();
      s = (d < 0 ? "-" : "") + dec.integer + (frac.empty() ? "" : "." + frac);
    }
  }
  const size_t point = s.find('.');
  if (point != std::string::npos) s.replace(point, 1, CurrentLocale().decimal);
  return s;
}

}  // namespace

std::optional<double> ParseInvariantNumber(std::string_view text) {
  std::string_view s = text;
  size_t i = 0;
  if (i < s.size() && (s[i] == '+' || s[i] == '-')) ++i;
  size_t digits = 0;
  while (i < s.size() && IsDigit(s[i])) ++i, ++digits;
  if (i < s.size() && s[i] == '.') {
    ++i;
    while (i < s.size() && IsDigit(s[i])) ++i, ++digits;
  }
  if (digits == 0) return std::nullopt;
  if (i < s.size() && (s[i] == 'e' || s[i] == 'E')) {
    ++i;
    if (i < s.size() && (s[i] == '+' || s[i] == '-')) ++i;
    size_t expDigits = 0;
    while (i < s.size() && IsDigit(s[i])) ++i, ++expDigits;
    if (expDigits == 0) return std::nullopt;
  }
  if (i != s.size()) return std::nullopt;
  std::string invariant(s.front() == '+' ? s.substr(1) : s);
  auto value = ToDouble(invariant);
  if (value && !std::isfinite(*value)) return std::nullopt;
  return value;
}

std::optional<double> ParseRegionalNumber(std::string_view text) {
  const Locale& loc = CurrentLocale();
  std::string_view s = text;
  SkipBlanks(s);
  while (!s.empty() && s.back() == ' ') s.remove_suffix(1);
  if (s.empty()) return std::nullopt;
  if (s.size() > 2 && s[0] == '&' && (s[1] == 'H' || s[1] == 'h')) return ParseHex(s);

  bool negative = false;
  auto takeSign = [&] {
    if (!s.empty() && (s.front() == '-' || s.front() == '+')) {
      negative = s.front() == '-';
      s.remove_prefix(1);
      SkipBlanks(s);
      return true;
    }
    return false;
  };
  auto takeCurrency = [&] {
    if (StartsWith(s, loc.currency)) {
      s.remove_prefix(loc.currency.size());
      SkipBlanks(s);
      return true;
    }
    return false;
  };
  // The sign and the currency symbol may come in either order: "-€ 3,00", "€ -3,00".
  const bool signFirst = takeSign();
  takeCurrency();
  if (!signFirst) takeSign();

  std::string invariant = negative ? "-" : "";
  size_t digits = 0;
  // Integer part: digits, with grouping symbols allowed between them (Basic ignores them).
  while (!s.empty()) {
    if (IsDigit(s.front())) {
      invariant += s.front();
      s.remove_prefix(1);
      ++digits;
    } else if (digits > 0 && StartsWith(s, loc.grouping) && s.size() > loc.grouping.size() &&
               IsDigit(s[loc.grouping.size()])) {
      s.remove_prefix(loc.grouping.size());
    } else {
      break;
    }
  }
  if (StartsWith(s, loc.decimal)) {
    s.remove_prefix(loc.decimal.size());
    invariant += '.';
    while (!s.empty() && IsDigit(s.front())) {
      invariant += s.front();
      s.remove_prefix(1);
      ++digits;
    }
  }
  if (digits == 0) return std::nullopt;
  if (!s.empty() && (s.front() == 'e' || s.front() == 'E')) {
    std::string exponent = "e";
    s.remove_prefix(1);
    if (!s.empty() && (s.front() == '+' || s.front() == '-')) {
      exponent += s.front();
      s.remove_prefix(1);
    }
    size_t expDigits = 0;
    while (!s.empty() && IsDigit(s.front())) {
      exponent += s.front();
      s.remove_prefix(1);
      ++expDigits;
    }
    if (expDigits == 0) return std::nullopt;
    invariant += exponent;
  }
  SkipBlanks(s);
  takeCurrency();
  if (!s.empty()) return std::nullopt;
  if (invariant.front() == '.' || (invariant.size() > 1 && invariant.substr(0, 2) == "-."))
    invariant.insert(invariant.find('.'), "0");
  auto value = ToDouble(invariant);
  if (value && !std::isfinite(*value)) return std::nullopt;
  return value;
}

std::optional<Date> ParseDate(std::string_view text) {
  std::string_view s = text;
  SkipBlanks(s);
  while (!s.empty() && s.back() == ' ') s.remove_suffix(1);
  if (s.empty()) return std::nullopt;

  auto readNumber = [&](int maxDigits, int& out) {
    int n = 0, count = 0;
    while (!s.empty() && IsDigit(s.front()) && count < maxDigits) {
      n = n * 10 + (s.front() - '0');
      s.remove_prefix(1);
      ++count;
    }
    out = n;
    return count;
  };
  auto readSeparator = [&](std::string_view allowed) {
    if (!s.empty() && allowed.find(s.front()) != std::string_view::npos) {
      s.remove_prefix(1);
      return true;
    }
    return false;
  };

  int year = 1899, month = 12, day = 30;
  bool haveDate = false;
  if (s.find(':') == std::string_view::npos || s.find_first_of("-/.") < s.find(':')) {
    int a = 0, b = 0, c = 0;
    const int na = readNumber(4, a);
    if (na == 0 || !readSeparator("-/.")) return std::nullopt;
    if (readNumber(2, b) == 0 || !readSeparator("-/.")) return std::nullopt;
    const int nc = readNumber(4, c);
    if (nc == 0) return std::nullopt;
    if (na == 4) {  // yyyy-mm-dd
      year = a, month = b, day = c;
    } else {        // dd-mm-yyyy
      day = a, month = b, year = c;
      if (nc <= 2) year += year < 30 ? 2000 : 1900;
    }
    haveDate = true;
    if (!s.empty() && s.front() != ' ' && s.front() != 'T') return std::nullopt;
    if (!s.empty()) s.remove_prefix(1);
    SkipBlanks(s);
  }
  int hour = 0, minute = 0, second = 0;
  if (!s.empty()) {
    if (readNumber(2, hour) == 0 || !readSeparator(":")) return std::nullopt;
    if (readNumber(2, minute) == 0) return std::nullopt;
    if (readSeparator(":") && readNumber(2, second) == 0) return std::nullopt;
    // Fractions of a second, as servers write them, are dropped.
    if (readSeparator(".")) {
      int ignored = 0;
      readNumber(9, ignored);
    }
    if (!s.empty()) return std::nullopt;
  }
  if (!haveDate) {
    if (hour > 23 || minute > 59 || second > 59) return std::nullopt;
    return Date{(hour * 3600 + minute * 60 + second) / 86400.0};
  }
  return DateSerial(year, month, day, hour, minute, second);
}

double RoundHalfEven(double x) { return std::nearbyint(x); }

double Round(double x, int decimals) {
  if (!std::isfinite(x)) return x;
  const DecimalDigits d = ToDecimal(x, decimals, Rounding::HalfEven);
  std::string text = (d.negative ? "-" : "") + d.integer;
  if (!d.fraction.empty()) text += "." + d.fraction;
  return ToDouble(text).value_or(x);
}

double CDbl(const Variant& v) {
  switch (v.Type()) {
    case VarType::Empty: return 0.0;
    case VarType::Null: InvalidUseOfNull();
    case VarType::Boolean: return v.AsBoolean() ? -1.0 : 0.0;
    case VarType::Long: return v.AsLong();
    case VarType::Double: return v.AsDouble();
    case VarType::Date: return v.AsDate().serial;
    case VarType::String: {
      if (auto d = ParseRegionalNumber(v.AsString())) return *d;
      TypeMismatch();
    }
    default: TypeMismatch();
  }
}

int32_t CLng(const Variant& v) {
  if (v.Type() == VarType::Long) return v.AsLong();
  const double rounded = RoundHalfEven(CDbl(v));
  if (!(rounded >= std::numeric_limits<int32_t>::min() &&
        rounded <= std::numeric_limits<int32_t>::max()))
    throw Error(kErrOverflow);
  return static_cast<int32_t>(rounded);
}

float CSng(const Variant& v) {
  const double d = CDbl(v);
  if (std::isfinite(d) && std::fabs(d) > std::numeric_limits<float>::max())
    throw Error(kErrOverflow);
  return static_cast<float>(d);
}

bool CBool(const Variant& v) {
  switch (v.Type()) {
    case VarType::Boolean: return v.AsBoolean();
    case VarType::String: {
      const std::string t = Trim(v.AsString());
      const Locale& loc = CurrentLocale();
      auto same = [](std::string_view a, std::string_view b) {
        if (a.size() != b.size()) return false;
        for (size_t i = 0; i < a.size(); ++i)
          if (std::tolower(static_cast<unsigned char>(a[i])) !=
              std::tolower(static_cast<unsigned char>(b[i])))
            return false;
        return true;
      };
      if (same(t, "True") || same(t, loc.trueText)) return true;
      if (same(t, "False") || same(t, loc.falseText)) return false;
      return CDbl(v) != 0.0;
    }
    default: return CDbl(v) != 0.0;
  }
}

std::string CStr(const Variant& v) {
  switch (v.Type()) {
    case VarType::Empty: return "";
    case VarType::Null: InvalidUseOfNull();
    case VarType::Boolean:
      return v.AsBoolean() ? CurrentLocale().trueText : CurrentLocale().falseText;
    case VarType::Long: return std::to_string(v.AsLong());
    case VarType::Double: return FormatDouble(v.AsDouble());
    case VarType::Date: {
      const Date d = v.AsDate();
      const DateParts p = SplitDate(d);
      const std::string sep = CurrentLocale().dateSeparator;
      const std::string date = fmt::format("{:02}{}{:02}{}{:04}", p.day, sep, p.month, sep, p.year);
      const std::string time = fmt::format("{:02}:{:02}:{:02}", p.hour, p.minute, p.second);
      const bool noTime = p.hour == 0 && p.minute == 0 && p.second == 0;
      const bool noDate = std::trunc(d.serial) == 0.0;
      if (noDate && !noTime) return time;
      return noTime ? date : date + " " + time;
    }
    case VarType::String: return v.AsString();
    default: TypeMismatch();
  }
}

Date CDate(const Variant& v) {
  switch (v.Type()) {
    case VarType::Empty: return Date{0.0};
    case VarType::Null: InvalidUseOfNull();
    case VarType::Date: return v.AsDate();
    case VarType::Long: return Date{static_cast<double>(v.AsLong())};
    case VarType::Double: return Date{v.AsDouble()};
    case VarType::String: {
      if (auto d = ParseDate(v.AsString())) return *d;
      if (auto n = ParseRegionalNumber(v.AsString())) return Date{*n};
      TypeMismatch();
    }
    default: TypeMismatch();
  }
}

bool IsNumeric(const Variant& v) {
  switch (v.Type()) {
    case VarType::Empty:  // Basic counts an uninitialised value as the number 0
    case VarType::Boolean:
    case VarType::Long:
    case VarType::Double: return true;
    case VarType::String: return ParseRegionalNumber(v.AsString()).has_value();
    default: return false;
  }
}

bool IsDate(const Variant& v) {
  if (v.Type() == VarType::Date) return true;
  return v.Type() == VarType::String && ParseDate(v.AsString()).has_value();
}

std::string LTrim(std::string_view s) {
  const size_t first = s.find_first_not_of(' ');
  return first == std::string_view::npos ? std::string() : std::string(s.substr(first));
}

std::string RTrim(std::string_view s) {
  const size_t last = s.find_last_not_of(' ');
  return last == std::string_view::npos ? std::string() : std::string(s.substr(0, last + 1));
}

std::string Trim(std::string_view s) { return LTrim(RTrim(s)); }

int Year(const Variant& v) { return SplitDate(CDate(v)).year; }
int Month(const Variant& v) { return SplitDate(CDate(v)).month; }
int Day(const Variant& v) { return SplitDate(CDate(v)).day; }

int32_t Len(std::string_view s) {
  int32_t n = 0;
  for (unsigned char c : s)
    if ((c & 0xC0) != 0x80) ++n;
  return n;
}

}  // namespace vb
