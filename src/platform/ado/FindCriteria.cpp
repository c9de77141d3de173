#include "platform/ado/FindCriteria.h"

#include <cctype>
#include <cstdlib>

#include <fmt/format.h>

#include "platform/ado/Collation.h"
#include "platform/ado/ConnectionString.h"
#include "platform/ado/Errors.h"
#include "platform/ado/ServerDate.h"
#include "platform/vb/Error.h"

namespace ado {

namespace {

[[noreturn]] void BadCriteria() {
  throw vb::Error(kErrInvalidArgument,
                  "Arguments are of the wrong type, are out of acceptable range, or are in "
                  "conflict with one another.",
                  "ADODB.Recordset");
}

vb::Variant ReadValue(std::string_view v) {
  if (v.size() >= 2 && (v.front() == '\'' || v.front() == '"') && v.back() == v.front()) {
    std::string out;
    char q = v.front();
    for (size_t i = 1; i + 1 < v.size(); ++i) {
      out += v[i];
      if (v[i] == q && v[i + 1] == q) ++i;
    }
    return vb::Variant(out);
  }
  if (v.size() >= 2 && v.front() == '#' && v.back() == '#') {
    auto stored = NormalizeDateTimeText(v.substr(1, v.size() - 2));
    if (!stored) BadCriteria();
    return vb::Variant(*DateFromStoredText(*stored));
  }
  std::string s(v);
  char* end = nullptr;
  double d = std::strtod(s.c_str(), &end);
  if (!s.empty() && end && *end == '\0') return vb::Variant(d);
  return vb::Variant(s);
}

// A number for numeric and date values; nothing for texts and Null.
bool AsNumber(const vb::Variant& v, double& out) {
  switch (v.Type()) {
    case vb::VarType::Long: out = v.AsLong(); return true;
    case vb::VarType::Double: out = v.AsDouble(); return true;
    case vb::VarType::Date: out = v.AsDate().serial; return true;
    case vb::VarType::Boolean: out = v.AsBoolean() ? -1 : 0; return true;
    default: return false;
  }
}

}  // namespace

FindCriteria FindCriteria::Parse(std::string_view text) {
  text = Trim(text);
  size_t i = 0;
  while (i < text.size() && (std::isalnum(static_cast<unsigned char>(text[i])) || text[i] == '_' ||
                             static_cast<unsigned char>(text[i]) >= 0x80))
    ++i;
  FindCriteria c;
  c.field = std::string(text.substr(0, i));
  if (c.field.empty()) BadCriteria();
  std::string_view rest = Trim(text.substr(i));
  static constexpr std::pair<std::string_view, Op> kOps[] = {
      {"<=", Op::LessEqual}, {">=", Op::GreaterEqual}, {"<>", Op::NotEqual},
      {"=", Op::Equal},      {"<", Op::Less},          {">", Op::Greater}};
  bool found = false;
  for (auto [symbol, op] : kOps) {
    if (rest.starts_with(symbol)) {
      c.op = op;
      rest.remove_prefix(symbol.size());
      found = true;
      break;
    }
  }
  if (!found) {
    if (rest.size() > 4 && EqualsNoCase(rest.substr(0, 4), "like") &&
        std::isspace(static_cast<unsigned char>(rest[4]))) {
      c.op = Op::Like;
      rest.remove_prefix(4);
    } else {
      BadCriteria();
    }
  }
  rest = Trim(rest);
  if (rest.empty()) BadCriteria();
  c.value = ReadValue(rest);
  return c;
}

bool FindCriteria::Matches(const vb::Variant& candidate) const {
  if (candidate.IsNull() || candidate.IsEmpty()) return false;
  int order = 0;
  double a = 0, b = 0;
  if (op == Op::Like) {
    if (!candidate.IsString() || !value.IsString()) return false;
    std::u32string pattern = FoldForLike(value.AsString());
    for (auto& ch : pattern)
      if (ch == U'*') ch = U'%';
    return LikeMatch(pattern, FoldForLike(candidate.AsString()), 0);
  }
  if (AsNumber(candidate, a)) {
    if (!AsNumber(value, b)) {
      if (!value.IsString()) return false;
      // A date field against a date written as text.
      auto stored = NormalizeDateTimeText(value.AsString());
      if (!stored || candidate.Type() != vb::VarType::Date) return false;
      b = DateFromStoredText(*stored)->serial;
    }
    order = a < b ? -1 : a > b ? 1 : 0;
  } else if (candidate.IsString()) {
    std::string other;
    if (value.IsString()) other = value.AsString();
    else if (AsNumber(value, b)) other = fmt::format("{}", b);
    std::u32string x = FoldForLike(candidate.AsString()), y = FoldForLike(other);
    order = x < y ? -1 : x > y ? 1 : 0;
  } else {
    return false;
  }
  switch (op) {
    case Op::Equal: return order == 0;
    case Op::NotEqual: return order != 0;
    case Op::Less: return order < 0;
    case Op::Greater: return order > 0;
    case Op::LessEqual: return order <= 0;
    case Op::GreaterEqual: return order >= 0;
    case Op::Like: break;
  }
  return false;
}

}  // namespace ado
