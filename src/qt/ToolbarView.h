#pragma once
// A toolbar as a QToolBar with one button per model button, found by key. A button's
// click is the model's ButtonClick; Enabled, Visible and Caption follow the model.

#include <QAction>
#include <QToolBar>
#include <vector>

#include "platform/forms/Toolbar.h"
#include "qt/ControlView.h"

namespace dvqt {

class ToolbarView : public ControlView {
 public:
  ToolbarView(FormWindow& window, forms::Toolbar& toolbar);

  void SyncItem(std::string_view key, std::string_view property) override;
  // The action standing for a button, by the button's 1-based index.
  QAction* ActionAt(int32_t index) const;

 protected:
  bool SyncOwn(std::string_view property) override;
  void SyncOwnAll() override {}
  void Rebuild() override;

 private:
  void SyncButton(QAction& action, forms::ToolbarButton& button);

  forms::Toolbar& model_;
  QToolBar* bar_;
  std::vector<QAction*> actions_;
};

}  // namespace dvqt
