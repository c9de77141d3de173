#pragma once
// Command buttons, check boxes and option buttons. A check box's Value and an option
// button's Value set by code raise Click, as a person's click does.

#include <string>

#include "platform/forms/Control.h"

namespace forms {

class CommandButton : public Control {
 public:
  using Control::Control;

  const std::string& Caption() const;
  void SetCaption(std::string caption);
  // The button Enter clicks / the button Escape clicks. Only one of each per form:
  // setting it on one button clears it on the others.
  bool Default() const;
  void SetDefault(bool isDefault);
  bool Cancel() const;
  void SetCancel(bool isCancel);
  // Whether a person can click it now (visible and enabled, on a visible form).
  bool CanBeClicked() const;

  vb::Variant Get(const std::string& name) override;
  void Let(const std::string& name, const vb::Variant& value) override;
  // Enter and Space on a focused button click it.
  void CharacterTyped(int keyAscii) override;
  bool Focusable() const override { return true; }

 protected:
  void ResetState() override { state_ = {}; }
  void ApplyCaption(const std::string& caption) override { state_.caption = caption; }

 private:
  struct State {
    std::string caption;
    bool isDefault = false;
    bool isCancel = false;
  } state_;
};

class CheckBox : public Control {
 public:
  using Control::Control;

  const std::string& Caption() const;
  void SetCaption(std::string caption);
  // vbUnchecked, vbChecked or vbGrayed. A change raises Click.
  int Value() const;
  void SetValue(int value);

  vb::Variant Get(const std::string& name) override;
  void Let(const std::string& name, const vb::Variant& value) override;
  // A person's click ticks a clear box and clears a ticked or grey one.
  void ClickedByUser() override;
  void CharacterTyped(int keyAscii) override;
  bool Focusable() const override { return true; }

 protected:
  void ResetState() override { state_ = {}; }
  void ApplyCaption(const std::string& caption) override { state_.caption = caption; }

 private:
  struct State {
    std::string caption;
    int value = vbUnchecked;
  } state_;
};

class OptionButton : public Control {
 public:
  using Control::Control;

  const std::string& Caption() const;
  void SetCaption(std::string caption);
  // Setting it true clears the other option buttons of the same container and raises
  // Click.
  bool Value() const;
  void SetValue(bool value);

  vb::Variant Get(const std::string& name) override;
  void Let(const std::string& name, const vb::Variant& value) override;
  void ClickedByUser() override { SetValue(true); }
  void CharacterTyped(int keyAscii) override;
  bool Focusable() const override { return true; }

 protected:
  void ResetState() override { state_ = {}; }
  void ApplyCaption(const std::string& caption) override { state_.caption = caption; }

 private:
  struct State {
    std::string caption;
    bool value = false;
  } state_;
};

}  // namespace forms
