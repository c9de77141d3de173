// Message and input boxes as Qt dialogs, modal forms with their own loop, the pointer,
// and loading the desktop at run time.

#include <QInputDialog>
#include <QMessageBox>
#include <QPointer>
#include <QPushButton>
#include <QTimer>
#include <cstdlib>

#include "QtTestSupport.h"
#include "platform/forms/DesktopLoader.h"

namespace dvqt::testing {
namespace {

// Acts on the dialog that opens next, from inside its own event loop.
template <class Dialog, class Fn>
void WhenDialogOpens(Fn act) {
  QTimer::singleShot(0, [act] {
    auto* dialog = qobject_cast<Dialog*>(QApplication::activeModalWidget());
    ASSERT_NE(dialog, nullptr);
    act(*dialog);
  });
}

TEST_F(QtDesktopTest, MsgBoxReturnsTheButtonClicked) {
  WhenDialogOpens<QMessageBox>([](QMessageBox& box) {
    EXPECT_EQ(box.windowTitle(), QStringLiteral("Sair"));
    EXPECT_EQ(box.text(), QStringLiteral("Pretende gravar as alterações e sair?"));
    EXPECT_EQ(box.icon(), QMessageBox::Question);
    EXPECT_NE(box.button(QMessageBox::Cancel), nullptr);
    EXPECT_EQ(box.defaultButton(), box.button(QMessageBox::No));
    box.button(QMessageBox::No)->click();
  });
  int answer = forms::MsgBox("Pretende gravar as alterações e sair?",
                             forms::vbYesNoCancel | forms::vbQuestion | forms::vbDefaultButton2, "Sair");
  EXPECT_EQ(answer, forms::vbNo);
}

TEST_F(QtDesktopTest, EscapeOnAMsgBoxIsItsCancelAndASystemModalBoxStaysOnTop) {
  WhenDialogOpens<QMessageBox>([](QMessageBox& box) {
    EXPECT_TRUE(box.windowFlags() & Qt::WindowStaysOnTopHint);
    EXPECT_EQ(box.windowTitle(), QStringLiteral("Sistema de Segurança"));
    QTest::keyClick(&box, Qt::Key_Escape);
  });
  EXPECT_EQ(forms::MsgBox("Período fechado.", forms::vbOKCancel | forms::vbSystemModal, "Sistema de Segurança"),
            forms::vbCancel);
  // Without a title the box takes the application's.
  WhenDialogOpens<QMessageBox>([](QMessageBox& box) {
    EXPECT_EQ(box.windowTitle(), QString::fromStdString(forms::ApplicationTitle()));
    box.button(QMessageBox::Ok)->click();
  });
  EXPECT_EQ(forms::MsgBox("Olá"), forms::vbOK);
}

TEST_F(QtDesktopTest, InputBoxGivesTheTextOrNothingWhenCancelled) {
  WhenDialogOpens<QInputDialog>([](QInputDialog& dialog) {
    EXPECT_EQ(dialog.textValue(), QStringLiteral("1234"));
    dialog.setTextValue(QStringLiteral("segredo"));
    dialog.accept();
  });
  EXPECT_EQ(forms::InputBox("Palavra-passe:", "Desbloquear", "1234"), "segredo");
  WhenDialogOpens<QInputDialog>([](QInputDialog& dialog) { dialog.reject(); });
  EXPECT_EQ(forms::InputBox("Palavra-passe:", "Desbloquear", "1234"), "");
}

TEST_F(QtDesktopTest, AModalFormsLoopReturnsWhenItHidesItself) {
  bool hidden = false;
  QTimer::singleShot(20, [&] {
    EXPECT_TRUE(form.ShownModally());
    EXPECT_EQ(Window(form)->windowModality(), Qt::ApplicationModal);
    form.Hide();
    hidden = true;
  });
  form.Show(forms::vbModal);
  EXPECT_TRUE(hidden);
  EXPECT_FALSE(form.Showing());
  // Shown modeless afterwards, the window is no longer modal.
  form.Show();
  EXPECT_EQ(Window(form)->windowModality(), Qt::NonModal);
}

TEST_F(QtDesktopTest, AModalFormsLoopReturnsWhenItsCloseBoxUnloadsIt) {
  QTimer::singleShot(20, [&] { Window(form)->close(); });
  form.Show(forms::vbModal);
  EXPECT_FALSE(form.Loaded());
  EXPECT_EQ(form.log.back(), "QueryUnload 0");
}

TEST_F(QtDesktopTest, TheHourglassIsAnOverrideCursorWhileAFormAsksForIt) {
  form.Show();
  form.SetMousePointer(forms::vbHourglass);
  ASSERT_NE(QGuiApplication::overrideCursor(), nullptr);
  EXPECT_EQ(QGuiApplication::overrideCursor()->shape(), Qt::WaitCursor);
  form.SetMousePointer(forms::vbDefault);
  EXPECT_EQ(QGuiApplication::overrideCursor(), nullptr);
  // A form unloaded in the middle of long work does not leave the hourglass behind.
  form.SetMousePointer(forms::vbHourglass);
  form.Unload();
  EXPECT_EQ(QGuiApplication::overrideCursor(), nullptr);
}

TEST_F(QtDesktopTest, TopMostWindowsStayOnTop) {
  form.Show();
  forms::SetWindowPos(form, forms::HWND_TOPMOST, 0, 0, 0, 0, forms::SWP_NOMOVE | forms::SWP_NOSIZE);
  EXPECT_TRUE(Window(form)->windowFlags() & Qt::WindowStaysOnTopHint);
  EXPECT_TRUE(Window(form)->isVisible());
  // The header editor goes on top and back on each activation: its native window must
  // stay the one it is, or a modal window it owns is left behind on screen.
  const WId native = Window(form)->winId();
  forms::SetWindowPos(form, forms::HWND_NOTOPMOST, 0, 0, 0, 0, forms::SWP_NOMOVE | forms::SWP_NOSIZE);
  EXPECT_FALSE(Window(form)->windowFlags() & Qt::WindowStaysOnTopHint);
  EXPECT_TRUE(Window(form)->isVisible());
  EXPECT_EQ(Window(form)->winId(), native);
}

TEST_F(QtDesktopTest, TheModelsActiveFormKeepsTheKeyboardUntilAPersonActivatesAnother) {
  // The header editor (form) saves a line: its editor hides, the next one shows, and
  // the window system activates whatever was under the one that hid.
  SampleForm saved, next;
  ShowActive(form);
  ShowActive(saved);
  ASSERT_EQ(forms::ActiveForm(), &saved);
  saved.Hide();
  next.Show();
  saved.Unload();
  EXPECT_TRUE(QTest::qWaitFor([&] { return Window(next)->isActiveWindow(); }, 2000));
  Settle();
  EXPECT_EQ(forms::ActiveForm(), &next);
  EXPECT_TRUE(Window(next)->isActiveWindow());
  EXPECT_EQ(QApplication::focusWidget(), WidgetOf(next.Text1));

  // A person's click in another window makes its form the active one.
  QTest::mouseClick(WidgetOf(form.Text2), Qt::LeftButton, {}, QPoint(5, 5));
  EXPECT_EQ(forms::ActiveForm(), &form);
  EXPECT_TRUE(QTest::qWaitFor([&] { return Window(form)->isActiveWindow(); }, 2000));
  EXPECT_EQ(QApplication::focusWidget(), WidgetOf(form.Text2));

  // So does the window manager's activation, with nothing of ours in flight.
  Settle();
  Window(next)->activateWindow();
  EXPECT_TRUE(QTest::qWaitFor([&] { return forms::ActiveForm() == &next; }, 2000));
  next.Unload();
}

TEST_F(QtDesktopTest, ANoticeReturnsWhileItIsOnScreenAndGoesWhenDismissed) {
  form.Show();
  forms::Desktop::Current().ShowNotice("Ravelport", "Falha na gravação do lançamento");
  // Back here with the box still up: nobody clicked anything.
  QMessageBox* notice = nullptr;
  for (QWidget* widget : QApplication::topLevelWidgets())
    if (widget->objectName() == QStringLiteral("dvNotice") && widget->isVisible())
      notice = qobject_cast<QMessageBox*>(widget);
  ASSERT_NE(notice, nullptr);
  EXPECT_EQ(QApplication::activeModalWidget(), nullptr);
  EXPECT_EQ(notice->icon(), QMessageBox::Critical);
  EXPECT_EQ(notice->windowTitle(), QStringLiteral("Ravelport"));
  EXPECT_EQ(notice->text(), QStringLiteral("Falha na gravação do lançamento"));
  ASSERT_EQ(notice->buttons().size(), 1);

  QPointer<QMessageBox> watched(notice);
  notice->button(QMessageBox::Ok)->click();
  QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
  EXPECT_TRUE(watched.isNull());
}

TEST_F(QtDesktopTest, TheLoaderLeavesAnInstalledDesktopAlone) {
  EXPECT_FALSE(forms::LoadGraphicalDesktop());
  EXPECT_EQ(forms::Desktop::Installed(), desktop);
}

TEST(DesktopLoader, WithoutADisplayNothingIsLoaded) {
  forms::Desktop::Install(nullptr);
  std::string platform = qEnvironmentVariable("QT_QPA_PLATFORM").toStdString();
  for (const char* name : {"DISPLAY", "WAYLAND_DISPLAY", "QT_QPA_PLATFORM"}) unsetenv(name);
  EXPECT_FALSE(forms::LoadGraphicalDesktop());
  EXPECT_EQ(forms::Desktop::Installed(), nullptr);
  setenv("QT_QPA_PLATFORM", platform.c_str(), 1);
}

}  // namespace
}  // namespace dvqt::testing
