#pragma once
// The component's own windows on the Qt desktop, installed in this process over a demo
// ledger of their own: the embedded database with the demo chart of accounts, journal
// types and description codes, a private settings file, a logged-in user. Tests work
// the real widgets with QTest's keys and mouse, never the model's handlers.
//
// Widgets are found by the names the renderer gives them: a window is named after its
// form, a control's widget after its control. Keys go to whatever widget holds Qt's
// focus, so every step also proves the focus is where a person would type.
//
// Message boxes and modal windows run their own event loops: what answers them is
// queued before the key or click that opens them, and polls until they show. Every
// wait is bounded; a window that never comes is a failure, not a hang.

#include <gtest/gtest.h>
#include <stdlib.h>

#include <QAbstractButton>
#include <QApplication>
#include <QLineEdit>
#include <QMessageBox>
#include <QTest>
#include <QTimer>
#include <QToolBar>
#include <QTreeWidget>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "common/SqlServer.h"
#include "component/LoginState.h"
#include "entry/HeaderEditor.h"
#include "entry/frmMain.h"
#include "platform/ado/Database.h"
#include "platform/ado/Recordset.h"
#include "platform/forms/Forms.h"
#include "platform/registry/Store.h"
#include "platform/vb/Conversions.h"
#include "qt/QtDesktop.h"

namespace dvqt::windows {

inline constexpr int kPatienceMs = 5000;

// The visible top-level window of a form, by the form's name; null when none shows.
inline QWidget* WindowNamed(const QString& form) {
  for (QWidget* top : QApplication::topLevelWidgets())
    if (top->objectName() == form && top->isVisible()) return top;
  return nullptr;
}

// The widget that renders a control of a form on screen.
template <class W = QWidget>
W* ControlWidget(const QString& form, const QString& control) {
  QWidget* window = WindowNamed(form);
  return window ? window->findChild<W*>(control) : nullptr;
}

inline QString FocusName() {
  QWidget* focus = QApplication::focusWidget();
  return focus ? focus->objectName() : QString();
}

inline QString FocusWindowName() {
  QWidget* focus = QApplication::focusWidget();
  return focus ? focus->window()->objectName() : QString();
}

// Double click as a mouse makes it: press, release, double click, release.
inline void DoubleClick(QWidget* widget, QPoint at) {
  QTest::mousePress(widget, Qt::LeftButton, {}, at);
  QTest::mouseRelease(widget, Qt::LeftButton, {}, at);
  QTest::mouseDClick(widget, Qt::LeftButton, {}, at);
  QTest::mouseRelease(widget, Qt::LeftButton, {}, at);
}

// Runs `act` once `ready` holds, from the event loop that is running then (a modal
// window's or a message box's own). Gives up after kPatienceMs, closing whatever modal
// window is up so the test goes on to fail instead of waiting for ever.
class WhenReady {
 public:
  WhenReady(std::function<bool()> ready, std::function<void()> act)
      : ready_(std::move(ready)), act_(std::move(act)) {
    timer_.setInterval(10);
    QObject::connect(&timer_, &QTimer::timeout, [this] { Poll(); });
    timer_.start();
  }
  bool Done() const { return done_; }
  bool GaveUp() const { return gaveUp_; }

 private:
  void Poll() {
    if (done_) return;
    if (ready_()) {
      done_ = true;
      timer_.stop();
      act_();
      return;
    }
    if (++polls_ * 10 < kPatienceMs) return;
    done_ = gaveUp_ = true;
    timer_.stop();
    if (QWidget* modal = QApplication::activeModalWidget()) modal->close();
  }

  std::function<bool()> ready_;
  std::function<void()> act_;
  QTimer timer_;
  int polls_ = 0;
  bool done_ = false;
  bool gaveUp_ = false;
};

class WindowsTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::string pattern = (std::filesystem::temp_directory_path() / "dv-qtwindows-XXXXXX").string();
    ASSERT_NE(::mkdtemp(pattern.data()), nullptr);
    folder_ = pattern;
    registry::Store::SetDefaultPath((folder_ / "registry.reg").string());
    registry::Store::Default().Update([](registry::Hive& hive) { hive.Create(entry::kPocSettingsKey); });

    const std::string db = (folder_ / "poc.db").string();
    ado::CreateDatabase(db, {{"ana", "segredo"}}, {.demoData = true, .passwordIterations = 10});
    common::SqlServer()->Open(ado::EmbeddedConnectionString(db, "ana", "segredo"));
    component::RecordLoggedUser("ana", "segredo");
    component::SetLoggedIn();

