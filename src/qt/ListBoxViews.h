#pragma once
// Combo boxes and list boxes. Entries are rebuilt once per burst of AddItem calls; the
// choice of an entry, by mouse or keyboard, is the model's (ListIndex, Click).

#include <QComboBox>
#include <QListWidget>

#include "platform/forms/ListControls.h"
#include "qt/ControlView.h"

namespace dvqt {

class ComboBoxView : public ControlView {
 public:
  ComboBoxView(FormWindow& window, forms::ComboBox& combo);

 protected:
  bool SyncOwn(std::string_view property) override;
  void SyncOwnAll() override {}
  void Rebuild() override;
  bool OnKey(QKeyEvent& event) override;
  // The press opens the drop-down, as on Windows.
  bool NativeMouse() const override { return true; }
  // A combo's Click is the choice of an entry, not the press on it.
  void Clicked() override {}

 private:
  void SyncChoice();

  forms::ComboBox& model_;
  QComboBox* combo_;
};

class ListBoxView : public ControlView {
 public:
  ListBoxView(FormWindow& window, forms::ListBox& list);

 protected:
  bool SyncOwn(std::string_view property) override;
  void SyncOwnAll() override {}
  void Rebuild() override;
  bool OnMousePress(QMouseEvent& event, QWidget& target) override;
  // Choosing the entry raised Click already.
  void Clicked() override {}

 private:
  void SyncChoice();

  forms::ListBox& model_;
  QListWidget* list_;
};

}  // namespace dvqt
