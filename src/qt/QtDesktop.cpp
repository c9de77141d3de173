#include "qt/QtDesktop.h"

#include <QApplication>
#include <QEventLoop>
#include <QGuiApplication>
#include <QInputDialog>
#include <QMessageBox>
#include <QPushButton>
#include <QScreen>
#include <array>
#include <utility>

#include "platform/forms/Form.h"
#include "platform/forms/Menu.h"
#include "qt/FormWindow.h"
#include "qt/MenuBar.h"
#include "qt/QtText.h"
#include "qt/Renderer.h"

namespace dvqt {

namespace {

QMessageBox::Icon IconOf(forms::MsgIcon icon) {
  switch (icon) {
    case forms::MsgIcon::Critical: return QMessageBox::Critical;
    case forms::MsgIcon::Question: return QMessageBox::Question;
    case forms::MsgIcon::Exclamation: return QMessageBox::Warning;
    case forms::MsgIcon::Information: return QMessageBox::Information;
    case forms::MsgIcon::None: break;
  }
  return QMessageBox::NoIcon;
}

// Each answer and the platform's button for it (texts as the platform translates them).
constexpr std::array<std::pair<int, QMessageBox::StandardButton>, 7> kButtons{{
    {forms::vbOK, QMessageBox::Ok},
    {forms::vbCancel, QMessageBox::Cancel},
    {forms::vbAbort, QMessageBox::Abort},
    {forms::vbRetry, QMessageBox::Retry},
    {forms::vbIgnore, QMessageBox::Ignore},
    {forms::vbYes, QMessageBox::Yes},
    {forms::vbNo, QMessageBox::No},
}};

QMessageBox::StandardButton ButtonFor(int answer) {
  for (const auto& [code, button] : kButtons)
    if (code == answer) return button;
  return QMessageBox::Ok;
}

// The answer Escape and the close box give: Cancel where there is one; a lone OK.
int EscapeAnswer(const forms::MessageBox& box) {
  if (box.Offers(forms::vbCancel)) return forms::vbCancel;
  if (box.Offers(forms::vbOK)) return forms::vbOK;
  return 0;
}

}  // namespace

class QtDesktop::ArrowOverDialog {
 public:
  explicit ArrowOverDialog(QtDesktop& desktop) : desktop_(desktop) {
    ++desktop_.dialogs_;
    desktop_.UpdateCursor();
  }
  ~ArrowOverDialog() {
    --desktop_.dialogs_;
    desktop_.UpdateCursor();
  }
  ArrowOverDialog(const ArrowOverDialog&) = delete;
  ArrowOverDialog& operator=(const ArrowOverDialog&) = delete;

