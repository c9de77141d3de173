#pragma once
// Combo boxes and list boxes: a list of texts, each with a 32-bit ItemData (normally a
// database key), and the selected entry ListIndex (-1 for none). Setting ListIndex by
// code raises Click, as a person's choice does.

#include <cstdint>
#include <string>
#include <vector>

#include "platform/forms/Control.h"

namespace forms {

class ListControl : public Control {
 public:
  using Control::Control;

  int32_t ListCount() const;
  int32_t ListIndex() const;
  void SetListIndex(int32_t index);
  // The index of the entry added last, -1 before any.
  int32_t NewIndex() const;
  const std::string& List(int32_t index) const;
  void SetList(int32_t index, std::string text);
  int32_t ItemData(int32_t index) const;
  void SetItemData(int32_t index, int32_t data);
  // Adds an entry at the end, or before `index`.
  void AddItem(std::string text, int32_t index = -1);
  void RemoveItem(int32_t index);
  void Clear();

  vb::Variant Invoke(const std::string& name, std::vector<vb::Variant>& args) override;
  vb::Variant Get(const std::string& name) override;
  void Let(const std::string& name, const vb::Variant& value) override;
  // Up and Down choose the neighbouring entry.
  void KeyAction(int keyCode, int shift) override;
  bool Focusable() const override { return true; }

 protected:
  void ResetState() override;
  int32_t DefaultBackColor() const override { return vbWindowBackground; }
  void CheckIndex(int32_t index) const;
  // What the selection moving means for the control's text.
  virtual void SelectionMoved() {}
  // The first entry after the selected one whose text starts with the character.
  int32_t EntryStartingWith(int keyAscii) const;

  struct Entry {
    std::string text;
    int32_t data = 0;
  };
  std::vector<Entry> entries_;
  int32_t listIndex_ = -1;
  int32_t newIndex_ = -1;
};

class ComboBox : public ListControl {
 public:
  using ListControl::ListControl;

  // vbComboDropDown (0), vbComboSimple (1) or vbComboDropDownList (2); fixed at design.
  int Style() const;
  void SetStyle(int style);
  // A drop-down list shows the selected entry and takes only an entry's text (else
  // error 383); the other styles hold any text, and setting it raises Change.
  const std::string& Text() const;
  void SetText(std::string text);

  Event<> Change;

  vb::Variant Get(const std::string& name) override;
  void Let(const std::string& name, const vb::Variant& value) override;
  void CharacterTyped(int keyAscii) override;

 protected:
  void ResetState() override;
  void SelectionMoved() override;
  void ApplyCaption(const std::string& caption) override { text_ = caption; }

 private:
  int style_ = vbComboDropDown;
  std::string text_;
};

class ListBox : public ListControl {
 public:
  using ListControl::ListControl;

  // The selected entry's text, "" when none.
  std::string Text() const;

  vb::Variant Get(const std::string& name) override;
  void CharacterTyped(int keyAscii) override;
};

}  // namespace forms
