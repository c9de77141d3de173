#include "platform/forms/Menu.h"

#include "platform/forms/Form.h"
#include "platform/vb/Conversions.h"

namespace forms {

namespace {
const PropertyTable<Menu>& Properties() {
  static const PropertyTable<Menu> table = {
      {"caption",
       {[](Menu& c) { return vb::Variant(c.Caption()); },
        [](Menu& c, const vb::Variant& v) { c.SetCaption(vb::CStr(v)); }}},
      {"checked",
       {[](Menu& c) { return vb::Variant(c.Checked()); },
        [](Menu& c, const vb::Variant& v) { c.SetChecked(vb::CBool(v)); }}},
  };
  return table;
}
}  // namespace

const std::string& Menu::Caption() const { Touch(); return state_.caption; }
void Menu::SetCaption(std::string caption) {
  Touch();
  if (state_.caption == caption) return;
  state_.caption = std::move(caption);
  Changed("Caption");
}

bool Menu::Checked() const { Touch(); return state_.checked; }
void Menu::SetChecked(bool checked) {
  Touch();
  if (state_.checked == checked) return;
  state_.checked = checked;
  Changed("Checked");
}

bool Menu::CanBeChosen() const { return Visible() && Enabled() && !IsSeparator(); }

std::vector<Menu*> Menu::Items() const {
  Touch();
  std::vector<Menu*> items;
  for (const auto& control : Parent().Controls())
    if (auto* item = dynamic_cast<Menu*>(control.get()); item && item->Container() == Name())
      items.push_back(item);
  return items;
}

vb::Variant Menu::Get(const std::string& name) { return GetProperty(Properties(), *this, name); }
void Menu::Let(const std::string& name, const vb::Variant& value) {
  LetProperty(Properties(), *this, name, value);
}

}  // namespace forms
