#pragma once
// The desktop of real windows: message and input boxes as Qt dialogs, modal forms as
// modal windows with their own event loop, the hourglass as an override cursor, and a
// renderer that keeps one window per loaded form.

#include <memory>
#include <set>

#include "platform/forms/Desktop.h"
#include "qt/Twips.h"

class QWidget;

namespace dvqt {

class Renderer;

class QtDesktop : public forms::Desktop {
 public:
  // The scale defaults to the primary screen's logical dots per inch.
  QtDesktop();
  explicit QtDesktop(TwipsScale scale);
  ~QtDesktop() override;

  int MsgBox(const forms::MessageBox& box) override;
  std::string InputBox(const forms::InputRequest& request) override;
  void DoEvents() override;
  // A non-modal message box (critical icon, one OK) that returns at once.
  void ShowNotice(const std::string& title, const std::string& text) override;

  int32_t ScreenWidth() const override;
  int32_t ScreenHeight() const override;
  void ShowModal(forms::Form& form) override;
  void WaitWhileVisible(forms::Form& form) override;
  void MousePointerChanged(forms::Form& form, int pointer) override;
  void WindowOrderChanged(forms::Form& form, int32_t insertAfter) override;
  forms::Menu* ShowPopupMenu(forms::Form& form, forms::Menu& menu, float x, float y) override;

  Renderer& renderer() const { return *renderer_; }
  // Runs Qt's event loop until no form is on screen: the main loop of a host that has
  // none of its own.
  void RunWhileFormsShow();

 private:
  // The window dialogs belong to: the active form's, else none.
  QWidget* DialogParent() const;
  // The pointer: the hourglass while a form asks for it, the arrow over dialogs.
  void UpdateCursor();
  class ArrowOverDialog;

  std::unique_ptr<Renderer> renderer_;
  std::set<const forms::Form*> hourglass_;
  int dialogs_ = 0;
  bool overridden_ = false;
};

}  // namespace dvqt
