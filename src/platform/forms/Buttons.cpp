#include "platform/forms/Buttons.h"

#include "platform/forms/Form.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace forms {

namespace {

template <class C>
vb::Variant GetCaption(C& c) { return vb::Variant(c.Caption()); }
template <class C>
void LetCaption(C& c, const vb::Variant& v) { c.SetCaption(vb::CStr(v)); }

const PropertyTable<CommandButton>& ButtonProperties() {
  static const PropertyTable<CommandButton> table = {
      {"caption", {&GetCaption<CommandButton>, &LetCaption<CommandButton>}},
      {"default",
       {[](CommandButton& c) { return vb::Variant(c.Default()); },
        [](CommandButton& c, const vb::Variant& v) { c.SetDefault(vb::CBool(v)); }}},
      {"cancel",
       {[](CommandButton& c) { return vb::Variant(c.Cancel()); },
        [](CommandButton& c, const vb::Variant& v) { c.SetCancel(vb::CBool(v)); }}},
      // Value = True clicks the button, as in Basic.
      {"value",
       {[](CommandButton&) { return vb::Variant(false); },
        [](CommandButton& c, const vb::Variant& v) {
          if (vb::CBool(v)) c.Click();
        }}},
  };
  return table;
}

const PropertyTable<CheckBox>& CheckProperties() {
  static const PropertyTable<CheckBox> table = {
      {"caption", {&GetCaption<CheckBox>, &LetCaption<CheckBox>}},
      {"value",
       {[](CheckBox& c) { return vb::Variant(int32_t{c.Value()}); },
        [](CheckBox& c, const vb::Variant& v) {
          // A Boolean True is -1 in Basic; a check box takes it as ticked.
          int32_t value = vb::CLng(v);
          c.SetValue(value == -1 ? vbChecked : value);
        }}},
  };
  return table;
}

const PropertyTable<OptionButton>& OptionProperties() {
  static const PropertyTable<OptionButton> table = {
      {"caption", {&GetCaption<OptionButton>, &LetCaption<OptionButton>}},
      {"value",
       {[](OptionButton& c) { return vb::Variant(c.Value()); },
        [](OptionButton& c, const vb::Variant& v) { c.SetValue(vb::CBool(v)); }}},
  };
  return table;
}

}  // namespace

// ---- CommandButton ---------------------------------------------------------------

const std::string& CommandButton::Caption() const { Touch(); return state_.caption; }
void CommandButton::SetCaption(std::string caption) {
  Touch();
  if (state_.caption == caption) return;
  state_.caption = std::move(caption);
  Changed("Caption");
}

bool CommandButton::Default() const { Touch(); return state_.isDefault; }
void CommandButton::SetDefault(bool isDefault) {
  Touch();
  if (isDefault)
    if (CommandButton* other = Parent().DefaultButton(); other && other != this)
      other->SetDefault(false);
  if (state_.isDefault == isDefault) return;
  state_.isDefault = isDefault;
  Changed("Default");
}

bool CommandButton::Cancel() const { Touch(); return state_.isCancel; }
void CommandButton::SetCancel(bool isCancel) {
  Touch();
  if (isCancel)
    if (CommandButton* other = Parent().CancelButton(); other && other != this)
      other->SetCancel(false);
  if (state_.isCancel == isCancel) return;
  state_.isCancel = isCancel;
  Changed("Cancel");
}

bool CommandButton::CanBeClicked() const {
  return Visible() && Enabled() && Parent().Showing();
}

void CommandButton::CharacterTyped(int keyAscii) {
  if (keyAscii == vbKeyReturn || keyAscii == vbKeySpace) ClickedByUser();
}

vb::Variant CommandButton::Get(const std::string& name) { return GetProperty(ButtonProperties(), *this, name); }
void CommandButton::Let(const std::string& name, const vb::Variant& value) {
  LetProperty(ButtonProperties(), *this, name, value);
}

// ---- CheckBox --------------------------------------------------------------------

const std::string& CheckBox::Caption() const { Touch(); return state_.caption; }
void CheckBox::SetCaption(std::string caption) {
  Touch();
  if (state_.caption == caption) return;
  state_.caption = std::move(caption);
  Changed("Caption");
}

int CheckBox::Value() const { Touch(); return state_.value; }
void CheckBox::SetValue(int value) {
  Touch();
  if (value != vbUnchecked && value != vbChecked && value != vbGrayed)
    throw vb::Error(380, "Invalid property value");
  if (state_.value == value) return;
  state_.value = value;
  Changed("Value");
  Raise(Click);
}

void CheckBox::ClickedByUser() { SetValue(Value() == vbUnchecked ? vbChecked : vbUnchecked); }

void CheckBox::CharacterTyped(int keyAscii) {
  if (keyAscii == vbKeySpace) ClickedByUser();
}

vb::Variant CheckBox::Get(const std::string& name) { return GetProperty(CheckProperties(), *this, name); }
void CheckBox::Let(const std::string& name, const vb::Variant& value) {
  LetProperty(CheckProperties(), *this, name, value);
}

// ---- OptionButton ----------------------------------------------------------------

const std::string& OptionButton::Caption() const { Touch(); return state_.caption; }
void OptionButton::SetCaption(std::string caption) {
  Touch();
  if (state_.caption == caption) return;
  state_.caption = std::move(caption);
  Changed("Caption");
}

bool OptionButton::Value() const { Touch(); return state_.value; }
void OptionButton::SetValue(bool value) {
  Touch();
  if (state_.value == value) return;
  if (value) {
    // Option buttons of one container exclude each other.
    for (const auto& control : Parent().Controls()) {
      auto* other = dynamic_cast<OptionButton*>(control.get());
      if (other && other != this && other->Container() == Container() && other->state_.value) {
        other->state_.value = false;
        other->Changed("Value");
      }
    }
  }
  state_.value = value;
  Changed("Value");
  if (value) Raise(Click);
}

void OptionButton::CharacterTyped(int keyAscii) {
  if (keyAscii == vbKeySpace) ClickedByUser();
}

vb::Variant OptionButton::Get(const std::string& name) { return GetProperty(OptionProperties(), *this, name); }
void OptionButton::Let(const std::string& name, const vb::Variant& value) {
  LetProperty(OptionProperties(), *this, name, value);
}

}  // namespace forms
