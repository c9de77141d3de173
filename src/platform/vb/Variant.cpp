#include "platform/vb/Variant.h"

#include <fmt/format.h>

#include <limits>

#include "platform/vb/Error.h"

namespace vb {

Variant Variant::FromInt64(int64_t n) {
  if (n >= std::numeric_limits<int32_t>::min() && n <= std::numeric_limits<int32_t>::max())
    return Variant(static_cast<int32_t>(n));
  return Variant(static_cast<double>(n));
}

bool Variant::AsBoolean() const {
  if (auto* b = std::get_if<bool>(&v_)) return *b;
  throw Error(kErrTypeMismatch);
}

int32_t Variant::AsLong() const {
  if (auto* n = std::get_if<int32_t>(&v_)) return *n;
  throw Error(kErrTypeMismatch);
}

double Variant::AsDouble() const {
  if (auto* d = std::get_if<double>(&v_)) return *d;
  throw Error(kErrTypeMismatch);
}

Date Variant::AsDate() const {
  if (auto* d = std::get_if<Date>(&v_)) return *d;
  throw Error(kErrTypeMismatch);
}

const std::string& Variant::AsString() const {
  if (auto* s = std::get_if<std::string>(&v_)) return *s;
  throw Error(kErrTypeMismatch);
}

const ObjectPtr& Variant::AsObject() const {
  if (auto* o = std::get_if<ObjectPtr>(&v_)) return *o;
  throw Error(kErrTypeMismatch);
}

bool operator==(const Variant& a, const Variant& b) { return a.v_ == b.v_; }

std::string Variant::Debug() const {
  switch (Type()) {
    case VarType::Empty: return "Empty";
    case VarType::Null: return "Null";
    case VarType::Missing: return "Missing";
    case VarType::Boolean: return AsBoolean() ? "True" : "False";
    case VarType::Long: return fmt::format("{}&", AsLong());
    case VarType::Double: return fmt::format("{}#", AsDouble());
    case VarType::Date: {
      const DateParts p = SplitDate(AsDate());
      return fmt::format("#{:04}-{:02}-{:02} {:02}:{:02}:{:02}#", p.year, p.month, p.day, p.hour,
                         p.minute, p.second);
    }
    case VarType::String: return fmt::format("\"{}\"", AsString());
    case VarType::Object: return AsObject() ? "Object" : "Nothing";
  }
  return "?";
}

}  // namespace vb