 private:
  QtDesktop& desktop_;
};

QtDesktop::QtDesktop() : QtDesktop(TwipsScale::OfPrimaryScreen()) {}

QtDesktop::QtDesktop(TwipsScale scale) : renderer_(std::make_unique<Renderer>(scale)) {
  renderer_->onUnloaded = [this](const forms::Form& form) {
    if (hourglass_.erase(&form) > 0) UpdateCursor();
  };
}

QtDesktop::~QtDesktop() {
  if (overridden_) QGuiApplication::restoreOverrideCursor();
}

QWidget* QtDesktop::DialogParent() const {
  forms::Form* active = forms::ActiveForm();
  FormWindow* window = active ? renderer_->WindowOf(*active) : nullptr;
  return window && window->isVisible() ? window : nullptr;
}

int QtDesktop::MsgBox(const forms::MessageBox& box) {
  QMessageBox dialog(IconOf(box.Icon()),
                     ToQ(box.title.empty() ? forms::ApplicationTitle() : box.title),
                     ToQ(box.text), QMessageBox::NoButton, DialogParent());
  dialog.setTextFormat(Qt::PlainText);
  for (const auto& [answer, button] : kButtons)
    if (box.Offers(answer)) dialog.addButton(button);
  dialog.setDefaultButton(ButtonFor(box.DefaultAnswer()));
  int escape = EscapeAnswer(box);
  if (escape != 0) dialog.setEscapeButton(ButtonFor(escape));
  // QMessageBox re-parents itself when its modality is set, which resets its flags: the
  // modality comes first.
  dialog.setWindowModality(Qt::ApplicationModal);
  // A system-modal box (the security refusals) stays above every window.
  if (box.SystemModal()) dialog.setWindowFlag(Qt::WindowStaysOnTopHint, true);
  ArrowOverDialog arrow(*this);
  dialog.exec();
  QAbstractButton* clicked = dialog.clickedButton();
  for (const auto& [answer, button] : kButtons)
    if (clicked && clicked == dialog.button(button)) return answer;
  return escape != 0 ? escape : box.DefaultAnswer();
}

void QtDesktop::ShowNotice(const std::string& title, const std::string& text) {
  // Owned by no window: the notice outlives the form that was on screen when it came,
  // and deletes itself when the person dismisses it. Shown, not executed: whoever
  // called goes on while it is on screen.
  auto* notice = new QMessageBox(QMessageBox::Critical,
                                 ToQ(title.empty() ? forms::ApplicationTitle() : title),
                                 ToQ(text), QMessageBox::Ok);
  notice->setObjectName(QStringLiteral("dvNotice"));
  notice->setTextFormat(Qt::PlainText);
  notice->setAttribute(Qt::WA_DeleteOnClose);
  notice->setWindowModality(Qt::NonModal);
  notice->show();
}

std::string QtDesktop::InputBox(const forms::InputRequest& request) {
  QInputDialog dialog(DialogParent());
  dialog.setWindowTitle(ToQ(request.title.empty() ? forms::ApplicationTitle() : request.title));
  dialog.setLabelText(ToQ(request.prompt));
  dialog.setTextValue(ToQ(request.defaultText));
  dialog.setInputMode(QInputDialog::TextInput);
  ArrowOverDialog arrow(*this);
  if (dialog.exec() != QDialog::Accepted) return {};
  return FromQ(dialog.textValue());
}

void QtDesktop::DoEvents() {
  QCoreApplication::processEvents(QEventLoop::AllEvents);
  QCoreApplication::sendPostedEvents();
}

int32_t QtDesktop::ScreenWidth() const {
  QScreen* screen = QGuiApplication::primaryScreen();
  return screen ? renderer_->scale().TwipsX(screen->geometry().width()) : Desktop::ScreenWidth();
}

int32_t QtDesktop::ScreenHeight() const {
  QScreen* screen = QGuiApplication::primaryScreen();
  return screen ? renderer_->scale().TwipsY(screen->geometry().height()) : Desktop::ScreenHeight();
}

void QtDesktop::ShowModal(forms::Form& form) {
  form.Display(true);
  WaitWhileVisible(form);
}

void QtDesktop::WaitWhileVisible(forms::Form& form) {
  if (!form.Showing()) return;
  QEventLoop loop;
  renderer_->AddWaiter(form, &loop);
  // The renderer quits the loop when the form hides or unloads; anything else that
  // stops it (another loop's quit) just waits again.
  while (IsLoadedForm(&form) && form.Showing()) loop.exec(QEventLoop::AllEvents);
  renderer_->RemoveWaiter(form, &loop);
}

void QtDesktop::MousePointerChanged(forms::Form& form, int pointer) {
  if (pointer == forms::vbHourglass)
    hourglass_.insert(&form);
  else
    hourglass_.erase(&form);
  UpdateCursor();
}

void QtDesktop::UpdateCursor() {
  // Forms unloaded with the hourglass on do not keep it.
  std::erase_if(hourglass_, [](const forms::Form* form) { return !IsLoadedForm(form); });
  bool wanted = dialogs_ > 0 || !hourglass_.empty();
  Qt::CursorShape shape = dialogs_ > 0 ? Qt::ArrowCursor : Qt::WaitCursor;
  if (!wanted) {
    if (overridden_) QGuiApplication::restoreOverrideCursor();
    overridden_ = false;
  } else if (!overridden_) {
    QGuiApplication::setOverrideCursor(QCursor(shape));
    overridden_ = true;
  } else {
    QGuiApplication::changeOverrideCursor(QCursor(shape));
  }
}

void QtDesktop::WindowOrderChanged(forms::Form& form, int32_t insertAfter) {
  if (FormWindow* window = renderer_->WindowOf(form)) window->ChangeOrder(insertAfter);
}

forms::Menu* QtDesktop::ShowPopupMenu(forms::Form& form, forms::Menu& menu, float, float) {
  ArrowOverDialog arrow(*this);
  return ExecPopupMenu(menu, renderer_->WindowOf(form));
}

void QtDesktop::RunWhileFormsShow() {
  auto anyShowing = [] {
    for (forms::Form* form : forms::LoadedForms())
      if (form->Showing()) return true;
    return false;
  };
  while (anyShowing())
    QCoreApplication::processEvents(QEventLoop::AllEvents | QEventLoop::WaitForMoreEvents);
}

}  // namespace dvqt
