#pragma once
// A person at a form: the actions a user performs, with the events Windows raises for
// them, in its order. Tests of the windows, the automation driver and the renderer feed
// input through these. Each action that a person could not perform (a hidden or
// disabled control, a focus move that validation refused) does nothing and returns
// false.

#include <string>
#include <string_view>

#include "platform/forms/Form.h"
#include "platform/vb/Date.h"

namespace forms {

class ListControl;
class DTPicker;
class Toolbar;
class ListView;
class TreeView;
class Menu;

class KeyboardUser {
 public:
  explicit KeyboardUser(Form& form) : form_(form) {}

  Form& form() const { return form_; }

  // Moves the focus as a click or Tab would, with validation.
  bool Focus(Control& control);
  bool Focus(std::string_view name, int index = -1) { return Focus(Find(name, index)); }
  // Types a text key by key into the focused control: per character KeyDown, KeyPress,
  // the edit, Change, KeyUp.
  void Type(std::string_view text);
  // Moves the focus to the control, then types.
  bool TypeInto(Control& control, std::string_view text);
  bool TypeInto(std::string_view name, std::string_view text) {
    return TypeInto(Find(name), text);
  }
  // Presses one key on the focused control (Enter, Backspace, Delete, arrows, F2...).
  void Press(int keyCode, int shift = 0);

  // A left click: focus first for controls that take it, then the mouse events and
  // what the click does (a button's Click, a check box's toggle).
  bool Click(Control& control);
  bool Click(std::string_view name, int index = -1) { return Click(Find(name, index)); }
  bool DoubleClick(Control& control);
  // The right button pressed and released over a control (MouseDown, MouseUp).
  bool RightClick(Control& control, float x = 0, float y = 0);

  // Chooses an entry of a combo or list box, by index or by its text.
  bool Choose(ListControl& list, int32_t index);
  bool Choose(ListControl& list, std::string_view text);
  bool ChooseDate(DTPicker& picker, vb::Date date);
  // A menu item chosen from the window's menu bar.
  bool ChooseMenu(Menu& item);

  bool ClickButton(Toolbar& toolbar, const std::string& key);
  bool ClickItem(ListView& list, const std::string& key, int button = vbLeftButton);
  bool DoubleClickItem(ListView& list, const std::string& key);
  bool ClickColumn(ListView& list, int32_t index);
  // Starts editing an item's text: false when the list refused.
  bool EditLabel(ListView& list, const std::string& key);
  bool ClickNode(TreeView& tree, const std::string& key, int button = vbLeftButton);
  bool DoubleClickNode(TreeView& tree, const std::string& key);
  bool EditLabel(TreeView& tree, const std::string& key);

  // The close box: QueryUnload with vbFormControlMenu, then Unload. False when the
  // form refused.
  bool CloseWindow();
  // Drags the window's border to a size in twips.
  void Resize(int32_t width, int32_t height);
  void Minimize() { form_.SetWindowState(vbMinimized); }
  void Maximize() { form_.SetWindowState(vbMaximized); }
  void Restore() { form_.SetWindowState(vbNormal); }
  // Clicks into the window, making it the active one.
  void Activate() { form_.Activate(); }

 private:
  Control& Find(std::string_view name, int index = -1) const;
  // Whether a person can reach the control: on a shown form, visible and enabled.
  bool Reachable(Control& control) const;
  // A click moves the focus to a control that takes it; false when validation refused.
  bool FocusForClick(Control& control);

  Form& form_;
};

}  // namespace forms
