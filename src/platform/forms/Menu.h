#pragma once
// A menu is a control of its form: the top menu (mnFicheiro) holds its items, which
// are menu controls naming it as their container. An item whose caption is "-" is a
// separator. A pop-up menu is shown through the desktop (Form::PopupMenu); the item
// chosen raises its Click.

#include <string>
#include <vector>

#include "platform/forms/Control.h"

namespace forms {

class Menu : public Control {
 public:
  using Control::Control;

  const std::string& Caption() const;
  void SetCaption(std::string caption);
  bool Checked() const;
  void SetChecked(bool checked);
  bool IsSeparator() const { return Caption() == "-"; }
  // Whether a person can choose it: visible, enabled, not a separator.
  bool CanBeChosen() const;
  // The items of this menu, in design order.
  std::vector<Menu*> Items() const;

  vb::Variant Get(const std::string& name) override;
  void Let(const std::string& name, const vb::Variant& value) override;

 protected:
  void ResetState() override { state_ = {}; }
  void ApplyCaption(const std::string& caption) override { state_.caption = caption; }

 private:
  struct State {
    std::string caption;
    bool checked = false;
  } state_;
};

}  // namespace forms
