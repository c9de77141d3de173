#include "common/modCode.h"

#include "common/ErrorTrap.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Format.h"

namespace common {
namespace {

std::string ReplaceAll(std::string text, const std::string& from, const std::string& to) {
  for (size_t pos = text.find(from); pos != std::string::npos; pos = text.find(from, pos + to.size()))
    text.replace(pos, from.size(), to);
  return text;
}

std::string TextLiteral(const std::string& trimmed) { return "'" + Trtf(trimmed) + "'"; }

std::string NumberLiteral(const vb::Variant& value) {
  // Only a plain number written the SQL way goes out unquoted; anything else would be
  // SQL of the person's own making, so it becomes null.
  const std::string text = vb::Trim(ReplaceAll(vb::CStr(value), ",", "."));
  return vb::ParseInvariantNumber(text) ? text : "null";
}

std::string DateLiteral(const vb::Variant& value, const std::string& trimmed) {
  if (trimmed == "- - -" || !vb::IsDate(value)) return "null";
  const vb::Date date = vb::CDate(value);
  if (date == vb::kEmptyDate) return "null";
  return "CONVERT(DATETIME,'" + vb::Format(date, "yyyy-mm-dd Hh:Nn:Ss") + "',102)";
}

std::string LikeLiteral(const std::string& trimmed) {
  // Blanks become wildcards before the apostrophes are escaped: the escape itself
  // contains blanks that must reach the server as they are.
  return "'%" + Trtf(ReplaceAll(trimmed, " ", "%")) + "%'";
}

}  // namespace

std::string SqlValue(const vb::Variant& value, int32_t kind) {
  const bool null = value.IsNull();
  const std::string trimmed = null ? std::string() : vb::Trim(vb::CStr(value));
  const bool blank = null || trimmed.empty();
  switch (kind) {
    case kSqlText: return blank ? "null" : TextLiteral(trimmed);
    case kSqlTextEmpty: return blank ? "''" : TextLiteral(trimmed);
    case kSqlLikePattern: return blank ? "'%%'" : LikeLiteral(trimmed);
    case kSqlNumber: return blank ? "null" : NumberLiteral(value);
    case kSqlDate:
    case kSqlDateTime: return blank ? "null" : DateLiteral(value, trimmed);
    default: return "";
  }
}

std::string Trtf(const std::string& text) {
  std::string result;
  Trap(CodeSite("Trtf"), [&] { result = ReplaceAll(text, "'", "' + CHAR(39) + '"); });
  return result;
}

std::string ReplaceChar(const vb::Variant& value, const std::string& from, const std::string& to) {
  if (vb::Len(from) != 1 || vb::Len(to) != 1) return "";
  return ReplaceAll(vb::CStr(value), from, to);
}

}  // namespace common
