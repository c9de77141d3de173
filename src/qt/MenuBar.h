#pragma once
// A form's menus: its top menus on the window's menu bar, their items (and items of
// items) as actions. Choosing an item raises its Click; opening a top menu raises the
// top menu's Click first, where windows enable and check their items. A top menu that
// is not visible exists only to be popped up.

#include <QMenuBar>
#include <string_view>
#include <unordered_map>

#include "platform/forms/Menu.h"

class QAction;
class QMenu;
class QWidget;

namespace forms {
class Form;
}

namespace dvqt {

class FormWindow;

class MenuBar {
 public:
  explicit MenuBar(FormWindow& window);

  QMenuBar* bar() const { return bar_; }
  // Whether the bar shows at all: some top menu is visible.
  bool Shown() const;
  void SyncAll();
  // A menu control's property changed; false when the control is not one of ours.
  bool Sync(const forms::Control& control, std::string_view property);

 private:
  void Add(forms::Menu& menu, QWidget* into);
  void SyncAction(forms::Menu& menu);
  void Chosen(forms::Menu& menu);

  FormWindow& window_;
  QMenuBar* bar_;
  std::unordered_map<const forms::Menu*, QAction*> actions_;
};

// Builds a pop-up menu of the model menu's items and shows it at the pointer: the item
// chosen, or null when the person dismissed it.
forms::Menu* ExecPopupMenu(forms::Menu& menu, QWidget* parent);

}  // namespace dvqt
