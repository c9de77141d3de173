// A window whose form a person's own action unloads goes only after that action is
// done with it: the view that took the double click or the key still runs after the
// model returns, and must not find its window freed under it (the sanitizers tell).

#include "qt_windows/WindowsFixture.h"

namespace dvqt::windows {
namespace {

forms::FormDesign PickerDesign() {
  using forms::ControlType;
  return {.name = "frmPicker", .caption = "Escolha", .width = 6000, .height = 4800,
          .controls = {
              {.name = "Tree", .type = ControlType::TreeView, .left = 120, .top = 120, .width = 2600,
               .height = 3000},
              {.name = "List", .type = ControlType::ListView, .left = 3000, .top = 120, .width = 2600,
               .height = 3000, .items = {{"", "Código", 1200, forms::lvwColumnLeft}}},
              {.name = "Code", .type = ControlType::TextBox, .left = 120, .top = 3300, .width = 2600,
               .height = 360},
          }};
}

// Every way of choosing closes the window from inside the person's action.
class Picker : public forms::Form {
 public:
  Picker() : Form(PickerDesign()) {
    Tree.DblClick = [this] { Choose("tree"); };
    List.DblClick = [this] { Choose("list"); };
    Code.KeyDown = [this](int& KeyCode, int) {
      if (KeyCode == forms::vbKeyReturn) Choose("code");
    };
  }
  void Fill() {
    forms::Node& parent = Tree.Nodes().Add({}, forms::tvwLast, "#1", "1 - Meios monetários");
    Tree.Nodes().Add("#1", forms::tvwChild, "#11", "11 - Caixa");
    parent.SetExpanded(true);
    List.ListItems().Add("#1", "ABT");
  }
  forms::TreeView& Tree = Ctl<forms::TreeView>("Tree");
  forms::ListView& List = Ctl<forms::ListView>("List");
  forms::TextBox& Code = Ctl<forms::TextBox>("Code");
  std::string chosen;

 private:
  void Choose(const char* how) {
    chosen = how;
    Unload();
  }
};

class Disposal : public WindowsTest {
 protected:
  void ShowPicker() {
    picker_.Show();
    picker_.Fill();
    ASSERT_TRUE(WaitForWindow("frmPicker"));
    Settle();
  }
  template <class W>
  W* Widget(const char* name) {
    return ControlWidget<W>(QStringLiteral("frmPicker"), QString::fromLatin1(name));
  }
  void ExpectClosedBy(const char* how) {
    EXPECT_EQ(picker_.chosen, how);
    EXPECT_FALSE(picker_.Loaded());
    EXPECT_TRUE(QTest::qWaitFor([] { return !WindowNamed(QStringLiteral("frmPicker")); }, kPatienceMs));
    Settle();  // the window is disposed of from the event loop
  }
  Picker picker_;
};

TEST_F(Disposal, ADoubleClickOnATreeNodeThatClosesTheWindow) {
  ShowPicker();
  auto* tree = Widget<QTreeWidget>("Tree");
  ASSERT_NE(tree, nullptr);
  QTreeWidgetItem* child = tree->topLevelItem(0)->child(0);
  ASSERT_NE(child, nullptr);
  DoubleClick(tree->viewport(), tree->visualItemRect(child).center());
  ExpectClosedBy("tree");
}

TEST_F(Disposal, ADoubleClickOnAListItemThatClosesTheWindow) {
  ShowPicker();
  auto* list = Widget<QTreeWidget>("List");
  ASSERT_NE(list, nullptr);
  ASSERT_TRUE(QTest::qWaitFor([&] { return list->topLevelItemCount() == 1; }, kPatienceMs));
  DoubleClick(list->viewport(), list->visualItemRect(list->topLevelItem(0)).center());
  ExpectClosedBy("list");
}

TEST_F(Disposal, AKeyThatClosesTheWindow) {
  ShowPicker();
  auto* code = Widget<QLineEdit>("Code");
  ASSERT_NE(code, nullptr);
  QTest::mouseClick(code, Qt::LeftButton);
  ASSERT_EQ(QApplication::focusWidget(), code);
  Press(Qt::Key_Return);
  ExpectClosedBy("code");
}

}  // namespace
}  // namespace dvqt::windows
