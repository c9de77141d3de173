#include "platform/forms/DTPicker.h"

#include "platform/vb/Conversions.h"

namespace forms {

namespace {
const PropertyTable<DTPicker>& Properties() {
  static const PropertyTable<DTPicker> table = {
      {"value",
       {[](DTPicker& c) { return vb::Variant(c.Value()); },
        [](DTPicker& c, const vb::Variant& v) { c.SetValue(vb::CDate(v)); }}},
  };
  return table;
}
}  // namespace

vb::Date DTPicker::Value() const { Touch(); return value_; }

void DTPicker::SetValue(vb::Date value) {
  Touch();
  if (value_ == value) return;
  value_ = value;
  Changed("Value");
  Raise(Change);
}

vb::Variant DTPicker::Get(const std::string& name) { return GetProperty(Properties(), *this, name); }
void DTPicker::Let(const std::string& name, const vb::Variant& value) {
  LetProperty(Properties(), *this, name, value);
}

}  // namespace forms
