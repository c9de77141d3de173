#include "qt/ControlView.h"

#include <QCoreApplication>
#include <QInputMethodEvent>
#include <QKeyEvent>
#include <QMouseEvent>
#include <QTimer>

#include "platform/forms/Form.h"
#include "platform/forms/KeyboardUser.h"
#include "qt/Colors.h"
#include "qt/FormWindow.h"
#include "qt/Renderer.h"

namespace dvqt {

int ButtonOf(Qt::MouseButton button) {
  switch (button) {
    case Qt::RightButton: return forms::vbRightButton;
    case Qt::MiddleButton: return forms::vbMiddleButton;
    default: return forms::vbLeftButton;
  }
}

namespace {

int ShiftOf(Qt::KeyboardModifiers modifiers) {
  int shift = 0;
  if (modifiers & Qt::ShiftModifier) shift |= forms::vbShiftMask;
  if (modifiers & Qt::ControlModifier) shift |= forms::vbCtrlMask;
  if (modifiers & Qt::AltModifier) shift |= forms::vbAltMask;
  return shift;
}

bool IsFormKey(int keyCode) {
  return keyCode == forms::vbKeyReturn || keyCode == forms::vbKeyEscape ||
         keyCode == forms::vbKeyTab;
}

}  // namespace

ControlView::ControlView(FormWindow& window, forms::Control& control, QWidget* widget)
    : window_(window), control_(control), widget_(widget) {
  widget_->setObjectName(QString::fromStdString(control.Name()));
  widget_->installEventFilter(this);
  // Focus goes where the model says; Qt only proposes it (a click, a mnemonic).
  widget_->setFocusPolicy(control.Focusable() ? Qt::StrongFocus : Qt::NoFocus);
  widget_->setAcceptDrops(false);
}

ControlView::~ControlView() = default;

forms::Form& ControlView::form() const { return window_.form(); }
const TwipsScale& ControlView::scale() const { return window_.scale(); }

void ControlView::Sync(std::string_view property) {
  if (!window_.Live() || !widget_) return;
  if (property == "Left" || property == "Top" || property == "Width" || property == "Height") {
    SyncGeometry();
  } else if (property == "Enabled") {
    widget_->setEnabled(control_.Enabled());
  } else if (property == "Visible") {
    if (control_.Visible()) Flush();
    widget_->setVisible(control_.Visible());
  } else if (property == "BackColor") {
    ApplyBackColor(*widget_, control_.BackColor());
  } else if (property == "FontBold") {
    SyncFont();
  } else {
    SyncOwn(property);
  }
}

void ControlView::SyncAll() {
  if (!window_.Live() || !widget_) return;
  SyncGeometry();
  widget_->setEnabled(control_.Enabled());
  ApplyBackColor(*widget_, control_.BackColor());
  SyncFont();
  SyncOwnAll();
  stale_ = false;
  Rebuild();
  widget_->setVisible(control_.Visible());
}

void ControlView::SyncGeometry() {
  widget_->setGeometry(
      scale().Rect(control_.Left(), control_.Top(), control_.Width(), control_.Height()));
}

void ControlView::SyncFont() {
  QFont font = widget_->font();
  if (font.bold() == control_.FontBold()) return;
  font.setBold(control_.FontBold());
  widget_->setFont(font);
}

void ControlView::Defer() {
  if (stale_) return;
  stale_ = true;
  QTimer::singleShot(0, this, [this] { Flush(); });
}

void ControlView::Flush() {
  if (!stale_ || !window_.Live()) return;
  // A hidden control is rebuilt once, when it shows: a tree filled behind a progress
  // bar would otherwise be rebuilt whole at every step the bar is drawn.
  if (!control_.Visible()) return;
  stale_ = false;
  Rebuild();
}

// ---- input -------------------------------------------------------------------------

void ControlView::Input(const std::function<void()>& action) {
  if (!window_.Live()) return;
  window_.renderer().RunInput(form(), action);
}

bool ControlView::FocusForClick() {
  if (!control_.Focusable()) return true;
  if (form().ActiveControl() == &control_) return true;
  bool moved = false;
  Input([&] { moved = forms::KeyboardUser(form()).Focus(control_); });
  return moved && window_.Live();
}

void ControlView::KeyToModel(const Keystroke& stroke) {
  Input([&] { form().KeyStroke(stroke.keyCode, stroke.shift, stroke.character); });
}

void ControlView::KeyThroughWidget(QKeyEvent& event, const Keystroke& stroke,
                                   const std::function<void()>& afterWidget) {
  if (IsFormKey(stroke.keyCode)) return KeyToModel(stroke);
  Input([&] {
    forms::Form& owner = form();
    uint64_t generation = owner.LoadGeneration();
    auto alive = [&] { return owner.Loaded() && owner.LoadGeneration() == generation; };
    int code = stroke.keyCode;
    control_.KeyDown(code, stroke.shift);
    if (!alive()) return;
    bool typed = code != 0;
    if (typed && stroke.character != 0) {
      int ascii = stroke.character;
      control_.KeyPress(ascii);
      if (!alive()) return;
      typed = ascii != 0;
    }
    if (typed && widget_) {
      Forward(*widget_, event);
      if (afterWidget) afterWidget();
      if (!alive()) return;
    }
    int up = stroke.keyCode;
    control_.KeyUp(up, stroke.shift);
  });
}

void ControlView::Forward(QObject& target, QEvent& event) {
  forwarding_ = true;
  static_cast<QObject&>(target).event(&event);
  forwarding_ = false;
}

float ControlView::TwipsX(const QPoint& pos, QWidget& target) const {
  QPoint at = &target == widget_ ? pos : target.mapTo(widget_, pos);
  return static_cast<float>(scale().TwipsX(at.x()));
}

float ControlView::TwipsY(const QPoint& pos, QWidget& target) const {
  QPoint at = &target == widget_ ? pos : target.mapTo(widget_, pos);
  return static_cast<float>(scale().TwipsY(at.y()));
}

void ControlView::Watch(QWidget* child) {
  if (!child) return;
  child->installEventFilter(this);
  child->setAcceptDrops(false);
}

bool ControlView::OnKey(QKeyEvent& event) {
  if (auto stroke = TranslateKey(event)) KeyToModel(*stroke);
  return true;
}

bool ControlView::OnMousePress(QMouseEvent& event, QWidget& target) {
  doubleClicked_ = false;
  pressed_ = Qt::NoButton;
  window_.PressedByPerson();
  if (!window_.Live()) return true;
  if (!FocusForClick()) return true;
  pressed_ = event.button();
  QPoint pos = event.position().toPoint();
  Input([&] {
    control_.MouseDown(ButtonOf(event.button()), ShiftOf(event.modifiers()), TwipsX(pos, target),
                       TwipsY(pos, target));
  });
  return !NativeMouse() || !window_.Live();
}

bool ControlView::OnMouseRelease(QMouseEvent& event, QWidget& target) {
  if (pressed_ != event.button()) return !NativeMouse();
  pressed_ = Qt::NoButton;
  if (NativeMouse()) {
    Forward(target, event);
    Input([this] { AfterNativeMouse(); });
  }
  QPoint pos = event.position().toPoint();
  bool inside = target.rect().contains(pos);
  bool click = event.button() == Qt::LeftButton && !doubleClicked_ && inside;
  doubleClicked_ = false;
  Input([&] {
    forms::Form& owner = form();
    uint64_t generation = owner.LoadGeneration();
    control_.MouseUp(ButtonOf(event.button()), ShiftOf(event.modifiers()), TwipsX(pos, target),
                     TwipsY(pos, target));
    if (click && owner.Loaded() && owner.LoadGeneration() == generation) Clicked();
  });
  return true;
}

bool ControlView::OnDoubleClick(QMouseEvent& event, QWidget& target) {
  if (!FocusForClick()) return true;
  doubleClicked_ = true;
  pressed_ = event.button();
  if (NativeMouse()) {
    Forward(target, event);
    Input([this] { AfterNativeMouse(); });
  }
  if (event.button() == Qt::LeftButton) Input([&] { control_.DblClick(); });
  return true;
}

bool ControlView::OnFocusIn(Qt::FocusReason reason) {
  if (form().ActiveControl() == &control_) return false;
  // A click moves the model's focus in the press that follows; a mnemonic or Tab that
  // Qt handled itself asks the model now. Either way the model has the last word, and
  // not from inside Qt's focus change.
  bool person = reason == Qt::ShortcutFocusReason || reason == Qt::TabFocusReason ||
                reason == Qt::BacktabFocusReason;
  if (reason == Qt::MouseFocusReason) return false;
  QTimer::singleShot(0, this, [this, person] {
    if (!window_.Live()) return;
    if (person && form().ActiveControl() != &control_)
      Input([&] { forms::KeyboardUser(form()).Focus(control_); });
    else
      window_.MirrorFocus();
  });
  return false;
}

bool ControlView::eventFilter(QObject* watched, QEvent* event) {
  if (forwarding_) return false;
  // An event the view consumed is done with. A widget that saw it natively may have
  // ignored it (a date edit passes on F2, which it has no use for), and Qt hands an
  // ignored key or click on to the parent widgets: the window would give the key to
  // the model a second time, a frame would take the double click as its own.
  bool consumed = Filter(watched, event);
  if (consumed) event->accept();
  return consumed;
}

bool ControlView::Filter(QObject* watched, QEvent* event) {
  auto* target = qobject_cast<QWidget*>(watched);
  if (!target) return false;
  bool live = window_.Live();
  switch (event->type()) {
    case QEvent::ShortcutOverride: {
      // Alt+letter stays a mnemonic; every other key belongs to the control first.
      auto* key = static_cast<QKeyEvent*>(event);
      if (!live || (key->modifiers() & Qt::AltModifier)) return false;
      event->accept();
      return true;
    }
    case QEvent::KeyPress:
      if (!live) return true;
      Flush();
      return OnKey(*static_cast<QKeyEvent*>(event));
    case QEvent::KeyRelease:
      return true;
    case QEvent::InputMethod: {
      // Text composed by an input method arrives as characters no single key typed.
      if (!live) return true;
      const QString text = static_cast<QInputMethodEvent*>(event)->commitString();
      for (char32_t code : text.toUcs4())
        KeyToModel({forms::vbKeyProcessKey, 0, static_cast<int>(code)});
      return true;
    }
    case QEvent::FocusIn:
      if (live) OnFocusIn(static_cast<QFocusEvent*>(event)->reason());
      return false;
    case QEvent::MouseButtonPress:
      if (!live) return true;
      Flush();
      return OnMousePress(*static_cast<QMouseEvent*>(event), *target);
    case QEvent::MouseButtonRelease:
      if (!live) return true;
      return OnMouseRelease(*static_cast<QMouseEvent*>(event), *target);
    case QEvent::MouseButtonDblClick:
      if (!live) return true;
      return OnDoubleClick(*static_cast<QMouseEvent*>(event), *target);
    case QEvent::MouseMove:
      return !NativeMouse();
    case QEvent::ContextMenu:
    case QEvent::DragEnter:
    case QEvent::Drop:
      return true;
    default:
      return false;
  }
}

}  // namespace dvqt
