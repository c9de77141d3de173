#include "platform/vb/Format.h"

#include <fmt/format.h>

#include <cctype>
#include <cmath>
#include <vector>

#include "platform/vb/Conversions.h"
#include "platform/vb/Decimal.h"
#include "platform/vb/Locale.h"

namespace vb {
namespace {

// ---------------------------------------------------------------------------------------
// Pictures are read into tokens once: literal text (quoted, escaped or plain) and the
// placeholders. Number and date pictures share the literal rules.

enum class Tok { Literal, Zero, Hash, Point, Comma, Percent, DatePart };

struct Token {
  Tok kind;
  std::string text;  // literal text, or the date part's letters ("dd", "Hh")
};

std::vector<std::string> SplitSections(std::string_view picture) {
  std::vector<std::string> sections(1);
  bool quoted = false;
  for (size_t i = 0; i < picture.size(); ++i) {
    const char c = picture[i];
    if (c == '"') quoted = !quoted;
    if (!quoted && c == '\\' && i + 1 < picture.size()) {
      sections.back() += c;
      sections.back() += picture[++i];
      continue;
    }
    if (!quoted && c == ';') {
      sections.emplace_back();
      continue;
    }
    sections.back() += c;
  }
  return sections;
}

bool IsDateLetter(char c) {
  switch (std::tolower(static_cast<unsigned char>(c))) {
    case 'd': case 'm': case 'y': case 'h': case 'n': case 's': return true;
    default: return false;
  }
}

// Appends one literal character, which may be the first byte of a UTF-8 sequence.
size_t TakeLiteral(std::string_view s, size_t i, std::vector<Token>& out) {
  size_t len = 1;
  const unsigned char c = static_cast<unsigned char>(s[i]);
  if (c >= 0xF0) len = 4;
  else if (c >= 0xE0) len = 3;
  else if (c >= 0xC0) len = 2;
  len = std::min(len, s.size() - i);
  if (!out.empty() && out.back().kind == Tok::Literal)
    out.back().text.append(s.substr(i, len));
  else
    out.push_back({Tok::Literal, std::string(s.substr(i, len))});
  return len;
}

std::vector<Token> Tokenize(std::string_view s, bool datePicture) {
  std::vector<Token> out;
  for (size_t i = 0; i < s.size();) {
    const char c = s[i];
    if (c == '"') {
      const size_t end = s.find('"', i + 1);
      const std::string_view lit = s.substr(i + 1, (end == std::string_view::npos ? s.size() : end) - i - 1);
      for (size_t j = 0; j < lit.size();) j += TakeLiteral(lit, j, out);
      i = end == std::string_view::npos ? s.size() : end + 1;
    } else if (c == '\\' && i + 1 < s.size()) {
      i += 1 + TakeLiteral(s, i + 1, out);
    } else if (datePicture && IsDateLetter(c)) {
      const char lower = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
      size_t j = i;
      while (j < s.size() && std::tolower(static_cast<unsigned char>(s[j])) == lower) ++j;
      out.push_back({Tok::DatePart, std::string(j - i, lower)});
      i = j;
    } else if (!datePicture && (c == '0' || c == '#' || c == '.' || c == ',' || c == '%')) {
      const Tok kind = c == '0' ? Tok::Zero : c == '#' ? Tok::Hash : c == '.' ? Tok::Point
                       : c == ',' ? Tok::Comma : Tok::Percent;
      out.push_back({kind, std::string(1, c)});
      ++i;
    } else {
      i += TakeLiteral(s, i, out);
    }
  }
  return out;
}

bool IsDatePicture(std::string_view picture) {
  bool quoted = false, hasDigit = false, hasDatePart = false;
  for (size_t i = 0; i < picture.size(); ++i) {
    const char c = picture[i];
    if (c == '"') { quoted = !quoted; continue; }
    if (quoted) continue;
    if (c == '\\') { ++i; continue; }
    if (c == '0' || c == '#') hasDigit = true;
    if (IsDateLetter(c)) hasDatePart = true;
  }
  return hasDatePart && !hasDigit;
}

// ---------------------------------------------------------------------------------------
// Numbers.

std::string Group(const std::string& digits, const std::string& symbol) {
  std::string out;
  const size_t n = digits.size();
  for (size_t i = 0; i < n; ++i) {
    if (i > 0 && (n - i) % 3 == 0) out += symbol;
    out += digits[i];
  }
  return out;
}

struct NumberSection {
  std::string prefix, suffix;
  int minInteger = 0;
  int minFraction = 0;
  int maxFraction = 0;
  bool grouping = false;
  bool point = false;
  bool percent = false;
};

NumberSection Analyse(const std::vector<Token>& tokens) {
  NumberSection sec;
  size_t first = tokens.size(), last = 0;
  for (size_t i = 0; i < tokens.size(); ++i) {
    const Tok k = tokens[i].kind;
    if (k == Tok::Zero || k == Tok::Hash || k == Tok::Point) {
      first = std::min(first, i);
      last = i;
    }
  }
  bool afterPoint = false, seenZero = false;
  for (size_t i = 0; i < tokens.size(); ++i) {
    const Token& t = tokens[i];
    const bool inside = first < tokens.size() && i >= first && i <= last;
    switch (t.kind) {
      case Tok::Percent:
        sec.percent = true;
        (i < first ? sec.prefix : sec.suffix) += "%";
        break;
      case Tok::Literal:
        if (i < first) sec.prefix += t.text;
        else if (i > last || first == tokens.size()) sec.suffix += t.text;
        break;
      case Tok::Comma:
        // A comma among the integer placeholders asks for grouping.
        if (inside && !afterPoint) sec.grouping = true;
        break;
      case Tok::Point:
        if (!afterPoint) sec.point = true;
        afterPoint = true;
        break;
      case Tok::Zero:
        if (afterPoint) ++sec.minFraction, ++sec.maxFraction;
        else seenZero = true, ++sec.minInteger;
        break;
      case Tok::Hash:
        if (afterPoint) ++sec.maxFraction;
        else if (seenZero) ++sec.minInteger;
        break;
      case Tok::DatePart: break;
    }
  }
  return sec;
}

// The magnitude of x in the section's picture, without any sign.
std::string RenderNumber(const NumberSection& sec, double magnitude) {
  const Locale& loc = CurrentLocale();
  const double scaled = sec.percent ? magnitude * 100.0 : magnitude;
  DecimalDigits d = ToDecimal(scaled, sec.maxFraction, Rounding::HalfAwayFromZero);
  std::string fraction = d.fraction;
  while (static_cast<int>(fraction.size()) > sec.minFraction && fraction.back() == '0')
    fraction.pop_back();
  std::string integer = d.integer == "0" ? "" : d.integer;
  if (static_cast<int>(integer.size()) < sec.minInteger)
    integer.insert(0, static_cast<size_t>(sec.minInteger) - integer.size(), '0');
  if (sec.grouping) integer = Group(integer, loc.grouping);
  std::string out = sec.prefix + integer;
  if (sec.point) out += loc.decimal + fraction;
  return out + sec.suffix;
}

bool RoundsToZero(const NumberSection& sec, double magnitude) {
  const double scaled = sec.percent ? magnitude * 100.0 : magnitude;
  const DecimalDigits d = ToDecimal(scaled, sec.maxFraction, Rounding::HalfAwayFromZero);
  return d.integer == "0" && d.fraction.find_first_not_of('0') == std::string::npos;
}

std::string FormatNumber(double x, std::string_view picture) {
  const std::vector<std::string> sections = SplitSections(picture);
  auto section = [&](size_t i) { return Analyse(Tokenize(sections[i], false)); };
  if (x == 0.0 && sections.size() >= 3 && !sections[2].empty()) return RenderNumber(section(2), 0.0);
  if (x < 0) {
    const NumberSection positive = section(0);
    if (RoundsToZero(positive, -x)) return RenderNumber(positive, 0.0);
    // A negative section shows the value without its own sign: the picture writes it.
    if (sections.size() >= 2 && !sections[1].empty()) return RenderNumber(section(1), -x);
    return "-" + RenderNumber(positive, -x);
  }
  return RenderNumber(section(0), x);
}

// ---------------------------------------------------------------------------------------
// Dates.

const char* const kMonthNames[] = {"janeiro", "fevereiro", "março",    "abril",
                                   "maio",    "junho",     "julho",    "agosto",
                                   "setembro", "outubro",  "novembro", "dezembro"};
const char* const kMonthShort[] = {"jan", "fev", "mar", "abr", "mai", "jun",
                                   "jul", "ago", "set", "out", "nov", "dez"};
const char* const kDayNames[] = {"domingo", "segunda-feira", "terça-feira", "quarta-feira",
                                 "quinta-feira", "sexta-feira", "sábado"};
const char* const kDayShort[] = {"dom", "seg", "ter", "qua", "qui", "sex", "sáb"};

std::string FormatDate(Date date, std::string_view picture) {
  const DateParts p = SplitDate(date);
  const std::vector<Token> tokens = Tokenize(SplitSections(picture)[0], true);
  std::string out;
  bool afterHour = false;  // "mm" right after an hour means minutes, as in "hh:mm"
  for (const Token& t : tokens) {
    if (t.kind != Tok::DatePart) {
      out += t.text == "/" ? CurrentLocale().dateSeparator : t.text;
      continue;
    }
    const size_t n = t.text.size();
    switch (t.text[0]) {
      case 'd':
        if (n == 1) out += std::to_string(p.day);
        else if (n == 2) out += fmt::format("{:02}", p.day);
        else if (n == 3) out += kDayShort[p.weekday - 1];
        else out += kDayNames[p.weekday - 1];
        afterHour = false;
        break;
      case 'm':
        if (afterHour && n <= 2) out += n == 1 ? std::to_string(p.minute) : fmt::format("{:02}", p.minute);
        else if (n == 1) out += std::to_string(p.month);
        else if (n == 2) out += fmt::format("{:02}", p.month);
        else if (n == 3) out += kMonthShort[p.month - 1];
        else out += kMonthNames[p.month - 1];
        afterHour = false;
        break;
      case 'y':
        out += n <= 2 ? fmt::format("{:02}", p.year % 100) : fmt::format("{:04}", p.year);
        afterHour = false;
        break;
      case 'h':
        out += n == 1 ? std::to_string(p.hour) : fmt::format("{:02}", p.hour);
        afterHour = true;
        break;
      case 'n':
        out += n == 1 ? std::to_string(p.minute) : fmt::format("{:02}", p.minute);
        afterHour = false;
        break;
      case 's':
        out += n == 1 ? std::to_string(p.second) : fmt::format("{:02}", p.second);
        afterHour = false;
        break;
    }
  }
  return out;
}

}  // namespace

std::string Format(const Variant& value, std::string_view picture) {
  switch (value.Type()) {
    case VarType::Empty:
    case VarType::Null:
    case VarType::Missing:
    case VarType::Object: return "";
    default: break;
  }
  if (picture.empty()) return CStr(value);

  if (IsDatePicture(picture)) {
    if (value.Type() == VarType::Date) return FormatDate(value.AsDate(), picture);
    if (value.Type() == VarType::String) {
      if (auto d = ParseDate(value.AsString())) return FormatDate(*d, picture);
      if (auto n = ParseRegionalNumber(value.AsString())) return FormatDate(Date{*n}, picture);
      return value.AsString();
    }
    return FormatDate(CDate(value), picture);
  }

  double x = 0;
  if (value.Type() == VarType::String) {
    auto n = ParseRegionalNumber(value.AsString());
    if (!n) return value.AsString();  // text that is no number is shown as it is
    x = *n;
  } else {
    x = CDbl(value);
  }
  if (!std::isfinite(x)) return CStr(value);
  return FormatNumber(x, picture);
}

}  // namespace vb
