#pragma once
// A text box: Text with its caret and selection, Locked, Alignment, MaxLength. Setting
// Text by code raises Change, as typing does; setting it to what it holds raises none.

#include <string>

#include "platform/forms/Control.h"

namespace forms {

class TextBox : public Control {
 public:
  using Control::Control;

  const std::string& Text() const;
  void SetText(std::string text);
  bool Locked() const;
  void SetLocked(bool locked);
  int Alignment() const;
  void SetAlignment(int alignment);
  // 0 for no limit; counts characters.
  int32_t MaxLength() const;
  void SetMaxLength(int32_t maxLength);
  // Caret and selection, in characters. Setting SelStart clears the selection.
  int32_t SelStart() const;
  void SetSelStart(int32_t start);
  int32_t SelLength() const;
  void SetSelLength(int32_t length);
  std::string SelText() const;
  // Replaces the selection, as pasting does; raises Change.
  void SetSelText(const std::string& text);

  Event<> Change;

  vb::Variant Get(const std::string& name) override;
  void Let(const std::string& name, const vb::Variant& value) override;

  void KeyAction(int keyCode, int shift) override;
  void CharacterTyped(int keyAscii) override;
  bool Focusable() const override { return true; }

 protected:
  void ResetState() override { state_ = {}; }
  int32_t DefaultBackColor() const override { return vbWindowBackground; }
  void ApplyCaption(const std::string& caption) override { state_.text = caption; }

 private:
  // Puts `text` in place of the selection and the caret after it: an edit of the user.
  void ReplaceSelection(const std::string& text);
  void EditTo(std::string text, int32_t caret);
  int32_t Length() const;

  struct State {
    std::string text;
    bool locked = false;
    int alignment = vbLeftJustify;
    int32_t maxLength = 0;
    int32_t selStart = 0;
    int32_t selLength = 0;
  } state_;
};

}  // namespace forms
