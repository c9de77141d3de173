#pragma once
// A text box as a QLineEdit that never edits itself: every key is the model's, which
// types, moves the caret and raises KeyDown, KeyPress and Change; the line edit only
// shows the model's text and selection. The clipboard and extending the selection
// with Shift or the mouse are done here and written into the model.

#include <QLineEdit>

#include "platform/forms/TextBox.h"
#include "qt/ControlView.h"

namespace dvqt {

class TextBoxView : public ControlView {
 public:
  TextBoxView(FormWindow& window, forms::TextBox& box);

 protected:
  bool SyncOwn(std::string_view property) override;
  void SyncOwnAll() override;
  bool OnKey(QKeyEvent& event) override;
  bool NativeMouse() const override { return true; }
  void AfterNativeMouse() override { PushSelection(); }

 private:
  void SyncText();
  void SyncSelection();
  // The selection the line edit shows, written into the model.
  void PushSelection();
  bool ClipboardKey(QKeyEvent& event, const Keystroke& stroke);

  forms::TextBox& box_;
  QLineEdit* edit_;
  bool pushing_ = false;
};

}  // namespace dvqt
