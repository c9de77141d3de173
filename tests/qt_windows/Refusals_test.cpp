// A field whose validation refuses keeps Qt's focus in its own line edit, whichever way
// the person tries to leave it, and the refusal is said once per attempt.

#include <algorithm>

#include "qt_windows/WindowsFixture.h"

namespace dvqt::windows {
namespace {

class Refusals : public WindowsTest {
 protected:
  void SetUp() override {
    WindowsTest::SetUp();
    OpenNewEntry();
    // F2 in the date field, where the header editor opens with the focus: one line
    // editor, however the date edit handles the key itself.
    ASSERT_TRUE(FocusOn("frmMain", "FXData"));
    Press(Qt::Key_F2);
    ASSERT_TRUE(WaitForWindow("frmMainDetails"));
    Settle();
    const auto tops = QApplication::topLevelWidgets();
    ASSERT_EQ(std::count_if(tops.begin(), tops.end(),
                            [](QWidget* top) { return top->objectName() == QStringLiteral("frmMainDetails") && top->isVisible(); }),
              1);
    ASSERT_TRUE(FocusOn("frmMainDetails", "FXConta_Codigo"));
    accountCode_ = QApplication::focusWidget();
  }

  // Leaves the account code one way, answering the refusal; true when Qt's focus is
  // still in the very line edit of the account code afterwards.
  bool LeaveRefused(const std::function<void()>& leave) {
    AnswerMessageBox();
    leave();
    Settle();
    return QApplication::focusWidget() == accountCode_;
  }

  QWidget* accountCode_ = nullptr;
};

constexpr const char* kNotANumber = "Tem de indicar um valor numérico para o código da conta.";

TEST_F(Refusals, ARefusedAccountCodeKeepsTheFocusWhicheverWayItIsLeft) {
  Type("1x");
  EXPECT_TRUE(LeaveRefused([] { Press(Qt::Key_Tab); })) << "Tab: focus on " << FocusName().toStdString();
  EXPECT_TRUE(LeaveRefused([] { Press(Qt::Key_Return); })) << "Enter: focus on " << FocusName().toStdString();
  EXPECT_TRUE(LeaveRefused([] {
    QWidget* other = ControlWidget(QStringLiteral("frmMainDetails"), QStringLiteral("FXRef"));
    QTest::mouseClick(other, Qt::LeftButton);
  })) << "click: focus on " << FocusName().toStdString();
  ASSERT_TRUE(AllAnswered());
  EXPECT_EQ(messages_, std::vector<std::string>(3, kNotANumber));
  EXPECT_EQ(qobject_cast<QLineEdit*>(accountCode_)->text().toStdString(), "1x");

  // Mended, the code lets the focus go, and the account shows.
  Press(Qt::Key_Backspace);
  Press(Qt::Key_Backspace);
  Type("11");
  Press(Qt::Key_Tab);
  EXPECT_TRUE(FocusOn("frmMainDetails", "FXSubconta_codigo"));
  EXPECT_EQ(ShownText("frmMainDetails", "FXConta").toStdString(), "Caixa");
  EXPECT_EQ(messages_.size(), 3u);
}

TEST_F(Refusals, ARefusedSubAccountCodeKeepsTheFocusAndTheAccount) {
  Type("11");
  Press(Qt::Key_Return);
  ASSERT_TRUE(FocusOn("frmMainDetails", "FXSubconta_codigo"));
  QWidget* subAccount = QApplication::focusWidget();
  Type("a");  // after the "11" the field starts with
  AnswerMessageBox();
  Press(Qt::Key_Tab);
  Settle();
  EXPECT_EQ(QApplication::focusWidget(), subAccount) << FocusName().toStdString();
  ASSERT_TRUE(AllAnswered());
  EXPECT_EQ(messages_, std::vector<std::string>{"Tem de indicar um valor numérico para o código da subconta."});
  EXPECT_EQ(ShownText("frmMainDetails", "FXSubconta_codigo").toStdString(), "11a");
  EXPECT_EQ(ShownText("frmMainDetails", "FXConta").toStdString(), "Caixa");
}

}  // namespace
}  // namespace dvqt::windows
