#include "qt/FormWindow.h"

#include <QCloseEvent>
#include <QGuiApplication>
#include <QKeyEvent>
#include <QScreen>
#include <QWindow>

#include "platform/forms/KeyboardUser.h"
#include "qt/ControlView.h"
#include "qt/MenuBar.h"
#include "qt/QtText.h"
#include "qt/Renderer.h"
#include "qt/ViewFactory.h"

namespace dvqt {

namespace {
// The frame and caption a Windows form has around its client area, which the model's
// Width and Height include.
constexpr int32_t kBorderTwips = 60;
constexpr int32_t kCaptionTwips = 300;
}  // namespace

FormWindow::FormWindow(Renderer& renderer, forms::Form& form)
    : QWidget(nullptr, Qt::Window), renderer_(renderer), form_(form), client_(new QWidget(this)) {
  setObjectName(ToQ(form.Name()));
  client_->setObjectName(QStringLiteral("client"));
  menus_ = std::make_unique<MenuBar>(*this);
  BuildViews();
  SyncAll();
}

FormWindow::~FormWindow() {
  // The views' event filters go before the widgets they watch.
  byControl_.clear();
  views_.clear();
  menus_.reset();
}

const TwipsScale& FormWindow::scale() const { return renderer_.scale(); }

ControlView* FormWindow::ViewOf(const forms::Control* control) const {
  auto found = byControl_.find(control);
  return found == byControl_.end() ? nullptr : found->second;
}

void FormWindow::BuildViews() {
  for (const auto& control : form_.Controls()) {
    if (auto view = CreateView(*this, *control)) {
      byControl_[control.get()] = view.get();
      views_.push_back(std::move(view));
    }
  }
  PlaceInContainers();
  AssignBuddies();
}

void FormWindow::PlaceInContainers() {
  // A control inside a frame is the frame's child: it moves, hides and greys with it,
  // and its Left and Top count from the frame's corner.
  for (const auto& view : views_) {
    const std::string& container = view->control().Container();
    if (container.empty()) continue;
    if (ControlView* holder = ViewOf(form_.FindControl(container)))
      view->widget()->setParent(holder->widget());
  }
}

void FormWindow::AssignBuddies() {
  for (const auto& view : views_) {
    if (view->control().Type() != forms::ControlType::Label) continue;
    int after = view->control().TabIndex();
    ControlView* buddy = nullptr;
    for (const auto& other : views_) {
      forms::Control& candidate = other->control();
      if (!candidate.Focusable() || candidate.TabIndex() <= after) continue;
      if (!buddy || candidate.TabIndex() < buddy->control().TabIndex()) buddy = other.get();
    }
    if (buddy) view->SetBuddy(buddy->widget());
  }
}

// ---- model → window -------------------------------------------------------------------

void FormWindow::Retire() {
  live_ = false;
  hide();
}

void FormWindow::SyncAll() {
  if (!live_) return;
  setWindowTitle(ToQ(form_.Caption()));
  menus_->SyncAll();
  for (const auto& view : views_) view->SyncAll();
  SyncGeometry();
  if (form_.TopMost()) setWindowFlag(Qt::WindowStaysOnTopHint, true);
}

int FormWindow::MenuHeight() const {
  return menus_->Shown() ? menus_->bar()->sizeHint().height() : 0;
}

QSize FormWindow::ClientSizeFor(int32_t width, int32_t height) const {
  QSize outer = scale().Size(std::max(0, width - 2 * kBorderTwips),
                             std::max(0, height - kCaptionTwips - 2 * kBorderTwips));
  return QSize(outer.width(), std::max(0, outer.height() - MenuHeight()));
}

void FormWindow::SyncGeometry() {
  if (!live_ || form_.WindowState() != forms::vbNormal) return;
  syncing_ = true;
  QSize client = ClientSizeFor(form_.Width(), form_.Height());
  resize(client.width(), client.height() + MenuHeight());
  move(scale().X(form_.Left()), scale().Y(form_.Top()));
  syncing_ = false;
}

void FormWindow::SyncWindowState() {
  Qt::WindowStates state = form_.WindowState() == forms::vbMinimized   ? Qt::WindowMinimized
                           : form_.WindowState() == forms::vbMaximized ? Qt::WindowMaximized
                                                                       : Qt::WindowNoState;
  if (windowState() == state) return;
  syncing_ = true;
  setWindowState(state);
  syncing_ = false;
  if (state == Qt::WindowNoState) SyncGeometry();
}

void FormWindow::FormChanged(std::string_view property) {
  if (!live_) return;
  if (property == "Caption") setWindowTitle(ToQ(form_.Caption()));
  else if (property == "Left" || property == "Top" || property == "Width" || property == "Height")
    SyncGeometry();
  else if (property == "WindowState") SyncWindowState();
}

void FormWindow::ControlChanged(forms::Control& control, std::string_view property) {
  if (!live_) return;
  if (menus_->Sync(control, property)) {
    if (property == "Visible") resizeEvent(nullptr);
    return;
  }
  if (ControlView* view = ViewOf(&control)) view->Sync(property);
}

void FormWindow::ItemChanged(forms::Control& control, std::string_view key,
                             std::string_view property) {
  if (!live_) return;
  if (ControlView* view = ViewOf(&control)) view->SyncItem(key, property);
}

void FormWindow::ShowForm(bool modal) {
  if (!live_) return;
  if (!placed_) {
    placed_ = true;
    // A form designed at the screen's corner opens in the middle of its owner or of
    // the screen instead, as a Windows form placed by the system would; the model
    // learns where it went.
    if (form_.Left() == 0 && form_.Top() == 0) {
      QRect area = QGuiApplication::primaryScreen() ? QGuiApplication::primaryScreen()->availableGeometry()
                                                    : QRect(0, 0, 1024, 768);
      if (FormWindow* owner = form_.Owner() ? renderer_.WindowOf(*form_.Owner()) : nullptr)
        if (owner->isVisible()) area = owner->frameGeometry();
      QSize outer = scale().Size(form_.Width(), form_.Height());
      QPoint corner = area.center() - QPoint(outer.width() / 2, outer.height() / 2);
      corner.setX(std::max(corner.x(), 0));
      corner.setY(std::max(corner.y(), 0));
      Input([&] {
        form_.SetLeft(scale().TwipsX(corner.x()));
        form_.SetTop(scale().TwipsY(corner.y()));
      });
    }
  }
  Qt::WindowModality modality = modal ? Qt::ApplicationModal : Qt::NonModal;
  if (windowModality() != modality) {
    // Qt takes a new modality only while the window is hidden.
    if (isVisible()) hide();
    setWindowModality(modality);
  }
  if (FormWindow* owner = form_.Owner() ? renderer_.WindowOf(*form_.Owner()) : nullptr) {
    winId();
    owner->winId();
    if (windowHandle() && owner->windowHandle())
      windowHandle()->setTransientParent(owner->windowHandle());
  }
  SyncWindowState();
  renderer_.ActivationRequested();
  show();
  raise();
  activateWindow();
  MirrorFocus();
}

void FormWindow::HideForm() {
  hide();
  setWindowModality(Qt::NonModal);
}

void FormWindow::ChangeOrder(int32_t insertAfter) {
  if (!live_) return;
  if (insertAfter == forms::HWND_TOPMOST || insertAfter == forms::HWND_NOTOPMOST) {
    Qt::WindowFlags flags = windowFlags();
    flags.setFlag(Qt::WindowStaysOnTopHint, insertAfter == forms::HWND_TOPMOST);
    if (QWindow* native = windowHandle()) {
      // QWidget::setWindowFlag would re-create the native window. The header editor
      // goes on top and back on each activation, and every re-creation left the old
      // window of a modal line editor mapped and never painted, in front of the new
      // one. The native window takes the flag as it is.
      overrideWindowFlags(flags);
      native->setFlags(flags);
    } else {
      setWindowFlags(flags);
    }
  }
  if (insertAfter == forms::HWND_BOTTOM) {
    lower();
  } else if (isVisible()) {
    renderer_.ActivationRequested();
    raise();
    activateWindow();
  }
}

void FormWindow::MirrorFocus() {
  if (!live_ || !form_.Showing()) return;
  // The model's active form is the one the keyboard works: a window hidden or closed
  // hands the activation on in the model, and Qt's follows it here.
  if (forms::ActiveForm() == &form_ && isVisible() && !isActiveWindow()) {
    renderer_.ActivationRequested();
    activateWindow();
  }
  forms::Control* active = form_.ActiveControl();
  ControlView* view = ViewOf(active);
  QWidget* target = view ? view->widget() : nullptr;
  if (!target) {
    if (focusWidget() && focusWidget() != this) setFocus(Qt::OtherFocusReason);
    return;
  }
  if (focusWidget() != target || !target->hasFocus()) target->setFocus(Qt::OtherFocusReason);
}

// ---- window → model -------------------------------------------------------------------

void FormWindow::Input(const std::function<void()>& action) {
  if (live_) renderer_.RunInput(form_, action);
}

bool FormWindow::event(QEvent* event) {
  if (event->type() == QEvent::ShortcutOverride) {
    auto* key = static_cast<QKeyEvent*>(event);
    if (live_ && !(key->modifiers() & Qt::AltModifier)) {
      event->accept();
      return true;
    }
  } else if (event->type() == QEvent::KeyPress) {
    // A key with no control focused still belongs to the form: Enter and Escape click
    // its default and cancel buttons, Tab finds the first control.
    if (!live_) return true;
    if (auto stroke = TranslateKey(*static_cast<QKeyEvent*>(event)))
      Input([&] { form_.KeyStroke(stroke->keyCode, stroke->shift, stroke->character); });
    return true;
  } else if (event->type() == QEvent::KeyRelease) {
    return true;
  } else if (event->type() == QEvent::MouseButtonPress) {
    PressedByPerson();
  }
  return QWidget::event(event);
}

void FormWindow::closeEvent(QCloseEvent* event) {
  // The close box asks the form (QueryUnload, Unload); the window goes when the model
  // unloads it.
  event->ignore();
  Input([&] { form_.Close(); });
}

void FormWindow::resizeEvent(QResizeEvent*) {
  int menuHeight = MenuHeight();
  menus_->bar()->setGeometry(0, 0, width(), menuHeight);
  client_->setGeometry(0, menuHeight, width(), std::max(0, height() - menuHeight));
  if (syncing_ || !live_ || !isVisible() || form_.WindowState() != forms::vbNormal) return;
  QSize wanted = ClientSizeFor(form_.Width(), form_.Height());
  QSize client(width(), height() - menuHeight);
  if (client == wanted) return;
  // The border dragged: the model's size follows, frame included, and Resize runs.
  int32_t width = scale().TwipsX(client.width()) + 2 * kBorderTwips;
  int32_t height = scale().TwipsY(client.height() + menuHeight) + kCaptionTwips + 2 * kBorderTwips;
  Input([&] { forms::KeyboardUser(form_).Resize(width, height); });
}

void FormWindow::moveEvent(QMoveEvent*) {
  if (syncing_ || !live_ || !isVisible() || form_.WindowState() != forms::vbNormal) return;
  QPoint at = pos();
  if (at == QPoint(scale().X(form_.Left()), scale().Y(form_.Top()))) return;
  Input([&] {
    form_.SetLeft(scale().TwipsX(at.x()));
    form_.SetTop(scale().TwipsY(at.y()));
  });
}

void FormWindow::changeEvent(QEvent* event) {
  QWidget::changeEvent(event);
  if (!live_) return;
  if (event->type() == QEvent::WindowStateChange && !syncing_) {
    int state = (windowState() & Qt::WindowMinimized)   ? forms::vbMinimized
                : (windowState() & Qt::WindowMaximized) ? forms::vbMaximized
                                                        : forms::vbNormal;
    if (form_.Showing() && state != form_.WindowState())
      Input([&] { form_.SetWindowState(state); });
  } else if (event->type() == QEvent::ActivationChange && isActiveWindow() && form_.Showing()) {
    if (renderer_.QtActivated(*this)) Input([&] { form_.Activate(); });
  }
}

void FormWindow::PressedByPerson() {
  // A click is a person's activation of its window even where the window system
  // reports none, or reports it while one of our own requests is in flight.
  if (!live_ || !form_.Showing() || forms::ActiveForm() == &form_) return;
  renderer_.ActivationSettled();
  Input([&] { form_.Activate(); });
}

}  // namespace dvqt
