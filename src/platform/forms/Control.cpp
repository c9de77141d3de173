#include "platform/forms/Control.h"

#include <cctype>

#include "platform/forms/Form.h"
#include "platform/forms/FormListener.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace forms {

namespace {

const PropertyTable<Control>& CommonProperties() {
  static const PropertyTable<Control> table = {
      {"name", {[](Control& c) { return vb::Variant(c.Name()); }, nullptr}},
      {"index", {[](Control& c) { return vb::Variant(int32_t{c.Index()}); }, nullptr}},
      {"left",
       {[](Control& c) { return vb::Variant(c.Left()); },
        [](Control& c, const vb::Variant& v) { c.SetLeft(vb::CLng(v)); }}},
      {"top",
       {[](Control& c) { return vb::Variant(c.Top()); },
        [](Control& c, const vb::Variant& v) { c.SetTop(vb::CLng(v)); }}},
      {"width",
       {[](Control& c) { return vb::Variant(c.Width()); },
        [](Control& c, const vb::Variant& v) { c.SetWidth(vb::CLng(v)); }}},
      {"height",
       {[](Control& c) { return vb::Variant(c.Height()); },
        [](Control& c, const vb::Variant& v) { c.SetHeight(vb::CLng(v)); }}},
      {"enabled",
       {[](Control& c) { return vb::Variant(c.Enabled()); },
        [](Control& c, const vb::Variant& v) { c.SetEnabled(vb::CBool(v)); }}},
      {"visible",
       {[](Control& c) { return vb::Variant(c.Visible()); },
        [](Control& c, const vb::Variant& v) { c.SetVisible(vb::CBool(v)); }}},
      {"backcolor",
       {[](Control& c) { return vb::Variant(c.BackColor()); },
        [](Control& c, const vb::Variant& v) { c.SetBackColor(vb::CLng(v)); }}},
      {"tag",
       {[](Control& c) { return vb::Variant(c.Tag()); },
        [](Control& c, const vb::Variant& v) { c.SetTag(vb::CStr(v)); }}},
      {"tabstop",
       {[](Control& c) { return vb::Variant(c.TabStop()); },
        [](Control& c, const vb::Variant& v) { c.SetTabStop(vb::CBool(v)); }}},
      {"tabindex",
       {[](Control& c) { return vb::Variant(int32_t{c.TabIndex()}); },
        [](Control& c, const vb::Variant& v) { c.SetTabIndex(vb::CLng(v)); }}},
      {"causesvalidation",
       {[](Control& c) { return vb::Variant(c.CausesValidation()); },
        [](Control& c, const vb::Variant& v) { c.SetCausesValidation(vb::CBool(v)); }}},
      {"fontbold",
       {[](Control& c) { return vb::Variant(c.FontBold()); },
        [](Control& c, const vb::Variant& v) { c.SetFontBold(vb::CBool(v)); }}},
  };
  return table;
}

}  // namespace

std::string LowerName(std::string_view name) {
  std::string lower(name);
  for (char& ch : lower) ch = static_cast<char>(std::tolower(static_cast<unsigned char>(ch)));
  return lower;
}

void NoSuchMember(const std::string& name) {
  throw vb::Error(vb::kErrMemberNotSupported,
                  "Object doesn't support this property or method: " + name);
}

void ReadOnlyProperty(const std::string& name) {
  throw vb::Error(383, "'" + name + "' property is read-only");
}

Control::Control(Form& form, ControlDesign design) : form_(&form), design_(std::move(design)) {}

Form& Control::Parent() const {
  if (!form_) throw vb::Error(vb::kErrObjectNotSet);
  return *form_;
}

void Control::Touch() const { Parent().EnsureLoaded(); }

bool Control::Quiet() const { return form_ && form_->ApplyingDesign(); }

uint64_t Control::LoadGeneration() const { return form_ ? form_->LoadGeneration() : 0; }

void Control::Changed(std::string_view property) {
  if (Quiet() || !detail::Listened()) return;
  detail::Notify([&](FormListener& l) { l.ControlChanged(*this, property); });
}

void Control::ItemChanged(std::string_view key, std::string_view property) {
  if (Quiet() || !detail::Listened()) return;
  detail::Notify([&](FormListener& l) { l.ItemChanged(*this, key, property); });
}

void Control::ApplyDesign() {
  int tabIndex = common_.tabIndex;
  common_ = Common{};
  common_.left = design_.left;
  common_.top = design_.top;
  common_.width = design_.width;
  common_.height = design_.height;
  common_.backColor = DefaultBackColor();
  common_.tabStop = Focusable();
  common_.tabIndex = tabIndex;
  ResetState();
  ApplyCaption(design_.caption);
  ApplyItems(design_.items);
  for (const auto& [name, value] : design_.properties) Let(name, value);
}

