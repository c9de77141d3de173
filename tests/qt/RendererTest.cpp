// The model shown: geometry from twips, and every change of the model in the widgets.

#include <QAction>
#include <QCheckBox>
#include <QComboBox>
#include <QDateEdit>
#include <QGroupBox>
#include <QLabel>
#include <QLineEdit>
#include <QPointer>
#include <QPushButton>
#include <QToolBar>
#include <QTreeWidget>

#include "QtTestSupport.h"

namespace dvqt::testing {
namespace {

TEST_F(QtDesktopTest, ControlsArePlacedFromTwipsAtTheScreensScale) {
  form.Show();
  // 144 dpi: 1440 twips are 144 pixels.
  EXPECT_EQ(WidgetOf(form.Text1)->geometry(), QRect(144, 72, 288, 36));
  // Inside a frame, Left and Top count from the frame's corner.
  EXPECT_EQ(WidgetOf(form.Check1)->parentWidget(), WidgetOf(form.Frame1));
  EXPECT_EQ(WidgetOf(form.Check1)->geometry(), QRect(20, 40, 200, 30));
  // The model's size includes a Windows frame and caption; the client area does not.
  FormWindow* window = Window(form);
  EXPECT_EQ(window->size(), window->ClientSizeFor(7200, 6000));
  EXPECT_EQ(window->size(), QSize(720 - 12, 600 - 12 - 30));
  EXPECT_EQ(window->pos(), QPoint(150, 150));

  form.Text1.Move(0, 0, 1440, 300);
  EXPECT_EQ(WidgetOf(form.Text1)->geometry(), QRect(0, 0, 144, 30));
  form.SetWidth(8640);
  EXPECT_EQ(window->width(), 864 - 12);
}

TEST_F(QtDesktopTest, PropertyChangesShowAtOnce) {
  form.Show();
  auto* text = WidgetOf<QLineEdit>(form.Text1);
  form.Text1.SetText("Março");
  EXPECT_EQ(text->text(), QStringLiteral("Março"));
  form.Text1.SetLocked(true);
  EXPECT_TRUE(text->isReadOnly());
  form.Text1.SetAlignment(forms::vbRightJustify);
  EXPECT_TRUE(text->alignment() & Qt::AlignRight);
  form.Text1.SetFontBold(true);
  EXPECT_TRUE(text->font().bold());

  form.Text2.SetEnabled(false);
  EXPECT_FALSE(WidgetOf(form.Text2)->isEnabled());
  form.Text2.SetVisible(false);
  EXPECT_TRUE(WidgetOf(form.Text2)->isHidden());

  form.Command1.SetCaption("&Gravar");
  EXPECT_EQ(WidgetOf<QPushButton>(form.Command1)->text(), QStringLiteral("&Gravar"));
  EXPECT_TRUE(WidgetOf<QPushButton>(form.Command1)->isDefault());
  form.Frame1.SetCaption("IVA");
  EXPECT_EQ(WidgetOf<QGroupBox>(form.Frame1)->title(), QStringLiteral("IVA"));
  form.Check1.SetValue(forms::vbChecked);
  EXPECT_EQ(WidgetOf<QCheckBox>(form.Check1)->checkState(), Qt::Checked);
  form.SetCaption("Lançamento 12");
  EXPECT_EQ(Window(form)->windowTitle(), QStringLiteral("Lançamento 12"));

  if (auto date = vb::DateSerial(2024, 2, 29)) form.DTPicker1.SetValue(*date);
  EXPECT_EQ(WidgetOf<QDateEdit>(form.DTPicker1)->date(), QDate(2024, 2, 29));
  EXPECT_EQ(WidgetOf<QDateEdit>(form.DTPicker1)->text(), QStringLiteral("29-02-2024"));
}

TEST_F(QtDesktopTest, SystemColoursFollowThePaletteAndPlainOnesAreBgr) {
  form.Show();
  QWidget* text = WidgetOf(form.Text1);
  QColor window = QApplication::palette().color(QPalette::Base);
  QColor face = QApplication::palette().color(QPalette::Button);
  EXPECT_EQ(text->palette().color(QPalette::Base), window);
  form.Text1.SetBackColor(forms::vbButtonFace);
  EXPECT_EQ(text->palette().color(QPalette::Base), face);
  // A locked, disabled field keeps the face it was given.
  form.Text1.SetEnabled(false);
  EXPECT_EQ(text->palette().color(QPalette::Disabled, QPalette::Base), face);
  form.Text1.SetBackColor(0x0000FF);  // &H0000FF is red
  EXPECT_EQ(text->palette().color(QPalette::Base), QColor(255, 0, 0));
}

TEST_F(QtDesktopTest, ListsTreesAndToolbarsFollowTheirCollections) {
  form.Show();
  auto* combo = WidgetOf<QComboBox>(form.Combo1);
  form.Combo1.AddItem("Diário Geral");
  form.Combo1.AddItem("Caixa");
  form.Combo1.SetListIndex(1);
  Settle();
  ASSERT_EQ(combo->count(), 2);
  EXPECT_EQ(combo->itemText(0), QStringLiteral("Diário Geral"));
  EXPECT_EQ(combo->currentIndex(), 1);
  EXPECT_FALSE(combo->isEditable());

  auto* list = WidgetOf<QTreeWidget>(form.ListView1);
  EXPECT_EQ(list->headerItem()->text(1), QStringLiteral("Débito"));
  EXPECT_EQ(list->columnWidth(0), 150);
  forms::ListItem& first = form.ListView1.ListItems().Add("#1", "2211");
  first.SetSubItems(1, "€ 10,00");
  form.ListView1.ListItems().Add("#2", "6221").SetSelected(true);
  Settle();
  ASSERT_EQ(list->topLevelItemCount(), 2);
  EXPECT_EQ(list->topLevelItem(0)->text(1), QStringLiteral("€ 10,00"));
  EXPECT_TRUE(list->topLevelItem(0)->textAlignment(1) & Qt::AlignRight);
  EXPECT_TRUE(list->topLevelItem(1)->isSelected());
  first.SetText("2212");
  first.SetSelected(true);
  EXPECT_EQ(list->topLevelItem(0)->text(0), QStringLiteral("2212"));
  EXPECT_TRUE(list->topLevelItem(0)->isSelected());
  EXPECT_FALSE(list->topLevelItem(1)->isSelected());
  form.ListView1.ListItems().Remove("#1");
  Settle();
  EXPECT_EQ(list->topLevelItemCount(), 1);

  auto* tree = WidgetOf<QTreeWidget>(form.TreeView1);
  forms::NodeList& nodes = form.TreeView1.Nodes();
  nodes.Add("#1", "1 - Disponibilidades");
  nodes.Add("#1", forms::tvwChild, "#11", "11 - Caixa");
  Settle();
  ASSERT_EQ(tree->topLevelItemCount(), 1);
  QTreeWidgetItem* root = tree->topLevelItem(0);
  ASSERT_EQ(root->childCount(), 1);
  EXPECT_EQ(root->child(0)->text(0), QStringLiteral("11 - Caixa"));
  nodes("#1").SetBold(true);
  nodes("#1").SetExpanded(true);
  EXPECT_TRUE(root->font(0).bold());
  EXPECT_TRUE(root->isExpanded());

  auto* bar = WidgetOf<QToolBar>(form.Toolbar1);
  ASSERT_EQ(bar->actions().size(), 2);
  QAction* save = bar->actions().at(0);
  EXPECT_TRUE(save->isEnabled());
  form.Toolbar1.Buttons()("gravar").SetEnabled(false);
  EXPECT_FALSE(save->isEnabled());
  form.Toolbar1.Buttons()("apagar").SetVisible(false);
  EXPECT_FALSE(bar->actions().at(1)->isVisible());
}

// A tree filled while hidden behind a progress bar, the window answering between the
// steps, is built once when it shows, not again at every step.
TEST_F(QtDesktopTest, AHiddenTreeIsBuiltOnceWhenItShows) {
  form.Show();
  auto* tree = WidgetOf<QTreeWidget>(form.TreeView1);
  form.TreeView1.SetVisible(false);
  forms::NodeList& nodes = form.TreeView1.Nodes();
  for (int n = 1; n <= 50; ++n) {
    nodes.Add("#" + std::to_string(n), std::to_string(n));
    Settle();
  }
  EXPECT_EQ(tree->topLevelItemCount(), 0) << "rebuilt while hidden";
  form.TreeView1.SetVisible(true);
  EXPECT_TRUE(tree->isVisible());
  ASSERT_EQ(tree->topLevelItemCount(), 50);
  EXPECT_EQ(tree->topLevelItem(49)->text(0), QStringLiteral("50"));
  nodes("#50").SetText("cinquenta");
  EXPECT_EQ(tree->topLevelItem(49)->text(0), QStringLiteral("cinquenta"));
}

TEST_F(QtDesktopTest, LabelsShowMnemonicsOnlyWithAControlToFocus) {
  form.Show();
  // The label hands its mnemonic to the next control in tab order.
  auto* label = WidgetOf<QLabel>(form.Label1);
  EXPECT_EQ(label->buddy(), WidgetOf(form.Text1));
  EXPECT_EQ(label->text(), QStringLiteral("&Nome:"));
}

TEST_F(QtDesktopTest, AWindowFollowsShowHideAndUnload) {
  form.Show();
  FormWindow* window = Window(form);
  EXPECT_TRUE(window->isVisible());
  form.Hide();
  EXPECT_FALSE(window->isVisible());
  form.Show();
  EXPECT_TRUE(Window(form)->isVisible());
  form.Unload();
  EXPECT_EQ(Window(form), nullptr);
  // Touching the form again loads it again, and it gets a new window.
  form.Text1.SetText("de novo");
  ASSERT_NE(Window(form), nullptr);
  EXPECT_EQ(WidgetOf<QLineEdit>(form.Text1)->text(), QStringLiteral("de novo"));
  EXPECT_FALSE(Window(form)->isVisible());
}

TEST_F(QtDesktopTest, AFormDestroyedWhileShownTakesItsWindowAlong) {
  auto doomed = std::make_unique<SampleForm>();
  ShowActive(*doomed);
  const forms::Form* address = doomed.get();
  QPointer<FormWindow> window = Window(*doomed);
  QPointer<QWidget> text2 = WidgetOf(doomed->Text2);
  ASSERT_TRUE(window && text2);
  // A rebuild still pending when the form goes must not read its list afterwards.
  doomed->ListView1.ListItems().Add("#1", "2211");
  doomed.reset();

  EXPECT_EQ(desktop->renderer().WindowOf(*address), nullptr);
  EXPECT_TRUE(window.isNull() || !window->isVisible());
  // A person's click and key on what is left, and whatever was queued for the window,
  // find nothing freed (the sanitizers tell); the window goes from the event loop.
  if (text2) {
    QTest::mouseClick(text2, Qt::LeftButton, {}, QPoint(5, 5));
    QTest::keyClick(text2, Qt::Key_A);
  }
  if (window) window->repaint();
  Settle();
  EXPECT_TRUE(window.isNull());
}

}  // namespace
}  // namespace dvqt::testing
