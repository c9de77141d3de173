// A person's input on the widgets reaches the model as the model's events, in their
// order, and the model's decisions (a swallowed key, a refused focus move) stand.

#include <gmock/gmock.h>

#include <QCheckBox>
#include <QDateEdit>
#include <QKeyEvent>
#include <QLineEdit>
#include <QPushButton>
#include <QToolBar>
#include <QToolButton>
#include <QTreeWidget>

#include "QtTestSupport.h"
#include "qt/DatePickerView.h"

namespace dvqt::testing {
namespace {

using ::testing::ElementsAre;

TEST_F(QtDesktopTest, TypingRaisesKeyDownKeyPressChangeKeyUpInOrder) {
  ShowActive(form);
  auto* text = WidgetOf<QLineEdit>(form.Text1);
  ASSERT_EQ(form.ActiveControl(), &form.Text1);
  QTest::keyClick(text, Qt::Key_A);
  QKeyEvent shifted(QEvent::KeyPress, Qt::Key_A, Qt::ShiftModifier, QStringLiteral("A"));
  QApplication::sendEvent(text, &shifted);
  EXPECT_THAT(form.log, ElementsAre("KeyDown 65 0", "KeyPress 97", "Change a", "KeyUp 65",
                                    "KeyDown 65 1", "KeyPress 65", "Change aA", "KeyUp 65"));
  EXPECT_EQ(text->text(), QStringLiteral("aA"));
  EXPECT_EQ(text->cursorPosition(), 2);

  // The caret moves where the model moves it.
  QTest::keyClick(text, Qt::Key_Left);
  EXPECT_EQ(form.Text1.SelStart(), 1);
  EXPECT_EQ(text->cursorPosition(), 1);
  QTest::keyClick(text, Qt::Key_Backspace);
  EXPECT_EQ(form.Text1.Text(), "A");
  EXPECT_EQ(text->text(), QStringLiteral("A"));
}

TEST_F(QtDesktopTest, FunctionKeysAndTheKeypadReachKeyDownAndASwallowedKeyTypesNothing) {
  ShowActive(form);
  auto* text = WidgetOf<QLineEdit>(form.Text1);
  QTest::keyClick(text, Qt::Key_F2);
  QTest::keyClick(text, Qt::Key_Plus, Qt::KeypadModifier);
  EXPECT_THAT(form.log, ElementsAre("KeyDown 113 0", "KeyUp 113", "KeyDown 107 0", "KeyPress 43",
                                    "Change +", "KeyUp 107"));
  form.log.clear();
  form.swallow = 'X';
  QTest::keyClick(text, Qt::Key_X);
  EXPECT_THAT(form.log, ElementsAre("KeyDown 88 0", "KeyUp 88"));
  EXPECT_EQ(text->text(), QStringLiteral("+"));
}

TEST_F(QtDesktopTest, EachKeyOnADatePickerReachesTheModelOnceInOrder) {
  // The date edit handles keys natively after the model saw them, and passes on those
  // it has no use for (F2): the window must not hand them to the model again.
  forms::DTPicker& picker = form.DTPicker1;
  picker.KeyDown = [this](int& KeyCode, int) { form.log.push_back("KeyDown " + std::to_string(KeyCode)); };
  picker.KeyPress = [this](int& KeyAscii) { form.log.push_back("KeyPress " + std::to_string(KeyAscii)); };
  picker.KeyUp = [this](int& KeyCode, int) { form.log.push_back("KeyUp " + std::to_string(KeyCode)); };
  picker.Change = [this] { form.log.push_back("Change"); };
  ShowActive(form);
  picker.SetFocus();
  auto* edit = WidgetOf<QDateEdit>(picker);
  ASSERT_NE(edit, nullptr);
  ASSERT_TRUE(edit->hasFocus());
  form.log.clear();

  QTest::keyClick(QApplication::focusWidget(), Qt::Key_F2);
  QTest::keyClick(QApplication::focusWidget(), Qt::Key_A);
  Settle();
  EXPECT_THAT(form.log, ElementsAre("KeyDown 113", "KeyUp 113", "KeyDown 65", "KeyPress 97", "KeyUp 65"));

  // A key the date edit acts on changes the model's date between KeyDown and KeyUp.
  form.log.clear();
  const double before = picker.Value().serial;
  QTest::keyClick(QApplication::focusWidget(), Qt::Key_Up);
  Settle();
  EXPECT_THAT(form.log, ElementsAre("KeyDown 38", "Change", "KeyUp 38"));
  EXPECT_NE(picker.Value().serial, before);
  EXPECT_EQ(ToQDate(picker.Value()), edit->date());
}

TEST_F(QtDesktopTest, EnterClicksTheDefaultButton) {
  ShowActive(form);
  QTest::keyClick(WidgetOf(form.Text1), Qt::Key_Return);
  EXPECT_EQ(form.log.back(), "Command1");
}

TEST_F(QtDesktopTest, ARefusedValidationKeepsTheFocusOnTheModelsControl) {
  ShowActive(form);
  auto* text1 = WidgetOf<QLineEdit>(form.Text1);
  auto* text2 = WidgetOf<QLineEdit>(form.Text2);
  ASSERT_TRUE(text1->hasFocus());
  form.refuse = true;

  QTest::keyClick(text1, Qt::Key_Tab);
  Settle();
  EXPECT_EQ(form.ActiveControl(), &form.Text1);
  EXPECT_TRUE(text1->hasFocus());

  QTest::mouseClick(text2, Qt::LeftButton, {}, QPoint(5, 5));
  Settle();
  EXPECT_EQ(form.ActiveControl(), &form.Text1);
  EXPECT_TRUE(text1->hasFocus());
  EXPECT_EQ(std::count(form.log.begin(), form.log.end(), "Validate"), 2);

  form.refuse = false;
  QTest::mouseClick(text2, Qt::LeftButton, {}, QPoint(5, 5));
  Settle();
  EXPECT_EQ(form.ActiveControl(), &form.Text2);
  EXPECT_TRUE(text2->hasFocus());
}

TEST_F(QtDesktopTest, FocusMovedByCodeMovesQtsFocus) {
  ShowActive(form);
  form.Text2.SetFocus();
  EXPECT_TRUE(WidgetOf(form.Text2)->hasFocus());
}

TEST_F(QtDesktopTest, AClickOnACheckBoxTogglesItOnceThroughTheModel) {
  ShowActive(form);
  auto* check = WidgetOf<QCheckBox>(form.Check1);
  QTest::mouseClick(check, Qt::LeftButton, {}, QPoint(8, 8));
  EXPECT_EQ(form.Check1.Value(), forms::vbChecked);
  EXPECT_EQ(check->checkState(), Qt::Checked);
  EXPECT_EQ(form.log.back(), "Check1 1");
  EXPECT_EQ(form.ActiveControl(), &form.Check1);
  // Space on the focused box is the model's too.
  QTest::keyClick(check, Qt::Key_Space);
  EXPECT_EQ(form.Check1.Value(), forms::vbUnchecked);
  EXPECT_EQ(check->checkState(), Qt::Unchecked);
}

TEST_F(QtDesktopTest, AToolbarButtonClickIsTheModelsButtonClickUnlessDisabled) {
  ShowActive(form);
  auto* bar = WidgetOf<QToolBar>(form.Toolbar1);
  auto* save = dynamic_cast<QToolButton*>(bar->widgetForAction(bar->actions().at(0)));
  ASSERT_NE(save, nullptr);
  QTest::mouseClick(save, Qt::LeftButton);
  EXPECT_EQ(form.log.back(), "button gravar");
  form.Toolbar1.Buttons()("gravar").SetEnabled(false);
  form.log.clear();
  QTest::mouseClick(save, Qt::LeftButton);
  EXPECT_TRUE(form.log.empty());
}

TEST_F(QtDesktopTest, ClickingAListItemSelectsItInTheModel) {
  form.ListView1.ListItems().Add("#1", "2211");
  form.ListView1.ListItems().Add("#2", "6221");
  ShowActive(form);
  auto* list = WidgetOf<QTreeWidget>(form.ListView1);
  QRect second = list->visualItemRect(list->topLevelItem(1));
  QTest::mouseClick(list->viewport(), Qt::LeftButton, {}, second.center());
  ASSERT_NE(form.ListView1.SelectedItem(), nullptr);
  EXPECT_EQ(form.ListView1.SelectedItem()->Key(), "#2");
  EXPECT_TRUE(list->topLevelItem(1)->isSelected());
  EXPECT_EQ(form.ActiveControl(), &form.ListView1);
  // Up is the model's move to the item before.
  QTest::keyClick(list, Qt::Key_Up);
  EXPECT_EQ(form.ListView1.SelectedItem()->Key(), "#1");
  EXPECT_TRUE(list->topLevelItem(0)->isSelected());
}

TEST_F(QtDesktopTest, TheTreesKeysMoveThroughTheModelsNodes) {
  forms::NodeList& nodes = form.TreeView1.Nodes();
  nodes.Add("#1", "1");
  nodes.Add("#1", forms::tvwChild, "#11", "11");
  nodes.Add("#2", "2");
  nodes("#1").SetSelected(true);
  ShowActive(form);
  form.TreeView1.SetFocus();
  QWidget* tree = WidgetOf(form.TreeView1);
  QTest::keyClick(tree, Qt::Key_Right);  // opens #1
  EXPECT_TRUE(nodes("#1").Expanded());
  QTest::keyClick(tree, Qt::Key_Down);
  EXPECT_EQ(form.TreeView1.SelectedItem()->Key(), "#11");
  QTest::keyClick(tree, Qt::Key_Left);  // to the parent
  QTest::keyClick(tree, Qt::Key_Minus, Qt::KeypadModifier);
  EXPECT_EQ(form.TreeView1.SelectedItem()->Key(), "#1");
  EXPECT_FALSE(nodes("#1").Expanded());
  EXPECT_FALSE(static_cast<QTreeWidget*>(tree)->topLevelItem(0)->isExpanded());
}

TEST_F(QtDesktopTest, TheCloseBoxAsksTheFormAndARefusalKeepsTheWindow) {
  ShowActive(form);
  form.keepOpen = true;
  Window(form)->close();
  EXPECT_EQ(form.log.back(), "QueryUnload 0");
  ASSERT_NE(Window(form), nullptr);
  EXPECT_TRUE(Window(form)->isVisible());
  form.keepOpen = false;
  Window(form)->close();
  EXPECT_FALSE(form.Loaded());
  EXPECT_EQ(Window(form), nullptr);
}

TEST_F(QtDesktopTest, AHandlerThatUnloadsItsFormFromAClickLeavesNoWindowBehind) {
  ShowActive(form);
  form.unloadOnClick = true;
  QTest::mouseClick(WidgetOf(form.Command1), Qt::LeftButton);
  Settle();
  EXPECT_FALSE(form.Loaded());
  EXPECT_EQ(Window(form), nullptr);
}

TEST_F(QtDesktopTest, ResizingTheWindowResizesTheForm) {
  ShowActive(form);
  FormWindow* window = Window(form);
  window->resize(window->width() + 100, window->height() + 50);
  Settle();
  // 10 twips to the pixel at 144 dpi.
  EXPECT_EQ(form.Width(), 7200 + 1000);
  EXPECT_EQ(form.Height(), 6000 + 500);
}

}  // namespace
}  // namespace dvqt::testing