#define DV_SETTER(Member, field, property)   \
  Touch();                                   \
  if (common_.field == Member) return;       \
  common_.field = std::move(Member);         \
  Changed(property);

int32_t Control::Left() const { Touch(); return common_.left; }
int32_t Control::Top() const { Touch(); return common_.top; }
int32_t Control::Width() const { Touch(); return common_.width; }
int32_t Control::Height() const { Touch(); return common_.height; }
void Control::SetLeft(int32_t twips) { DV_SETTER(twips, left, "Left") }
void Control::SetTop(int32_t twips) { DV_SETTER(twips, top, "Top") }
void Control::SetWidth(int32_t twips) {
  // Windows refuses a negative size with "Invalid property value".
  if (twips < 0) throw vb::Error(380, "Invalid property value");
  DV_SETTER(twips, width, "Width")
}
void Control::SetHeight(int32_t twips) {
  if (twips < 0) throw vb::Error(380, "Invalid property value");
  DV_SETTER(twips, height, "Height")
}
void Control::Move(int32_t left, int32_t top, int32_t width, int32_t height) {
  SetLeft(left);
  SetTop(top);
  if (width >= 0) SetWidth(width);
  if (height >= 0) SetHeight(height);
}

bool Control::Enabled() const { Touch(); return common_.enabled; }
void Control::SetEnabled(bool enabled) {
  Touch();
  if (common_.enabled == enabled) return;
  common_.enabled = enabled;
  Changed("Enabled");
  // A control that can no longer hold the focus gives it up, without validation.
  if (!enabled && form_->ActiveControl() == this) form_->ControlFocusLost(*this);
}
bool Control::Visible() const { Touch(); return common_.visible; }
void Control::SetVisible(bool visible) {
  Touch();
  if (common_.visible == visible) return;
  common_.visible = visible;
  Changed("Visible");
  if (!visible && form_->ActiveControl() == this) form_->ControlFocusLost(*this);
}
int32_t Control::BackColor() const { Touch(); return common_.backColor; }
void Control::SetBackColor(int32_t color) { DV_SETTER(color, backColor, "BackColor") }
const std::string& Control::Tag() const { Touch(); return common_.tag; }
void Control::SetTag(std::string tag) { DV_SETTER(tag, tag, "Tag") }
bool Control::TabStop() const { Touch(); return common_.tabStop; }
void Control::SetTabStop(bool tabStop) { DV_SETTER(tabStop, tabStop, "TabStop") }
int Control::TabIndex() const { Touch(); return common_.tabIndex; }
void Control::SetTabIndex(int tabIndex) { DV_SETTER(tabIndex, tabIndex, "TabIndex") }
bool Control::CausesValidation() const { Touch(); return common_.causesValidation; }
void Control::SetCausesValidation(bool causes) {
  DV_SETTER(causes, causesValidation, "CausesValidation")
}
bool Control::FontBold() const { Touch(); return common_.fontBold; }
void Control::SetFontBold(bool bold) { DV_SETTER(bold, fontBold, "FontBold") }

#undef DV_SETTER

bool Control::CanFocus() const {
  Touch();
  if (!Focusable() || !common_.visible || !common_.enabled || !form_->Showing()) return false;
  // A control inside a hidden or disabled frame cannot take the focus either.
  for (const Control* holder = form_->FindControl(design_.container); holder;
       holder = form_->FindControl(holder->Container())) {
    if (!holder->common_.visible || !holder->common_.enabled) return false;
  }
  return true;
}

void Control::SetFocus() {
  if (!CanFocus())
    throw vb::Error(vb::kErrInvalidProcedureCall, "Invalid procedure call or argument");
  form_->MoveFocus(*this);
}

vb::Variant Control::Invoke(const std::string& name, std::vector<vb::Variant>& args) {
  std::string lower = LowerName(name);
  if (lower == "setfocus") {
    SetFocus();
    return {};
  }
  if (lower == "move") {
    auto arg = [&](size_t i, int32_t fallback) {
      return i < args.size() && !args[i].IsMissing() ? vb::CLng(args[i]) : fallback;
    };
    Move(arg(0, Left()), arg(1, Top()), arg(2, -1), arg(3, -1));
    return {};
  }
  if (args.empty()) return Get(name);
  NoSuchMember(name);
}

vb::Variant Control::Get(const std::string& name) {
  auto row = CommonProperties().find(LowerName(name));
  if (row == CommonProperties().end()) NoSuchMember(name);
  return row->second.get(*this);
}

void Control::Let(const std::string& name, const vb::Variant& value) {
  auto row = CommonProperties().find(LowerName(name));
  if (row == CommonProperties().end()) NoSuchMember(name);
  if (!row->second.let) ReadOnlyProperty(name);
  row->second.let(*this, value);
}

}  // namespace forms
