#include "qt/ListBoxViews.h"

#include <QKeyEvent>
#include <QLineEdit>
#include <QMouseEvent>

#include "platform/forms/KeyboardUser.h"
#include "qt/FormWindow.h"
#include "qt/QtText.h"

namespace dvqt {

// ---- ComboBox ----------------------------------------------------------------------

ComboBoxView::ComboBoxView(FormWindow& window, forms::ComboBox& combo)
    : ControlView(window, combo, new QComboBox(window.client())), model_(combo),
      combo_(static_cast<QComboBox*>(widget())) {
  combo_->setEditable(combo.Style() != forms::vbComboDropDownList);
  combo_->setInsertPolicy(QComboBox::NoInsert);
  combo_->setMaxVisibleItems(16);
  if (QLineEdit* edit = combo_->lineEdit()) {
    edit->setContextMenuPolicy(Qt::NoContextMenu);
    Watch(edit);
  }
  // The drop-down's choice is a person's choice of an entry.
  QObject::connect(combo_, &QComboBox::activated, this, [this](int index) {
    Input([&] { forms::KeyboardUser(form()).Choose(model_, static_cast<int32_t>(index)); });
    if (this->window().Live()) SyncChoice();
  });
}

void ComboBoxView::Rebuild() {
  QSignalBlocker blocker(combo_);
  combo_->clear();
  for (int32_t i = 0; i < model_.ListCount(); ++i) combo_->addItem(ToQ(model_.List(i)));
  SyncChoice();
}

void ComboBoxView::SyncChoice() {
  if (Stale()) return;
  QSignalBlocker blocker(combo_);
  combo_->setCurrentIndex(model_.ListIndex());
  if (combo_->isEditable()) {
    // An editable combo holds any text; the model edits it at its end.
    QString text = ToQ(model_.Text());
    if (combo_->currentText() != text) combo_->setEditText(text);
    if (QLineEdit* edit = combo_->lineEdit()) edit->setCursorPosition(static_cast<int>(text.size()));
  }
}

bool ComboBoxView::SyncOwn(std::string_view property) {
  if (property == "List") Defer();
  else if (property == "ListIndex" || property == "Text") SyncChoice();
  else return false;
  return true;
}

bool ComboBoxView::OnKey(QKeyEvent& event) {
  auto stroke = TranslateKey(event);
  if (!stroke) return true;
  // F4 and Alt+Down open the list, as Windows does; the model still sees the key.
  bool opens = event.key() == Qt::Key_F4 ||
               ((event.modifiers() & Qt::AltModifier) &&
                (event.key() == Qt::Key_Down || event.key() == Qt::Key_Up));
  if (opens) {
    KeyThroughWidget(event, *stroke, [this] {
      if (!combo_->view()->isVisible()) combo_->showPopup();
    });
    return true;
  }
  KeyToModel(*stroke);
  return true;
}

// ---- ListBox -----------------------------------------------------------------------

ListBoxView::ListBoxView(FormWindow& window, forms::ListBox& list)
    : ControlView(window, list, new QListWidget(window.client())), model_(list),
      list_(static_cast<QListWidget*>(widget())) {
  list_->setSelectionMode(QAbstractItemView::SingleSelection);
  list_->setEditTriggers(QAbstractItemView::NoEditTriggers);
  Watch(list_->viewport());
}

void ListBoxView::Rebuild() {
  QSignalBlocker blocker(list_);
  list_->clear();
  for (int32_t i = 0; i < model_.ListCount(); ++i) list_->addItem(ToQ(model_.List(i)));
  SyncChoice();
}

void ListBoxView::SyncChoice() {
  if (Stale()) return;
  QSignalBlocker blocker(list_);
  int32_t index = model_.ListIndex();
  if (index < 0) {
    list_->clearSelection();
    list_->setCurrentRow(-1, QItemSelectionModel::Clear);
    return;
  }
  list_->setCurrentRow(index, QItemSelectionModel::ClearAndSelect);
  list_->scrollToItem(list_->item(index));
}

bool ListBoxView::SyncOwn(std::string_view property) {
  if (property == "List") Defer();
  else if (property == "ListIndex") SyncChoice();
  else return false;
  return true;
}

bool ListBoxView::OnMousePress(QMouseEvent& event, QWidget& target) {
  bool consumed = ControlView::OnMousePress(event, target);
  if (!this->window().Live() || event.button() != Qt::LeftButton ||
      form().ActiveControl() != &model_)
    return consumed;
  // Windows chooses the entry under the pointer as the button goes down.
  QPoint at = list_->viewport()->mapFrom(&target, event.position().toPoint());
  if (QListWidgetItem* item = list_->itemAt(at)) {
    int row = list_->row(item);
    Input([&] { forms::KeyboardUser(form()).Choose(model_, static_cast<int32_t>(row)); });
  }
  return consumed;
}

}  // namespace dvqt
