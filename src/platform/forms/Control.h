#pragma once
// What every control of a form has: its name and place in a control array, position
// and size in twips, Enabled, Visible, BackColor, Tag, tab order, and the events that
// focus, keys and the mouse raise. A control is also an automation object, so windows
// that know each other only by member name read and write its properties by name.
//
// Touching a control (reading or writing any property) loads its form first, as it
// does on Windows: a form that was never shown, or was unloaded, comes back with its
// design values.

#include <cstdint>
#include <string>
#include <string_view>
#include <unordered_map>

#include "platform/forms/Constants.h"
#include "platform/forms/Design.h"
#include "platform/forms/Event.h"
#include "platform/vb/Object.h"
#include "platform/vb/Variant.h"

namespace forms {

class Form;

class Control : public vb::Object {
 public:
  Control(Form& form, ControlDesign design);
  ~Control() override = default;
  Control(const Control&) = delete;
  Control& operator=(const Control&) = delete;

  // Identity: reading it does not load the form.
  ControlType Type() const { return design_.type; }
  const std::string& Name() const { return design_.name; }
  int Index() const { return design_.index; }
  const std::string& Container() const { return design_.container; }
  const ControlDesign& Design() const { return design_; }
  Form& Parent() const;

  int32_t Left() const;
  int32_t Top() const;
  int32_t Width() const;
  int32_t Height() const;
  void SetLeft(int32_t twips);
  void SetTop(int32_t twips);
  void SetWidth(int32_t twips);
  void SetHeight(int32_t twips);
  void Move(int32_t left, int32_t top, int32_t width, int32_t height);

  bool Enabled() const;
  void SetEnabled(bool enabled);
  bool Visible() const;
  void SetVisible(bool visible);
  int32_t BackColor() const;
  void SetBackColor(int32_t color);
  const std::string& Tag() const;
  void SetTag(std::string tag);
  bool TabStop() const;
  void SetTabStop(bool tabStop);
  int TabIndex() const;
  void SetTabIndex(int tabIndex);
  // Whether moving the focus to this control runs Validate of the one losing it.
  bool CausesValidation() const;
  void SetCausesValidation(bool causes);
  bool FontBold() const;
  void SetFontBold(bool bold);

  // Moves the focus here by code, with validation. A control that cannot take the
  // focus (hidden, disabled, on a hidden form) raises error 5, as on Windows.
  void SetFocus();
  // Whether a person could put the focus here now.
  bool CanFocus() const;

  // Events every control may raise. Cancel and the key arguments are by reference.
  Event<int&> Validate;  // Cancel
  Event<> GotFocus;
  Event<> LostFocus;
  Event<> Click;
  Event<> DblClick;
  Event<int&, int> KeyDown;  // KeyCode, Shift
  Event<int&> KeyPress;      // KeyAscii
  Event<int&, int> KeyUp;    // KeyCode, Shift
  Event<int, int, float, float> MouseDown;  // Button, Shift, X, Y
  Event<int, int, float, float> MouseUp;    // Button, Shift, X, Y

  vb::Variant Invoke(const std::string& name, std::vector<vb::Variant>& args) override;
  vb::Variant Get(const std::string& name) override;
  void Let(const std::string& name, const vb::Variant& value) override;

  // Behaviour behind a person's input, used by the form's keyboard and mouse routing.
  // A key that produces no character (arrows, Delete): the control's own action.
  virtual void KeyAction(int keyCode, int shift) {}
  // A character after KeyPress let it through (KeyAscii is a Unicode code point).
  virtual void CharacterTyped(int keyAscii) {}
  // What a click of a person does besides raising Click (a check box toggles).
  virtual void ClickedByUser() { Raise(Click); }
  // Whether this kind of control takes the focus at all.
  virtual bool Focusable() const { return false; }

  // Restores the design values; the form calls it on every load, events muted.
  void ApplyDesign();

 protected:
  // Loads the form when it is not loaded. Every public accessor starts with it.
  void Touch() const;
  // Tells the listeners a property changed (not while the design is being applied).
  void Changed(std::string_view property);
  void ItemChanged(std::string_view key, std::string_view property);
  // Raises an event unless the design is being applied, when Windows raises none.
  template <class... A, class... B>
  void Raise(const Event<A...>& event, B&&... args) const {
    if (!Quiet()) event(std::forward<B>(args)...);
  }
  bool Quiet() const;
  // Whether the control's form is still the one loaded when a sequence of events began;
  // a handler may unload it half-way, and the rest of the sequence must not reload it.
  uint64_t LoadGeneration() const;

  // Each kind of control resets its own state to the defaults before the design's
  // properties are applied.
  virtual void ResetState() {}
  virtual int32_t DefaultBackColor() const { return vbButtonFace; }
  virtual void ApplyItems(const std::vector<ItemDesign>& items) {}
  virtual void ApplyCaption(const std::string& caption) {}

 private:
  friend class Form;
  void Detach() { form_ = nullptr; }

  Form* form_;
  ControlDesign design_;
  struct Common {
    int32_t left = 0, top = 0, width = 0, height = 0;
    bool enabled = true, visible = true;
    int32_t backColor = vbButtonFace;
    std::string tag;
    bool tabStop = true;
    int tabIndex = 0;
    bool causesValidation = true;
    bool fontBold = false;
  } common_;
};

// Case-insensitive names, as Basic resolves members.
std::string LowerName(std::string_view name);

// A property table: one row per property name (lower case), with its reader and
// writer. Each control class keeps one and falls back to its base class's.
template <class C>
struct PropertyRow {
  vb::Variant (*get)(C&);
  void (*let)(C&, const vb::Variant&);
};
template <class C>
using PropertyTable = std::unordered_map<std::string, PropertyRow<C>>;

template <class C>
const PropertyRow<C>* FindRow(const PropertyTable<C>& table, const std::string& name) {
  auto row = table.find(LowerName(name));
  return row == table.end() ? nullptr : &row->second;
}

// Reads or writes a property through a class's table, falling back to the common
// properties of every control.
template <class C>
vb::Variant GetProperty(const PropertyTable<C>& table, C& self, const std::string& name) {
  if (auto* row = FindRow(table, name)) return row->get(self);
  return self.Control::Get(name);
}
template <class C>
void LetProperty(const PropertyTable<C>& table, C& self, const std::string& name,
                 const vb::Variant& value);

// Raised when a property table has no row: member not supported (438).
[[noreturn]] void NoSuchMember(const std::string& name);
// Raised when a read-only property is written (383).
[[noreturn]] void ReadOnlyProperty(const std::string& name);

template <class C>
void LetProperty(const PropertyTable<C>& table, C& self, const std::string& name,
                 const vb::Variant& value) {
  if (auto* row = FindRow(table, name)) {
    if (!row->let) ReadOnlyProperty(name);
    return row->let(self, value);
  }
  self.Control::Let(name, value);
}

}  // namespace forms
