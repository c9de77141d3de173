#pragma once
// One control of a form on screen: a Qt widget that shows the model's state and passes
// a person's input back to the model as the model's own actions.
//
// The model is the single source of truth. A view never lets its widget change what
// it shows by itself: keys go to the model (Form::KeyStroke), whose handlers may
// swallow them or cancel a focus move, and the model's change notifications bring the
// widget back in line. Where a widget edits natively (a date picker's sections, the
// selection of a text) the model still sees the key first, and the result is written
// into the model at once.

#include <QObject>
#include <QPointer>
#include <QWidget>
#include <functional>
#include <string_view>

#include "platform/forms/Control.h"
#include "qt/Keys.h"
#include "qt/Twips.h"

class QKeyEvent;
class QMouseEvent;

namespace forms {
class Form;
}

namespace dvqt {

class FormWindow;

class ControlView : public QObject {
 public:
  ControlView(FormWindow& window, forms::Control& control, QWidget* widget);
  ~ControlView() override;
  ControlView(const ControlView&) = delete;
  ControlView& operator=(const ControlView&) = delete;

  forms::Control& control() const { return control_; }
  QWidget* widget() const { return widget_; }

  // Mirrors one property of the model (a name as FormListener gives it), or all.
  void Sync(std::string_view property);
  void SyncAll();
  // One item of a collection (list item, node, button, column) changed.
  virtual void SyncItem(std::string_view key, std::string_view property) {}
  // Collections are rebuilt once per burst of changes; this rebuilds a pending one now.
  void Flush();
  // The control this one's mnemonic hands the focus to (labels).
  virtual void SetBuddy(QWidget* buddy) {}

 protected:
  FormWindow& window() const { return window_; }
  forms::Form& form() const;
  const TwipsScale& scale() const;

  // What each kind of control mirrors itself; false when the property is not its own.
  virtual bool SyncOwn(std::string_view property) { return false; }
  virtual void SyncOwnAll() {}
  // Rebuilds a collection marked stale with Defer().
  virtual void Rebuild() {}
  void Defer();
  bool Stale() const { return stale_; }

  // Input. Each returns whether the event was consumed.
  virtual bool OnKey(QKeyEvent& event);
  virtual bool OnMousePress(QMouseEvent& event, QWidget& target);
  virtual bool OnMouseRelease(QMouseEvent& event, QWidget& target);
  virtual bool OnDoubleClick(QMouseEvent& event, QWidget& target);
  // Whether the widget may see a mouse press after the model saw it (caret placement,
  // opening a drop-down); model-driven controls keep their mouse to themselves.
  virtual bool NativeMouse() const { return false; }
  // Takes over into the model what the widget did with a native mouse event.
  virtual void AfterNativeMouse() {}
  // What a completed left click does besides the mouse events.
  virtual void Clicked() { control_.ClickedByUser(); }

  // Runs a person's action on the model through the renderer (errors logged, focus
  // mirrored afterwards).
  void Input(const std::function<void()>& action);
  // The model's focus moves here before a click acts; false when validation refused.
  bool FocusForClick();
  // The keystroke as Form::KeyStroke runs it: Enter, Escape and Tab are the form's.
  void KeyToModel(const Keystroke& stroke);
  // KeyDown and KeyPress on the model, then the widget's own handling of the key,
  // then KeyUp: for widgets that edit natively.
  void KeyThroughWidget(QKeyEvent& event, const Keystroke& stroke,
                        const std::function<void()>& afterWidget = {});
  // Delivers an event to the widget past this view's filter.
  void Forward(QObject& target, QEvent& event);
  // Mouse position in twips within the control.
  float TwipsX(const QPoint& pos, QWidget& target) const;
  float TwipsY(const QPoint& pos, QWidget& target) const;
  // Filters the events of a child widget too (a viewport, an embedded line edit).
  void Watch(QWidget* child);

  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  void SyncGeometry();
  void SyncFont();
  bool OnFocusIn(Qt::FocusReason reason);
  // What eventFilter does with an event; true when the view consumed it.
  bool Filter(QObject* watched, QEvent* event);

  FormWindow& window_;
  forms::Control& control_;
  QPointer<QWidget> widget_;
  bool stale_ = false;
  bool forwarding_ = false;
  bool doubleClicked_ = false;
  Qt::MouseButton pressed_ = Qt::NoButton;
};

int ButtonOf(Qt::MouseButton button);

}  // namespace dvqt
