#pragma once
// A list view in report view as a QTreeWidget without branches: column headers with
// their widths and alignments, one row per item with its sub-items and small icon.
// Selecting, scrolling into view and editing an item's label are the model's; the
// rows are rebuilt once per burst of changes to the items.

#include <QTreeWidget>
#include <cstdint>
#include <string>
#include <unordered_map>

#include "platform/forms/ListView.h"
#include "qt/ControlView.h"

namespace dvqt {

class ReportView : public ControlView {
 public:
  ReportView(FormWindow& window, forms::ListView& list);

  void SyncItem(std::string_view key, std::string_view property) override;

 protected:
  bool SyncOwn(std::string_view property) override;
  void SyncOwnAll() override {}
  void Rebuild() override;
  bool OnMousePress(QMouseEvent& event, QWidget& target) override;
  bool OnMouseRelease(QMouseEvent& event, QWidget& target) override;
  bool OnDoubleClick(QMouseEvent& event, QWidget& target) override;

 private:
  forms::ListItem* ItemOf(QTreeWidgetItem* row) const;
  QTreeWidgetItem* RowOf(const forms::ListItem* item) const;
  QTreeWidgetItem* RowAt(const QPoint& pos, QWidget& target) const;
  void SyncHeader();
  void SyncRow(QTreeWidgetItem& row, forms::ListItem& item);
  void SyncSelection();
  void SyncSortIndicator();
  void SyncLabelEdit();
  void FinishLabelEdit(const QString& text);
  void StartLabelEditLater(forms::ListItem* item);

  forms::ListView& model_;
  QTreeWidget* tree_;
  std::unordered_map<std::string, QTreeWidgetItem*> byKey_;
  uint64_t rebuilds_ = 0;
  bool syncing_ = false;
  // The press on an item waits for the release: the click is one model action.
  forms::ListItem* pressedItem_ = nullptr;
  Qt::MouseButton pressedButton_ = Qt::NoButton;
  bool pressedSelected_ = false;
  uint64_t doubleClicks_ = 0;
  // Label editing: the item asked for, and the row whose editor is open.
  forms::ListItem* editRequested_ = nullptr;
  QTreeWidgetItem* editing_ = nullptr;
  QString editingText_;
};

}  // namespace dvqt
