#pragma once
// One form on screen: a top-level window with the form's menu bar over its client
// area, one view per control, and the window's own events (close box, resize, move,
// minimise, activation) passed to the model as a person's actions.
//
// Sizes: the model's Width and Height are the outer size of a Windows form, frame and
// caption included, which is what designs were drawn with. The client area here is
// that size less the frame a Windows form has; the window manager draws its own frame
// around it.

#include <QWidget>
#include <memory>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "platform/forms/Form.h"
#include "qt/Twips.h"

class QMenuBar;

namespace dvqt {

class ControlView;
class MenuBar;
class Renderer;

class FormWindow : public QWidget {
 public:
  FormWindow(Renderer& renderer, forms::Form& form);
  ~FormWindow() override;

  forms::Form& form() const { return form_; }
  Renderer& renderer() const { return renderer_; }
  const TwipsScale& scale() const;
  QWidget* client() const { return client_; }
  ControlView* ViewOf(const forms::Control* control) const;

  // Whether the form behind the window is loaded: after its unload the window only
  // waits to be disposed of and ignores all input.
  bool Live() const { return live_; }
  void Retire();

  // Model → window.
  void SyncAll();
  void FormChanged(std::string_view property);
  void ControlChanged(forms::Control& control, std::string_view property);
  void ItemChanged(forms::Control& control, std::string_view key, std::string_view property);
  void ShowForm(bool modal);
  void HideForm();
  void ChangeOrder(int32_t insertAfter);
  // Gives Qt's keyboard focus to the view of the model's focused control.
  void MirrorFocus();
  // A mouse button pressed anywhere in the window: its form becomes the active one.
  void PressedByPerson();

  // The client size in pixels for the model's outer size in twips, and back.
  QSize ClientSizeFor(int32_t width, int32_t height) const;

 protected:
  bool event(QEvent* event) override;
  void closeEvent(QCloseEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;
  void moveEvent(QMoveEvent* event) override;
  void changeEvent(QEvent* event) override;

 private:
  void BuildViews();
  void PlaceInContainers();
  void AssignBuddies();
  void SyncGeometry();
  void SyncWindowState();
  int MenuHeight() const;
  void Input(const std::function<void()>& action);

  Renderer& renderer_;
  forms::Form& form_;
  QWidget* client_;
  std::unique_ptr<MenuBar> menus_;
  std::vector<std::unique_ptr<ControlView>> views_;
  std::unordered_map<const forms::Control*, ControlView*> byControl_;
  bool live_ = true;
  bool syncing_ = false;
  bool placed_ = false;
};

}  // namespace dvqt
