#include "qt/ReportView.h"

#include <QApplication>
#include <QHeaderView>
#include <QMouseEvent>
#include <QTimer>

#include "platform/forms/Form.h"
#include "platform/forms/KeyboardUser.h"
#include "qt/FormWindow.h"
#include "qt/ImageLookup.h"
#include "qt/QtText.h"

namespace dvqt {

namespace {

Qt::Alignment ColumnAlignment(int alignment) {
  switch (alignment) {
    case forms::lvwColumnRight: return Qt::AlignRight | Qt::AlignVCenter;
    case forms::lvwColumnCenter: return Qt::AlignHCenter | Qt::AlignVCenter;
    default: return Qt::AlignLeft | Qt::AlignVCenter;
  }
}

int ShiftOf(Qt::KeyboardModifiers modifiers) {
  return ((modifiers & Qt::ShiftModifier) ? forms::vbShiftMask : 0) |
         ((modifiers & Qt::ControlModifier) ? forms::vbCtrlMask : 0) |
         ((modifiers & Qt::AltModifier) ? forms::vbAltMask : 0);
}

}  // namespace

ReportView::ReportView(FormWindow& window, forms::ListView& list)
    : ControlView(window, list, new QTreeWidget(window.client())), model_(list),
      tree_(static_cast<QTreeWidget*>(widget())) {
  tree_->setRootIsDecorated(false);
  tree_->setUniformRowHeights(true);
  tree_->setAllColumnsShowFocus(true);
  tree_->setSelectionBehavior(QAbstractItemView::SelectRows);
  tree_->setEditTriggers(QAbstractItemView::NoEditTriggers);
  tree_->header()->setSectionsMovable(false);
  tree_->header()->setStretchLastSection(false);
  tree_->header()->setSectionsClickable(true);
  Watch(tree_->viewport());

  QObject::connect(tree_->header(), &QHeaderView::sectionClicked, this, [this](int section) {
    Input([&] { forms::KeyboardUser(form()).ClickColumn(model_, section + 1); });
  });
  // A column dragged wider is a new width in the model.
  QObject::connect(tree_->header(), &QHeaderView::sectionResized, this,
                   [this](int section, int, int size) {
                     if (syncing_ || !this->window().Live()) return;
                     Input([&] {
                       forms::ColumnHeaderList& columns = model_.ColumnHeaders();
                       if (section < columns.Count())
                         columns(section + 1).SetWidth(scale().TwipsX(size));
                     });
                   });
  QObject::connect(tree_, &QTreeWidget::itemChanged, this, [this](QTreeWidgetItem* row, int column) {
    if (!syncing_ && row == editing_ && column == 0) FinishLabelEdit(row->text(0));
  });
  QObject::connect(tree_->itemDelegate(), &QAbstractItemDelegate::closeEditor, this, [this] {
    // Escape, or an editor closed without a change: the edit ends with the old text.
    if (editing_) FinishLabelEdit(editingText_);
  });
}

forms::ListItem* ReportView::ItemOf(QTreeWidgetItem* row) const {
  if (!row || Stale()) return nullptr;
  return reinterpret_cast<forms::ListItem*>(row->data(0, Qt::UserRole).value<quintptr>());
}

QTreeWidgetItem* ReportView::RowOf(const forms::ListItem* item) const {
  if (!item || Stale()) return nullptr;
  return tree_->topLevelItem(item->Index() - 1);
}

QTreeWidgetItem* ReportView::RowAt(const QPoint& pos, QWidget& target) const {
  return tree_->itemAt(tree_->viewport()->mapFrom(&target, pos));
}

void ReportView::SyncHeader() {
  syncing_ = true;
  forms::ColumnHeaderList& columns = model_.ColumnHeaders();
  tree_->setColumnCount(std::max(1, columns.Count()));
  tree_->setHeaderHidden(columns.Count() == 0);
  QTreeWidgetItem* header = tree_->headerItem();
  for (int32_t i = 1; i <= columns.Count(); ++i) {
    forms::ColumnHeader& column = columns(i);
    header->setText(i - 1, ToQ(column.Text()));
    header->setTextAlignment(i - 1, ColumnAlignment(column.Alignment()));
    tree_->setColumnWidth(i - 1, scale().X(column.Width()));
  }
  syncing_ = false;
  SyncSortIndicator();
}

void ReportView::SyncSortIndicator() {
  tree_->header()->setSortIndicatorShown(model_.Sorted());
  if (model_.Sorted())
    tree_->header()->setSortIndicator(model_.SortKey(), model_.SortOrder() == 0
                                                            ? Qt::AscendingOrder
                                                            : Qt::DescendingOrder);
}

void ReportView::SyncRow(QTreeWidgetItem& row, forms::ListItem& item) {
  syncing_ = true;
  forms::ColumnHeaderList& columns = model_.ColumnHeaders();
  row.setText(0, ToQ(item.Text()));
  for (int32_t column = 1; column < columns.Count(); ++column)
    row.setText(column, ToQ(item.SubItems(column)));
  for (int32_t column = 0; column < columns.Count(); ++column)
    row.setTextAlignment(column, ColumnAlignment(columns(column + 1).Alignment()));
  row.setIcon(0, ImageOfForm(form(), item.SmallIcon()));
  syncing_ = false;
}

void ReportView::Rebuild() {
  ++rebuilds_;
  editing_ = nullptr;
  pressedItem_ = editRequested_ = nullptr;
  SyncHeader();
  QSignalBlocker blocker(tree_);
  tree_->clear();
  byKey_.clear();
  forms::ListItemList& items = model_.ListItems();
  QList<QTreeWidgetItem*> rows;
  rows.reserve(items.Count());
  for (int32_t i = 1; i <= items.Count(); ++i) {
    forms::ListItem& item = items(i);
    auto* row = new QTreeWidgetItem;
    row->setData(0, Qt::UserRole, QVariant::fromValue(reinterpret_cast<quintptr>(&item)));
    SyncRow(*row, item);
    if (!item.Key().empty()) byKey_[item.Key()] = row;
    rows.append(row);
  }
  tree_->addTopLevelItems(rows);
  SyncSelection();
  if (forms::ListItem* shown = model_.ScrolledTo())
    if (QTreeWidgetItem* row = RowOf(shown)) tree_->scrollToItem(row);
}

void ReportView::SyncSelection() {
  if (Stale()) return;
  QSignalBlocker blocker(tree_);
  tree_->setSelectionMode(model_.MultiSelect() ? QAbstractItemView::ExtendedSelection
                                               : QAbstractItemView::SingleSelection);
  tree_->clearSelection();
  forms::ListItemList& items = model_.ListItems();
  for (int32_t i = 1; i <= items.Count(); ++i)
    if (items(i).Selected()) tree_->topLevelItem(i - 1)->setSelected(true);
  if (QTreeWidgetItem* current = RowOf(model_.SelectedItem()))
    tree_->setCurrentItem(current, 0, QItemSelectionModel::NoUpdate);
}

void ReportView::SyncItem(std::string_view key, std::string_view property) {
  if (Stale() || !this->window().Live()) return;
  if (property == "Width" || property == "Alignment") {
    SyncHeader();
    if (property == "Alignment") Defer();
    return;
  }
  auto found = byKey_.find(std::string(key));
  if (found == byKey_.end()) {
    // A column's caption, or an item without a key: rebuild from the model.
    if (property == "Text") SyncHeader();
    return Defer();
  }
  QTreeWidgetItem* row = found->second;
  forms::ListItem* item = ItemOf(row);
  if (!item) return Defer();
  if (property == "Selected") SyncSelection();
  else if (property == "EnsureVisible") tree_->scrollToItem(row);
  else SyncRow(*row, *item);
}

bool ReportView::SyncOwn(std::string_view property) {
  if (property == "ListItems" || property == "ColumnHeaders") Defer();
  else if (property == "MultiSelect") SyncSelection();
  else if (property == "Sorted" || property == "SortKey" || property == "SortOrder") SyncSortIndicator();
  else if (property == "LabelEdit") SyncLabelEdit();
  else return false;
  return true;
}

// ---- label editing -------------------------------------------------------------------

void ReportView::SyncLabelEdit() {
  if (Stale()) return;
  if (!model_.LabelEditing()) {
    if (editing_) {
      // The model ended the edit by code: the editor goes, the text is the model's.
      QTreeWidgetItem* row = editing_;
      editing_ = nullptr;
      tree_->setFocus();
      if (forms::ListItem* item = ItemOf(row)) SyncRow(*row, *item);
    }
    return;
  }
  if (editing_) return;
  forms::ListItem* item = editRequested_ ? editRequested_ : model_.SelectedItem();
  editRequested_ = nullptr;
  QTreeWidgetItem* row = RowOf(item);
  if (!row) return;
  editing_ = row;
  editingText_ = row->text(0);
  syncing_ = true;
  row->setFlags(row->flags() | Qt::ItemIsEditable);
  syncing_ = false;
  tree_->editItem(row, 0);
}

void ReportView::FinishLabelEdit(const QString& text) {
  QTreeWidgetItem* row = editing_;
  editing_ = nullptr;
  syncing_ = true;
  row->setFlags(row->flags() & ~Qt::ItemIsEditable);
  syncing_ = false;
  uint64_t rebuilds = rebuilds_;
  Input([&] { model_.EndLabelEdit(FromQ(text)); });
  // AfterLabelEdit may have refused the text: the row shows what the model kept.
  if (this->window().Live() && rebuilds == rebuilds_)
    if (forms::ListItem* item = ItemOf(row)) SyncRow(*row, *item);
}

void ReportView::StartLabelEditLater(forms::ListItem* item) {
  // A second, slow click on the selected item edits its label, as Explorer does.
  uint64_t rebuilds = rebuilds_, doubleClicks = doubleClicks_;
  QTimer::singleShot(QApplication::doubleClickInterval() + 50, this, [=, this] {
    if (!this->window().Live() || Stale() || rebuilds != rebuilds_ || doubleClicks != doubleClicks_ ||
        editing_ || !item->Selected() || model_.LabelEditing())
      return;
    editRequested_ = item;
    Input([&] { model_.StartLabelEdit(*item); });
    editRequested_ = nullptr;
  });
}

// ---- mouse ---------------------------------------------------------------------------

bool ReportView::OnMousePress(QMouseEvent& event, QWidget& target) {
  pressedItem_ = nullptr;
  forms::ListItem* item = ItemOf(RowAt(event.position().toPoint(), target));
  if (!item) return ControlView::OnMousePress(event, target);
  bool selected = item->Selected() && form().ActiveControl() == &model_;
  if (!FocusForClick()) return true;
  pressedItem_ = Stale() ? nullptr : item;
  pressedButton_ = event.button();
  pressedSelected_ = selected;
  return true;
}

bool ReportView::OnMouseRelease(QMouseEvent& event, QWidget& target) {
  if (!pressedItem_) return ControlView::OnMouseRelease(event, target);
  forms::ListItem* item = pressedItem_;
  pressedItem_ = nullptr;
  if (event.button() != pressedButton_ || Stale()) return true;
  bool editLater = pressedSelected_ && event.button() == Qt::LeftButton;
  uint64_t rebuilds = rebuilds_;
  Input([&] { model_.ClickItem(*item, ButtonOf(event.button()), ShiftOf(event.modifiers())); });
  if (editLater && this->window().Live() && rebuilds == rebuilds_ && !Stale()) StartLabelEditLater(item);
  return true;
}

bool ReportView::OnDoubleClick(QMouseEvent& event, QWidget& target) {
  ++doubleClicks_;
  pressedItem_ = nullptr;
  if (!FocusForClick()) return true;
  if (event.button() == Qt::LeftButton) Input([&] { model_.DblClick(); });
  return true;
}

}  // namespace dvqt
