#include "qt/NodeTreeView.h"

#include <QHeaderView>
#include <QKeyEvent>
#include <QMouseEvent>
#include <algorithm>

#include "platform/forms/Form.h"
#include "platform/forms/KeyboardUser.h"
#include "qt/FormWindow.h"
#include "qt/ImageLookup.h"
#include "qt/QtText.h"

namespace dvqt {

namespace {

std::string NodeName(const forms::Node& node) {
  // How the model names a node in its notifications.
  return node.Key().empty() ? std::to_string(node.Index()) : node.Key();
}

int ShiftOf(Qt::KeyboardModifiers modifiers) {
  return ((modifiers & Qt::ShiftModifier) ? forms::vbShiftMask : 0) |
         ((modifiers & Qt::ControlModifier) ? forms::vbCtrlMask : 0) |
         ((modifiers & Qt::AltModifier) ? forms::vbAltMask : 0);
}

bool IsFormKey(int keyCode) {
  return keyCode == forms::vbKeyReturn || keyCode == forms::vbKeyEscape ||
         keyCode == forms::vbKeyTab;
}

}  // namespace

NodeTreeView::NodeTreeView(FormWindow& window, forms::TreeView& tree)
    : ControlView(window, tree, new QTreeWidget(window.client())), model_(tree),
      tree_(static_cast<QTreeWidget*>(widget())) {
  tree_->setHeaderHidden(true);
  tree_->setColumnCount(1);
  tree_->setUniformRowHeights(true);
  tree_->setExpandsOnDoubleClick(false);
  tree_->setEditTriggers(QAbstractItemView::NoEditTriggers);
  tree_->setSelectionMode(QAbstractItemView::SingleSelection);
  // Long names widen the tree with a scroll bar rather than being cut short.
  tree_->header()->setStretchLastSection(false);
  tree_->header()->setSectionResizeMode(QHeaderView::ResizeToContents);
  Watch(tree_->viewport());
  QObject::connect(tree_, &QTreeWidget::itemExpanded, this, [this](QTreeWidgetItem* row) { Toggled(row); });
  QObject::connect(tree_, &QTreeWidget::itemCollapsed, this, [this](QTreeWidgetItem* row) { Toggled(row); });
}


forms::Node* NodeTreeView::NodeOf(QTreeWidgetItem* row) const {
  if (!row || Stale()) return nullptr;
  return reinterpret_cast<forms::Node*>(row->data(0, Qt::UserRole).value<quintptr>());
}

QTreeWidgetItem* NodeTreeView::RowOf(const forms::Node* node) const {
  if (!node || Stale()) return nullptr;
  auto found = rows_.find(node);
  return found == rows_.end() ? nullptr : found->second;
}

void NodeTreeView::SyncRow(QTreeWidgetItem& row, forms::Node& node) {
  syncing_ = true;
  row.setText(0, ToQ(node.Text()));
  QFont font = tree_->font();
  font.setBold(node.Bold());
  row.setFont(0, font);
  int image = node.Selected() && node.SelectedImage() > 0 ? node.SelectedImage() : node.Image();
  row.setIcon(0, ImageOfForm(form(), image));
  syncing_ = false;
}

void NodeTreeView::SyncExpanded(QTreeWidgetItem& row, forms::Node& node) {
  syncing_ = true;
  row.setExpanded(node.Expanded());
  syncing_ = false;
}

QTreeWidgetItem* NodeTreeView::AddRow(forms::Node& node, QTreeWidgetItem* parent) {
  auto* row = parent ? new QTreeWidgetItem(parent) : new QTreeWidgetItem(tree_);
  row->setData(0, Qt::UserRole, QVariant::fromValue(reinterpret_cast<quintptr>(&node)));
  rows_[&node] = row;
  byKey_[NodeName(node)] = row;
  SyncRow(*row, node);
  for (forms::Node* child : node.Children()) AddRow(*child, row);
  return row;
}

void NodeTreeView::Rebuild() {
  ++rebuilds_;
  pressedNode_ = nullptr;
  syncing_ = true;
  {
    QSignalBlocker blocker(tree_);
    tree_->clear();
  }
  rows_.clear();
  byKey_.clear();
  for (forms::Node* root : model_.Nodes().Roots()) AddRow(*root, nullptr);
  syncing_ = false;
  // Expanded only after the children are in: Qt cannot expand a childless row.
  for (auto& [node, row] : rows_) SyncExpanded(*row, const_cast<forms::Node&>(*node));
  SyncSelection();
  if (QTreeWidgetItem* shown = RowOf(model_.ScrolledTo())) tree_->scrollToItem(shown);
}

void NodeTreeView::SyncSelection() {
  if (Stale()) return;
  QSignalBlocker blocker(tree_);
  QTreeWidgetItem* row = RowOf(model_.SelectedItem());
  tree_->clearSelection();
  if (!row) return;
  row->setSelected(true);
  tree_->setCurrentItem(row, 0, QItemSelectionModel::NoUpdate);
}

void NodeTreeView::SyncItem(std::string_view key, std::string_view property) {
  if (Stale() || !this->window().Live()) return;
  auto found = byKey_.find(std::string(key));
  forms::Node* node = found == byKey_.end() ? nullptr : NodeOf(found->second);
  if (!node) return Defer();
  QTreeWidgetItem& row = *found->second;
  if (property == "Expanded") {
    SyncExpanded(row, *node);
  } else if (property == "Selected") {
    SyncSelection();
    SyncRow(row, *node);
  } else if (property == "EnsureVisible") {
    tree_->scrollToItem(&row);
  } else {
    SyncRow(row, *node);
  }
}

bool NodeTreeView::SyncOwn(std::string_view property) {
  if (property != "Nodes") return false;
  Defer();
  return true;
}

void NodeTreeView::Toggled(QTreeWidgetItem* row) {
  if (syncing_ || !this->window().Live()) return;
  forms::Node* node = NodeOf(row);
  if (!node) return;
  uint64_t rebuilds = rebuilds_;
  if (node->Expanded() != row->isExpanded()) Input([&] { model_.ToggleNode(*node); });
  // The row shows what the model decided (a node without children stays closed).
  if (this->window().Live() && rebuilds == rebuilds_ && !Stale()) SyncExpanded(*row, *node);
}

// ---- keyboard ------------------------------------------------------------------------

std::vector<forms::Node*> NodeTreeView::VisibleNodes() const {
  std::vector<forms::Node*> shown;
  std::vector<forms::Node*> pending(model_.Nodes().Roots().rbegin(), model_.Nodes().Roots().rend());
  while (!pending.empty()) {
    forms::Node* node = pending.back();
    pending.pop_back();
    shown.push_back(node);
    if (node->Expanded())
      pending.insert(pending.end(), node->Children().rbegin(), node->Children().rend());
  }
  return shown;
}

void NodeTreeView::Select(forms::Node& node) {
  node.SetSelected(true);
  node.EnsureVisible();
  // The keyboard's choice of a node is a NodeClick, as on Windows.
  model_.NodeClick(node);
}

void NodeTreeView::Navigate(int keyCode) {
  std::vector<forms::Node*> shown = VisibleNodes();
  if (shown.empty()) return;
  forms::Node* current = model_.SelectedItem();
  auto at = std::find(shown.begin(), shown.end(), current);
  auto index = at == shown.end() ? -1 : static_cast<int>(at - shown.begin());
  int last = static_cast<int>(shown.size()) - 1;
  int page = std::max(1, tree_->viewport()->height() / std::max(1, tree_->fontMetrics().height() + 4));
  auto to = [&](int i) { Select(*shown[static_cast<size_t>(std::clamp(i, 0, last))]); };
  switch (keyCode) {
    case forms::vbKeyDown: return to(index + 1);
    case forms::vbKeyUp: return to(index < 0 ? 0 : index - 1);
    case forms::vbKeyHome: return to(0);
    case forms::vbKeyEnd: return to(last);
    case forms::vbKeyPageDown: return to(index + page);
    case forms::vbKeyPageUp: return to(index - page);
    default: break;
  }
  if (!current) return;
  bool open = current->Expanded() && !current->Children().empty();
  switch (keyCode) {
    case forms::vbKeyLeft:
      if (open) model_.ToggleNode(*current);
      else if (current->Parent()) Select(*current->Parent());
      break;
    case forms::vbKeyRight:
      if (current->Children().empty()) break;
      if (!current->Expanded()) model_.ToggleNode(*current);
      else Select(*current->Children().front());
      break;
    case forms::vbKeyAdd:
      if (!current->Expanded()) model_.ToggleNode(*current);
      break;
    case forms::vbKeySubtract:
      if (open) model_.ToggleNode(*current);
      break;
    default: break;
  }
}

bool NodeTreeView::OnKey(QKeyEvent& event) {
  auto stroke = TranslateKey(event);
  if (!stroke) return true;
  if (IsFormKey(stroke->keyCode)) {
    KeyToModel(*stroke);
    return true;
  }
  Input([&] {
    forms::Form& owner = form();
    uint64_t generation = owner.LoadGeneration();
    auto alive = [&] { return owner.Loaded() && owner.LoadGeneration() == generation; };
    int code = stroke->keyCode;
    model_.KeyDown(code, stroke->shift);
    if (!alive()) return;
    bool act = code != 0;
    if (act && stroke->character != 0) {
      int ascii = stroke->character;
      model_.KeyPress(ascii);
      if (!alive()) return;
      // Typed characters do nothing in a tree, but the keypad's plus and minus open
      // and close the node.
      act = ascii != 0 && (code == forms::vbKeyAdd || code == forms::vbKeySubtract);
    }
    if (act) {
      Flush();
      Navigate(code);
    }
    if (!alive()) return;
    int up = stroke->keyCode;
    model_.KeyUp(up, stroke->shift);
  });
  return true;
}

// ---- mouse ---------------------------------------------------------------------------

bool NodeTreeView::OnMousePress(QMouseEvent& event, QWidget& target) {
  pressedNode_ = nullptr;
  branchPress_ = false;
  QPoint at = tree_->viewport()->mapFrom(&target, event.position().toPoint());
  QTreeWidgetItem* row = tree_->itemAt(at);
  forms::Node* node = NodeOf(row);
  if (!node) return ControlView::OnMousePress(event, target);
  if (!FocusForClick()) return true;
  if (at.x() < tree_->visualItemRect(row).left()) {
    // The plus sign: Qt opens or closes the row, and the model follows (Toggled).
    branchPress_ = true;
    return false;
  }
  pressedNode_ = Stale() ? nullptr : node;
  pressedButton_ = event.button();
  return true;
}

bool NodeTreeView::OnMouseRelease(QMouseEvent& event, QWidget& target) {
  if (branchPress_) {
    branchPress_ = false;
    return true;
  }
  if (!pressedNode_) return ControlView::OnMouseRelease(event, target);
  forms::Node* node = pressedNode_;
  pressedNode_ = nullptr;
  if (event.button() != pressedButton_ || Stale()) return true;
  Input([&] { model_.ClickNode(*node, ButtonOf(event.button()), ShiftOf(event.modifiers())); });
  return true;
}

bool NodeTreeView::OnDoubleClick(QMouseEvent& event, QWidget& target) {
  pressedNode_ = nullptr;
  QPoint at = tree_->viewport()->mapFrom(&target, event.position().toPoint());
  forms::Node* node = NodeOf(tree_->itemAt(at));
  if (!FocusForClick() || event.button() != Qt::LeftButton) return true;
  uint64_t rebuilds = rebuilds_;
  Input([&] { model_.DblClick(); });
  // Windows opens or closes a node on a double click too, unless the handler changed
  // the tree under it.
  if (node && this->window().Live() && rebuilds == rebuilds_ && !Stale() && !node->Children().empty())
    Input([&] { model_.ToggleNode(*node); });
  return true;
}

}  // namespace dvqt
