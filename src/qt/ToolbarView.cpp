#include "qt/ToolbarView.h"

#include <QFontMetrics>

#include "qt/FormWindow.h"
#include "qt/Icons.h"
#include "qt/QtText.h"

namespace dvqt {

ToolbarView::ToolbarView(FormWindow& window, forms::Toolbar& toolbar)
    : ControlView(window, toolbar, new QToolBar(window.client())), model_(toolbar),
      bar_(static_cast<QToolBar*>(widget())) {
  bar_->setMovable(false);
  bar_->setFloatable(false);
  bar_->setContextMenuPolicy(Qt::PreventContextMenu);
}

QAction* ToolbarView::ActionAt(int32_t index) const {
  if (index < 1 || static_cast<size_t>(index) > actions_.size()) return nullptr;
  return actions_[static_cast<size_t>(index - 1)];
}

void ToolbarView::Rebuild() {
  for (QAction* action : actions_) delete action;
  actions_.clear();
  forms::ToolbarButtons& buttons = model_.Buttons();
  bool captions = false;
  for (int32_t i = 1; i <= buttons.Count(); ++i) {
    forms::ToolbarButton& button = buttons(i);
    captions = captions || !button.Caption().empty();
    QAction* action = bar_->addAction(ToolbarIcon(button.Key(), button.Caption()), QString());
    action->setObjectName(ToQ(button.Key()));
    // Buttons are found by index when clicked: a key may be empty, and an index stays
    // right because the actions are rebuilt whenever the buttons change.
    QObject::connect(action, &QAction::triggered, this, [this, i] {
      Input([&] {
        forms::ToolbarButtons& all = model_.Buttons();
        if (i <= all.Count()) model_.ClickButton(all(i));
      });
    });
    if (QWidget* tool = bar_->widgetForAction(action)) tool->setFocusPolicy(Qt::NoFocus);
    actions_.push_back(action);
    SyncButton(*action, button);
  }
  // Captions go beside the pictures when the bar is too low to put them under.
  int iconSide = scale().X(240);
  bar_->setIconSize(QSize(iconSide, iconSide));
  int under = iconSide + QFontMetrics(bar_->font()).height() + 8;
  bar_->setToolButtonStyle(!captions                               ? Qt::ToolButtonIconOnly
                           : scale().Y(model_.Height()) >= under ? Qt::ToolButtonTextUnderIcon
                                                                   : Qt::ToolButtonTextBesideIcon);
}

void ToolbarView::SyncButton(QAction& action, forms::ToolbarButton& button) {
  QString caption = ToQ(button.Caption());
  action.setText(caption);
  action.setIconText(caption);
  action.setToolTip(caption.trimmed().remove(QLatin1Char('&')));
  // The caption's mnemonic (Alt+G for "&Gravar") presses the button.
  action.setShortcut(QKeySequence::mnemonic(caption));
  action.setShortcutContext(Qt::WindowShortcut);
  action.setEnabled(button.Enabled());
  action.setVisible(button.Visible());
}

void ToolbarView::SyncItem(std::string_view key, std::string_view property) {
  if (Stale() || !this->window().Live()) return;
  forms::ToolbarButton* button = model_.Buttons().Find(std::string(key));
  QAction* action = button ? ActionAt(button->Index()) : nullptr;
  if (!action) return Defer();
  SyncButton(*action, *button);
}

bool ToolbarView::SyncOwn(std::string_view property) {
  if (property != "Buttons") return false;
  Defer();
  return true;
}

}  // namespace dvqt