    desktop_ = std::make_shared<QtDesktop>();
    forms::Desktop::Install(desktop_);
    ::testing::internal::CaptureStderr();
  }

  void TearDown() override {
    // A trapped error of a window lands on stderr when no reporter is registered.
    const std::string errors = ::testing::internal::GetCapturedStderr();
    for (const char* window : {"frmMain.", "frmMainDetails.", "frmCodigosDorvanto.", "Cordavel"})
      EXPECT_EQ(errors.find(window), std::string::npos) << errors;
    answers_.clear();
    // A test that stopped half-way leaves windows with questions on closing: each is
    // answered No (or closed), so every form goes and the next test starts clean.
    QTimer dismiss;
    QObject::connect(&dismiss, &QTimer::timeout, [] {
      if (QWidget* popup = QApplication::activePopupWidget()) popup->close();
      auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
      if (!box) return;
      if (QAbstractButton* no = box->button(QMessageBox::No))
        no->click();
      else
        box->close();
    });
    dismiss.start(10);
    // Newest first, one at a time: unloading a form may unload or destroy others.
    for (int left = 20; left > 0 && !forms::LoadedForms().empty(); --left) {
      forms::Form* form = forms::LoadedForms().back();
      form->Hide();
      if (!form->Unload()) ADD_FAILURE() << form->Name() << " refused to unload";
    }
    header_.reset();
    Settle();
    forms::Desktop::Install(nullptr);
    desktop_.reset();
    if (common::SqlServer()->State() == ado::adStateOpen) common::SqlServer()->Close();
    registry::Store::SetDefaultPath("");
    std::error_code ignored;
    std::filesystem::remove_all(folder_, ignored);
  }

  static void Settle() {
    for (int i = 0; i < 5; ++i) QCoreApplication::processEvents();
  }

  // A new entry in a real header editor, as the host's NovoRegisto opens it.
  void OpenNewEntry() {
    header_ = std::dynamic_pointer_cast<entry::frmMain>(entry::NewHeaderEditor());
    ASSERT_TRUE(header_);
    header_->DoInsert();
    ASSERT_TRUE(WaitForWindow("frmMain"));
  }

  // Waits for the form's window to be up and to hold the keyboard focus.
  static ::testing::AssertionResult WaitForWindow(const char* form) {
    const QString name = QString::fromLatin1(form);
    if (QTest::qWaitFor([&] { return WindowNamed(name) && FocusWindowName() == name; }, kPatienceMs))
      return ::testing::AssertionSuccess();
    return ::testing::AssertionFailure() << form << (WindowNamed(name) ? " shows" : " does not show")
                                         << "; the focus is on " << FocusWindowName().toStdString() << "."
                                         << FocusName().toStdString();
  }

  // Waits for Qt's focus to be on a control of a form; false (and a message) otherwise.
  static ::testing::AssertionResult FocusOn(const char* form, const char* control) {
    const QString window = QString::fromLatin1(form), name = QString::fromLatin1(control);
    if (QTest::qWaitFor([&] { return FocusWindowName() == window && FocusName() == name; }, kPatienceMs))
      return ::testing::AssertionSuccess();
    return ::testing::AssertionFailure() << "focus on " << FocusWindowName().toStdString() << "."
                                         << FocusName().toStdString() << ", not " << form << "."
                                         << control;
  }

  // Types into whatever widget has the focus, as a keyboard does; a letter beyond ASCII
  // comes as a key the layout has no code for, with its text.
  static void Type(const char* text) {
    for (QChar c : QString::fromUtf8(text)) {
      if (c.unicode() < 128)
        QTest::keyClick(QApplication::focusWidget(), c.toLatin1());
      else
        QTest::sendKeyEvent(QTest::Click, QApplication::focusWidget(), Qt::Key_unknown, QString(c), {});
    }
  }
  static void Press(Qt::Key key, Qt::KeyboardModifiers modifiers = {}) {
    QTest::keyClick(QApplication::focusWidget(), key, modifiers);
  }

  static QString ShownText(const char* form, const char* control) {
    auto* edit = ControlWidget<QLineEdit>(QString::fromLatin1(form), QString::fromLatin1(control));
    return edit ? edit->text() : QStringLiteral("<no such field>");
  }

  // Clicks the button of a toolbar that stands for the model's button `key`.
  static void ClickToolbarButton(const char* form, const char* toolbar, const char* key) {
    auto* bar = ControlWidget<QToolBar>(QString::fromLatin1(form), QString::fromLatin1(toolbar));
    ASSERT_NE(bar, nullptr) << form << "." << toolbar;
    QAction* action = nullptr;
    for (QAction* candidate : bar->actions())
      if (candidate->objectName() == QString::fromLatin1(key)) action = candidate;
    ASSERT_NE(action, nullptr) << key;
    QWidget* button = bar->widgetForAction(action);
    ASSERT_NE(button, nullptr) << key;
    QTest::mouseClick(button, Qt::LeftButton);
  }

  // Answers the next message box with the button of that role, recording its text.
  void AnswerMessageBox(QMessageBox::StandardButton answer = QMessageBox::Ok) {
    answers_.push_back(std::make_unique<WhenReady>(
        [] { return qobject_cast<QMessageBox*>(QApplication::activeModalWidget()) != nullptr; },
        [this, answer] {
          auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
          messages_.push_back(box->text().toStdString());
          QAbstractButton* button = box->button(answer);
          if (button)
            QTest::mouseClick(button, Qt::LeftButton);
          else
            box->close();
        }));
  }
  // Runs `act` once the form's window shows, from inside its modal loop.
  void WhenShown(const char* form, std::function<void()> act) {
    const QString name = QString::fromLatin1(form);
    answers_.push_back(std::make_unique<WhenReady>([name] { return WindowNamed(name) != nullptr; },
                                                   std::move(act)));
  }
  // Whether every queued answer ran.
  ::testing::AssertionResult AllAnswered() const {
    for (size_t i = 0; i < answers_.size(); ++i)
      if (!answers_[i]->Done() || answers_[i]->GaveUp())
        return ::testing::AssertionFailure() << "answer " << i << " never found its window";
    return ::testing::AssertionSuccess();
  }

  // ---- the database ----
  static vb::Variant Scalar(const std::string& sql) {
    auto rs = ado::Recordset::Create();
    rs->Open(sql, common::SqlServer());
    vb::Variant value = rs->Eof() ? vb::Variant::Null() : rs->Fields(0).Value();
    rs->Close();
    return value;
  }
  static int32_t Number(const std::string& sql) { return vb::CLng(Scalar(sql)); }

  std::shared_ptr<entry::frmMain> header_;
  std::vector<std::string> messages_;

 private:
  std::vector<std::unique_ptr<WhenReady>> answers_;
  std::shared_ptr<QtDesktop> desktop_;
  std::filesystem::path folder_;
};

}  // namespace dvqt::windows
