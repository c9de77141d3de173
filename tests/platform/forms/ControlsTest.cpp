#include <gtest/gtest.h>

#include "FormsTestSupport.h"
#include "platform/vb/Error.h"

namespace forms::testing {
namespace {

FormDesign ListsDesign() {
  return {.name = "frmLists",
          .caption = "Listas",
          .controls = {
              {.name = "Toolbar1", .type = ControlType::Toolbar,
               .items = {{"fechar", "&Fechar Janela     "}, {"gravar", "&Gravar                "}}},
              {.name = "ListView1", .type = ControlType::ListView,
               .items = {{"", "Nº Reg.", 800, lvwColumnLeft},
                         {"", "Subconta", 1250, lvwColumnLeft},
                         {"", "Débito", 1400, lvwColumnRight}}},
              {.name = "TreeView1", .type = ControlType::TreeView},
              {.name = "mnFicheiro", .type = ControlType::Menu, .caption = "Ficheiro"},
              {.name = "mnAbrir", .type = ControlType::Menu, .caption = "&Abrir", .container = "mnFicheiro"},
              {.name = "mnBar1", .type = ControlType::Menu, .caption = "-", .container = "mnFicheiro"},
              {.name = "mnRemover", .type = ControlType::Menu, .caption = "&Remover",
               .container = "mnFicheiro", .properties = {{"Enabled", false}}},
          }};
}

class ListsForm : public Form {
 public:
  ListsForm() : Form(ListsDesign()) {
    Toolbar1.ButtonClick = [this](ToolbarButton& b) { log.push_back("button " + b.Key()); };
    ListView1.ItemClick = [this](ListItem& i) { log.push_back("item " + i.Key()); };
    ListView1.MouseUp = [this](int button, int, float x, float y) {
      log.push_back("mouseup " + std::to_string(button));
      if (button == vbRightButton) PopupMenu(mnFicheiro, x, y);
    };
    ListView1.BeforeLabelEdit = [](int& Cancel) { Cancel = 1; };
    mnAbrir.Click = [this] { log.push_back("mnAbrir"); };
    Method("DoFillDorvantos", [this](std::vector<vb::Variant>& args) {
      log.push_back("DoFillDorvantos " + args.at(0).Debug());
      args[0] = vb::Variant(int32_t{0});  // written back to the caller
      return vb::Variant();
    });
  }
  Toolbar& Toolbar1 = Ctl<Toolbar>("Toolbar1");
  ListView& ListView1 = Ctl<ListView>("ListView1");
  TreeView& TreeView1 = Ctl<TreeView>("TreeView1");
  Menu& mnFicheiro = Ctl<Menu>("mnFicheiro");
  Menu& mnAbrir = Ctl<Menu>("mnAbrir");
  std::vector<std::string> log;
};

int32_t ErrorOf(const std::function<void()>& action) {
  try {
    action();
  } catch (const vb::Error& e) {
    return e.Number();
  }
  return 0;
}

TEST_F(FormsTest, TreeNodesAreFoundByKeyAndBadAddsLeaveTheTreeAsItWas) {
  ListsForm form;
  NodeList& nodes = form.TreeView1.Nodes();
  nodes.Add("#1", "1 - Disponibilidades", 1);
  nodes.Add("#1", tvwChild, "#11", "11 - Caixa", 2);
  nodes.Add("#11", tvwChild, "#111", "111 - Caixa A", 3);
  EXPECT_EQ(ErrorOf([&] { nodes.Add("#211", tvwChild, "#2111", "x"); }), 35601);
  EXPECT_EQ(ErrorOf([&] { nodes.Add("#1", tvwChild, "#11", "duplicado"); }), 35602);
  EXPECT_EQ(nodes.Count(), 3);
  EXPECT_EQ(nodes.Find("#2111"), nullptr);
  EXPECT_EQ(nodes("#11").Text(), "11 - Caixa");
  EXPECT_EQ(ErrorOf([&] { nodes("#9"); }), 35601);

  Node& leaf = nodes("#111");
  EXPECT_EQ(leaf.Parent(), &nodes("#11"));
  EXPECT_EQ(nodes("#11").Parent(), &nodes("#1"));
  EXPECT_EQ(nodes("#1").Parent(), nullptr);
  leaf.EnsureVisible();
  EXPECT_TRUE(nodes("#1").Expanded());
  EXPECT_TRUE(nodes("#11").Expanded());
  EXPECT_EQ(form.TreeView1.ScrolledTo(), &leaf);

  // Siblings in the place asked for.
  nodes.Add("#11", tvwPrevious, "#10", "10");
  nodes.Add("#11", tvwNext, "#12", "12");
  const auto& children = nodes("#1").Children();
  ASSERT_EQ(children.size(), 3u);
  EXPECT_EQ(children[0]->Key(), "#10");
  EXPECT_EQ(children[2]->Key(), "#12");

  nodes.Remove("#11");
  EXPECT_EQ(nodes.Find("#111"), nullptr) << "a removed node takes its descendants";
  EXPECT_EQ(nodes.Count(), 3);
  EXPECT_EQ(nodes(3).Key(), "#12");
}

TEST_F(FormsTest, ListItemsByKeyWithSubItemsSelectionAndSorting) {
  ListsForm form;
  ListItemList& items = form.ListView1.ListItems();
  ListItem& first = items.Add("#10", "1", 1);
  first.SetSubItems(1, "2211001");
  first.SetSubItems(2, "€ 150,00");
  items.Add("#11", "2").SetSubItems(2, " ");
  EXPECT_EQ(ErrorOf([&] { items.Add("#10", "outra"); }), 35602);
  EXPECT_EQ(ErrorOf([&] { first.SetSubItems(3, "sem coluna"); }), 380);
  EXPECT_EQ(items("#10").SubItems(2), "€ 150,00");
  EXPECT_EQ(items("#11").SubItems(1), "");
  EXPECT_EQ(form.ListView1.ColumnHeaders()(3).Alignment(), lvwColumnRight);

  items("#10").SetSelected(true);
  items("#11").SetSelected(true);
  EXPECT_FALSE(items("#10").Selected()) << "one selection at a time";
  EXPECT_EQ(form.ListView1.SelectedItem(), &items("#11"));

  items.Remove("#10");
  EXPECT_EQ(items("#11").Index(), 1);
  EXPECT_EQ(ErrorOf([&] { items("#10"); }), 35601);

  items.Add("#12", "b");
  items.Add("#13", "A");
  form.ListView1.SetSortKey(0);
  form.ListView1.SetSorted(true);
  EXPECT_EQ(items(1).Key(), "#11");
  EXPECT_EQ(items(2).Key(), "#13");
  EXPECT_EQ(items(3).Key(), "#12");
  items.Add("#14", "B");
  EXPECT_EQ(items("#14").Index(), 4) << "a sorted list places new items by text";
}

TEST_F(FormsTest, RightClickShowsThePopupMenuAndRunsTheItemChosen) {
  ListsForm form;
  form.Show();
  form.ListView1.ListItems().Add("#1", "1");
  KeyboardUser user(form);
  desktop->QueueMenuChoice("mnAbrir");
  ASSERT_TRUE(user.ClickItem(form.ListView1, "#1", vbRightButton));
  EXPECT_EQ(form.log, (std::vector<std::string>{"item #1", "mouseup 2", "mnAbrir"}));
  ASSERT_EQ(desktop->menus.size(), 1u);
  const auto& seen = desktop->menus[0].items;
  ASSERT_EQ(seen.size(), 3u);
  EXPECT_EQ(seen[1].caption, "-");
  EXPECT_FALSE(seen[2].enabled);

  // A disabled item cannot be chosen.
  desktop->QueueMenuChoice("mnRemover");
  EXPECT_THROW(user.RightClick(form.ListView1), std::logic_error);
}

TEST_F(FormsTest, ToolbarButtonsByKeyClickOnlyWhenEnabled) {
  ListsForm form;
  form.Show();
  KeyboardUser user(form);
  EXPECT_EQ(form.Toolbar1.Buttons()("gravar").Caption(), "&Gravar                ");
  EXPECT_EQ(form.Toolbar1.Buttons()(1).Key(), "fechar");
  EXPECT_EQ(ErrorOf([&] { form.Toolbar1.Buttons()("apagar"); }), 35601);
  form.Toolbar1.Buttons()("gravar").SetEnabled(false);
  EXPECT_FALSE(user.ClickButton(form.Toolbar1, "gravar"));
  EXPECT_TRUE(user.ClickButton(form.Toolbar1, "fechar"));
  EXPECT_EQ(form.log, std::vector<std::string>{"button fechar"});
}

TEST_F(FormsTest, LabelEditingRefusedByBeforeLabelEdit) {
  ListsForm form;
  form.Show();
  form.ListView1.ListItems().Add("#1", "1");
  EXPECT_FALSE(KeyboardUser(form).EditLabel(form.ListView1, "#1"));
  EXPECT_FALSE(form.ListView1.LabelEditing());
}

TEST_F(FormsTest, WindowsReachEachOtherByMemberName) {
  SampleForm other;
  vb::ObjectPtr sample = std::shared_ptr<SampleForm>(&other, [](SampleForm*) {});
  other.Text1.SetText("€ 10,00");
  vb::Variant totals = sample->Get("Text1");
  EXPECT_EQ(totals.AsObject()->Get("text").AsString(), "€ 10,00");
  totals.AsObject()->Let("Text", vb::Variant("€ 0,00"));
  EXPECT_EQ(other.Text1.Text(), "€ 0,00");
  EXPECT_EQ(sample->Call("Label2", {vb::Variant(int32_t{1})}).AsObject()->Get("Caption").AsString(), "um");
  EXPECT_EQ(ErrorOf([&] { sample->Get("NoSuchThing"); }), 438);
  EXPECT_EQ(ErrorOf([&] { totals.AsObject()->Get("Caption"); }), 438);

  ListsForm lists;
  std::vector<vb::Variant> args{vb::Variant(int32_t{42})};
  lists.Invoke("dofilldorvantos", args);
  EXPECT_EQ(lists.log.back(), "DoFillDorvantos " + vb::Variant(int32_t{42}).Debug());
  EXPECT_EQ(args[0], vb::Variant(int32_t{0}));

  // Combo lists late-bound, as the list-filling helpers use them.
  vb::ObjectPtr combo = sample->Get("Combo1").AsObject();
  combo->Call("AddItem", {vb::Variant("Diário")});
  combo->Call("ItemData", {combo->Get("NewIndex"), vb::Variant(int32_t{7})});
  EXPECT_EQ(other.Combo1.ItemData(0), 7);
  EXPECT_EQ(combo->Get("ListCount").AsLong(), 1);
}

TEST_F(FormsTest, ProgressBarRefusesValuesOutsideItsRange) {
  FormDesign design{.name = "frmBar", .controls = {{.name = "ProgressBar1", .type = ControlType::ProgressBar}}};
  Form form(design);
  auto& bar = form.Ctl<ProgressBar>("ProgressBar1");
  bar.SetMax(3);
  bar.SetValue(3);
  EXPECT_EQ(ErrorOf([&] { bar.SetValue(4); }), 380);
  EXPECT_EQ(bar.Value(), 3);
}

}  // namespace
}  // namespace forms::testing
