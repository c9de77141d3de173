#include "platform/forms/KeyboardUser.h"

#include <stdexcept>
#include <utility>

#include "platform/forms/DTPicker.h"
#include "platform/forms/ListControls.h"
#include "platform/forms/ListView.h"
#include "platform/forms/Menu.h"
#include "platform/forms/Toolbar.h"
#include "platform/forms/TreeView.h"

namespace forms {

namespace {

// Reads the next code point of UTF-8 text.
int NextCodePoint(std::string_view text, size_t& at) {
  auto byte = static_cast<unsigned char>(text[at++]);
  int extra = byte >= 0xF0 ? 3 : byte >= 0xE0 ? 2 : byte >= 0xC0 ? 1 : 0;
  int code = extra == 0 ? byte : byte & (0x3F >> extra);
  for (; extra > 0 && at < text.size(); --extra)
    code = (code << 6) | (static_cast<unsigned char>(text[at++]) & 0x3F);
  return code;
}

// The key that types a character on a keyboard, and whether Shift is held.
std::pair<int, int> KeyFor(int character) {
  if (character >= 'a' && character <= 'z') return {character - 'a' + 'A', 0};
  if (character >= 'A' && character <= 'Z') return {character, vbShiftMask};
  if (character >= '0' && character <= '9') return {character, 0};
  switch (character) {
    case ' ': return {vbKeySpace, 0};
    case ',': return {188, 0};
    case '-': return {189, 0};
    case '.': return {190, 0};
    case '+': return {187, vbShiftMask};
    case '/': return {191, 0};
    case '\'': return {222, 0};
    case '\r':
    case '\n': return {vbKeyReturn, 0};
    case '\b': return {vbKeyBack, 0};
    case '\t': return {vbKeyTab, 0};
    default: return {vbKeyProcessKey, 0};
  }
}

// The character a key produces by itself, 0 for none.
int CharacterOf(int keyCode) {
  switch (keyCode) {
    case vbKeyReturn: return 13;
    case vbKeyBack: return 8;
    case vbKeyEscape: return 27;
    case vbKeySpace: return 32;
    default: return 0;
  }
}

}  // namespace

Control& KeyboardUser::Find(std::string_view name, int index) const {
  Control* control = form_.FindControl(name, index);
  if (!control) throw std::logic_error("form " + form_.Name() + " has no control " + std::string(name));
  return *control;
}

bool KeyboardUser::Reachable(Control& control) const {
  if (!form_.Showing()) return false;
  if (!control.Visible() || !control.Enabled()) return false;
  for (Control* holder = form_.FindControl(control.Container()); holder;
       holder = form_.FindControl(holder->Container()))
    if (!holder->Visible() || !holder->Enabled()) return false;
  return true;
}

bool KeyboardUser::Focus(Control& control) {
  if (!Reachable(control) || !control.CanFocus()) return false;
  return form_.MoveFocus(control) && form_.ActiveControl() == &control;
}

bool KeyboardUser::FocusForClick(Control& control) {
  if (!control.Focusable()) return true;
  return Focus(control);
}

void KeyboardUser::Type(std::string_view text) {
  size_t at = 0;
  while (at < text.size() && form_.Loaded()) {
    int character = NextCodePoint(text, at);
    auto [keyCode, shift] = KeyFor(character);
    if (keyCode == vbKeyTab) {
      form_.KeyStroke(keyCode, shift, 0);
      continue;
    }
    form_.KeyStroke(keyCode, shift, character == '\n' ? 13 : character);
  }
}

bool KeyboardUser::TypeInto(Control& control, std::string_view text) {
  if (!Focus(control)) return false;
  Type(text);
  return true;
}

void KeyboardUser::Press(int keyCode, int shift) {
  form_.KeyStroke(keyCode, shift, (shift & (vbCtrlMask | vbAltMask)) ? 0 : CharacterOf(keyCode));
}

bool KeyboardUser::Click(Control& control) {
  if (!Reachable(control) || !FocusForClick(control)) return false;
  uint64_t generation = form_.LoadGeneration();
  control.MouseDown(vbLeftButton, 0, 0, 0);
  if (form_.LoadGeneration() != generation || !form_.Loaded()) return true;
  control.MouseUp(vbLeftButton, 0, 0, 0);
  if (form_.LoadGeneration() != generation || !form_.Loaded()) return true;
  control.ClickedByUser();
  return true;
}

bool KeyboardUser::DoubleClick(Control& control) {
  if (!Click(control)) return false;
  uint64_t generation = form_.LoadGeneration();
  if (!form_.Loaded()) return true;
  control.DblClick();
  if (form_.LoadGeneration() == generation && form_.Loaded())
    control.MouseUp(vbLeftButton, 0, 0, 0);
  return true;
}

bool KeyboardUser::RightClick(Control& control, float x, float y) {
  if (!Reachable(control)) return false;
  uint64_t generation = form_.LoadGeneration();
  control.MouseDown(vbRightButton, 0, x, y);
  if (form_.LoadGeneration() == generation && form_.Loaded())
    control.MouseUp(vbRightButton, 0, x, y);
  return true;
}

bool KeyboardUser::Choose(ListControl& list, int32_t index) {
  if (!Reachable(list) || !Focus(list)) return false;
  if (index < 0 || index >= list.ListCount()) return false;
  list.SetListIndex(index);
  return true;
}

bool KeyboardUser::Choose(ListControl& list, std::string_view text) {
  for (int32_t i = 0; i < list.ListCount(); ++i)
    if (list.List(i) == text) return Choose(list, i);
  return false;
}

bool KeyboardUser::ChooseDate(DTPicker& picker, vb::Date date) {
  if (!Reachable(picker) || !Focus(picker)) return false;
  picker.SetValue(date);
  return true;
}

bool KeyboardUser::ChooseMenu(Menu& item) {
  if (!form_.Showing() || !item.CanBeChosen()) return false;
  item.Click();
  return true;
}

bool KeyboardUser::ClickButton(Toolbar& toolbar, const std::string& key) {
  ToolbarButton* button = toolbar.Buttons().Find(key);
  if (!button || !Reachable(toolbar)) return false;
  return toolbar.ClickButton(*button);
}

bool KeyboardUser::ClickItem(ListView& list, const std::string& key, int button) {
  ListItem* item = list.ListItems().Find(key);
  if (!item || !Reachable(list) || !Focus(list)) return false;
  list.ClickItem(*item, button);
  return true;
}

bool KeyboardUser::DoubleClickItem(ListView& list, const std::string& key) {
  if (!ClickItem(list, key)) return false;
  if (form_.Loaded()) list.DblClick();
  return true;
}

bool KeyboardUser::ClickColumn(ListView& list, int32_t index) {
  if (!Reachable(list) || index < 1 || index > list.ColumnHeaders().Count()) return false;
  list.ClickColumn(list.ColumnHeaders()(index));
  return true;
}

bool KeyboardUser::EditLabel(ListView& list, const std::string& key) {
  ListItem* item = list.ListItems().Find(key);
  if (!item || !Reachable(list) || !Focus(list)) return false;
  return list.StartLabelEdit(*item);
}

bool KeyboardUser::ClickNode(TreeView& tree, const std::string& key, int button) {
  Node* node = tree.Nodes().Find(key);
  if (!node || !Reachable(tree) || !Focus(tree)) return false;
  tree.ClickNode(*node, button);
  return true;
}

bool KeyboardUser::DoubleClickNode(TreeView& tree, const std::string& key) {
  if (!ClickNode(tree, key)) return false;
  if (form_.Loaded()) tree.DblClick();
  return true;
}

bool KeyboardUser::EditLabel(TreeView& tree, const std::string& key) {
  Node* node = tree.Nodes().Find(key);
  if (!node || !Reachable(tree) || !Focus(tree)) return false;
  return tree.StartLabelEdit(*node);
}

bool KeyboardUser::CloseWindow() { return form_.Close(); }

void KeyboardUser::Resize(int32_t width, int32_t height) {
  form_.Move(form_.Left(), form_.Top(), width, height);
}

}  // namespace forms
