#include "qt/MenuBar.h"

#include <QCursor>
#include <QMenu>

#include "platform/forms/Form.h"
#include "platform/forms/KeyboardUser.h"
#include "qt/FormWindow.h"
#include "qt/QtText.h"
#include "qt/Renderer.h"

namespace dvqt {

namespace {

bool IsTopMenu(const forms::Control& control) {
  return control.Type() == forms::ControlType::Menu && control.Container().empty();
}

void Describe(QAction& action, forms::Menu& menu) {
  action.setSeparator(menu.IsSeparator());
  action.setText(ToQ(menu.Caption()));
  action.setCheckable(menu.Checked());
  action.setChecked(menu.Checked());
  action.setEnabled(menu.Enabled());
  action.setVisible(menu.Visible());
}

// One level of a pop-up menu; every action remembers its model item.
void FillPopup(QMenu& popup, forms::Menu& menu, std::unordered_map<QAction*, forms::Menu*>& items) {
  for (forms::Menu* item : menu.Items()) {
    if (!item->Visible()) continue;
    if (item->IsSeparator()) {
      popup.addSeparator();
      continue;
    }
    std::vector<forms::Menu*> children = item->Items();
    QAction* action = nullptr;
    if (!children.empty()) {
      QMenu* sub = popup.addMenu(ToQ(item->Caption()));
      FillPopup(*sub, *item, items);
      action = sub->menuAction();
    } else {
      action = popup.addAction(ToQ(item->Caption()));
    }
    Describe(*action, *item);
    items[action] = item;
  }
}

}  // namespace

MenuBar::MenuBar(FormWindow& window) : window_(window), bar_(new QMenuBar(&window)) {
  bar_->setNativeMenuBar(false);
}

bool MenuBar::Shown() const {
  for (const auto& control : window_.form().Controls())
    if (IsTopMenu(*control) && control->Visible()) return true;
  return false;
}

void MenuBar::SyncAll() {
  bar_->clear();
  actions_.clear();
  for (const auto& control : window_.form().Controls())
    if (IsTopMenu(*control)) Add(static_cast<forms::Menu&>(*control), bar_);
  bar_->setVisible(Shown());
}

void MenuBar::Add(forms::Menu& menu, QWidget* into) {
  std::vector<forms::Menu*> items = menu.Items();
  QAction* action = nullptr;
  if (items.empty()) {
    action = new QAction(into);
    into->addAction(action);
    QObject::connect(action, &QAction::triggered, bar_, [this, &menu] { Chosen(menu); });
  } else {
    auto* sub = new QMenu(into);
    action = sub->menuAction();
    into->addAction(action);
    // Opening a menu is its Click: the place where items get enabled and checked.
    QObject::connect(sub, &QMenu::aboutToShow, bar_, [this, &menu] { Chosen(menu); });
    for (forms::Menu* item : items) Add(*item, sub);
  }
  actions_[&menu] = action;
  Describe(*action, menu);
}

void MenuBar::Chosen(forms::Menu& menu) {
  if (!window_.Live()) return;
  window_.renderer().RunInput(window_.form(),
                              [&] { forms::KeyboardUser(window_.form()).ChooseMenu(menu); });
}

bool MenuBar::Sync(const forms::Control& control, std::string_view property) {
  auto found = actions_.find(dynamic_cast<const forms::Menu*>(&control));
  if (found == actions_.end()) return false;
  Describe(*found->second, *const_cast<forms::Menu*>(found->first));
  if (property == "Visible" && IsTopMenu(control)) bar_->setVisible(Shown());
  return true;
}

forms::Menu* ExecPopupMenu(forms::Menu& menu, QWidget* parent) {
  QMenu popup(parent);
  std::unordered_map<QAction*, forms::Menu*> items;
  FillPopup(popup, menu, items);
  if (items.empty()) return nullptr;
  QAction* chosen = popup.exec(QCursor::pos());
  auto found = items.find(chosen);
  return found == items.end() ? nullptr : found->second;
}

}  // namespace dvqt
