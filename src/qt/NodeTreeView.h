#pragma once
// A tree view as a QTreeWidget: nodes by key with their text, Bold, picture and
// Expanded state. The model's TreeView knows no keyboard of its own, so moving through
// the tree with the arrows, plus and minus is done here, on the model's nodes (after
// KeyDown let the key through), as Windows' tree control does it.

#include <QTreeWidget>
#include <cstdint>
#include <string>
#include <unordered_map>
#include <vector>

#include "platform/forms/TreeView.h"
#include "qt/ControlView.h"

namespace dvqt {

class NodeTreeView : public ControlView {
 public:
  NodeTreeView(FormWindow& window, forms::TreeView& tree);

  void SyncItem(std::string_view key, std::string_view property) override;

 protected:
  bool SyncOwn(std::string_view property) override;
  void SyncOwnAll() override {}
  void Rebuild() override;
  bool OnKey(QKeyEvent& event) override;
  bool OnMousePress(QMouseEvent& event, QWidget& target) override;
  bool OnMouseRelease(QMouseEvent& event, QWidget& target) override;
  bool OnDoubleClick(QMouseEvent& event, QWidget& target) override;

 private:
  forms::Node* NodeOf(QTreeWidgetItem* row) const;
  QTreeWidgetItem* RowOf(const forms::Node* node) const;
  QTreeWidgetItem* AddRow(forms::Node& node, QTreeWidgetItem* parent);
  void SyncRow(QTreeWidgetItem& row, forms::Node& node);
  void SyncExpanded(QTreeWidgetItem& row, forms::Node& node);
  void SyncSelection();
  void Toggled(QTreeWidgetItem* row);
  // The keyboard's moves: the node to select for a key, or null.
  void Navigate(int keyCode);
  void Select(forms::Node& node);
  std::vector<forms::Node*> VisibleNodes() const;

  forms::TreeView& model_;
  QTreeWidget* tree_;
  std::unordered_map<const forms::Node*, QTreeWidgetItem*> rows_;
  std::unordered_map<std::string, QTreeWidgetItem*> byKey_;
  uint64_t rebuilds_ = 0;
  bool syncing_ = false;
  forms::Node* pressedNode_ = nullptr;
  Qt::MouseButton pressedButton_ = Qt::NoButton;
  bool branchPress_ = false;
};

}  // namespace dvqt
