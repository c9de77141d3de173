// The tree the finder builds from tbPOC_Contas: where each account hangs, how it looks,
// what stops the build and what the window shows meanwhile and after.

#include <set>

#include "FinderFixture.h"

namespace accounts::testing {
namespace {

std::string ParentCode(const forms::Node& node) {
  return node.Parent() ? node.Parent()->Key().substr(1) : std::string("(raiz)");
}

TEST_F(FinderTest, DemoChartHangsEveryAccountUnderTheNearestShorterCode) {
  OpenDatabase(true);
  OpenFinderFromWindow();

  // What the tree must be, derived from the table on its own.
  auto rs = common::SqlServer()->Execute(
      "SELECT conta_id, codigo, descrit, atribuicao FROM tbPOC_Contas ORDER BY codigo");
  std::set<std::string> seen;
  int32_t rows = 0;
  for (; !rs->Eof(); rs->MoveNext(), ++rows) {
    const std::string codigo = vb::CStr(rs->Fields("codigo").Value());
    SCOPED_TRACE(codigo);
    forms::Node& node = NodeOf(codigo);
    const vb::Variant& descrit = rs->Fields("descrit").Value();
    EXPECT_EQ(node.Text(), codigo + " - " + (descrit.IsNull() ? "" : vb::CStr(descrit)));
    EXPECT_EQ(node.Tag(), vb::Variant(vb::CLng(rs->Fields("conta_id").Value())));

    std::string parent = "(raiz)";
    for (size_t dropped = 1; dropped <= 3 && dropped < codigo.size(); ++dropped) {
      if (seen.count(codigo.substr(0, codigo.size() - dropped))) {
        parent = codigo.substr(0, codigo.size() - dropped);
        break;
      }
    }
    EXPECT_EQ(ParentCode(node), parent);
    const bool top = codigo.size() <= 1;
    EXPECT_EQ(node.Bold(), top);
    const int picture = top ? 1 : vb::CLng(rs->Fields("atribuicao").Value()) == 1 ? 3 : 2;
    EXPECT_EQ(node.Image(), picture);
    EXPECT_EQ(node.SelectedImage(), picture);
    EXPECT_EQ(node.Expanded(), top && !node.Children().empty());
    seen.insert(codigo);
  }
  EXPECT_EQ(Nodes().Count(), rows);

  // A few landmarks a person would look for.
  EXPECT_EQ(ParentCode(NodeOf("2431")), "243");
  EXPECT_EQ(ParentCode(NodeOf("243")), "24");
  // The linked asset and liability accounts are not part of the text.
  EXPECT_EQ(NodeOf("12").Text(), "12 - Depósitos à ordem");
  EXPECT_TRUE(Reports().empty());
}

TEST_F(FinderTest, ParentsAreTriedOneTwoAndThreeCharactersShorter) {
  OpenChart({{"1", "Disponibilidades", 1},
             {"11", "Caixa"},
             {"111", "Caixa A"},
             {"1111", "Caixa A1", 1},
             {"2", "Terceiros"},
             {"21", "Clientes"},
             {"2111", "Clientes c/c", 1},  // 211 missing: under 21
             {"4", "Imobilizações"},
             {"4123", "Edifícios", 1},  // 412 and 41 missing: under 4
             {"7", nullptr}});
  OpenFinderFromWindow();

  EXPECT_EQ(ParentCode(NodeOf("1111")), "111");
  EXPECT_EQ(ParentCode(NodeOf("111")), "11");
  EXPECT_EQ(ParentCode(NodeOf("11")), "1");
  EXPECT_EQ(ParentCode(NodeOf("2111")), "21");
  EXPECT_EQ(ParentCode(NodeOf("4123")), "4");

  // Only classes open up, and only those with something under them.
  EXPECT_TRUE(NodeOf("1").Expanded());
  EXPECT_FALSE(NodeOf("11").Expanded());
  EXPECT_FALSE(NodeOf("111").Expanded());
  EXPECT_TRUE(NodeOf("4").Expanded());
  EXPECT_FALSE(NodeOf("7").Expanded());

  // A class keeps its picture whatever its attribute; below, 1 marks an account that
  // takes postings.
  EXPECT_EQ(NodeOf("1").Image(), 1);
  EXPECT_EQ(NodeOf("11").Image(), 2);
  EXPECT_EQ(NodeOf("1111").Image(), 3);
  EXPECT_EQ(NodeOf("4123").SelectedImage(), 3);
  EXPECT_TRUE(NodeOf("7").Bold());
  EXPECT_FALSE(NodeOf("21").Bold());

  EXPECT_EQ(NodeOf("7").Text(), "7 - ");
  ASSERT_EQ(Nodes().Roots().size(), 4u);
  EXPECT_EQ(Nodes().Roots()[0]->Key(), "#1");
  EXPECT_EQ(Finder().TreeView1.ScrolledTo(), &NodeOf("1"));
  EXPECT_TRUE(Reports().empty());
}

TEST_F(FinderTest, AnAccountWithNoParentWithinThreeCharactersStopsTheBuild) {
  OpenChart({{"1", "Disponibilidades"},
             {"11", "Caixa"},
             {"19999", "Perdida"},  // 1999, 199 and 19 all missing
             {"2", "Terceiros"},
             {"21", "Clientes"}});
  OpenFinderFromWindow();

  // The nodes placed before the stop stay; nothing after it is shown.
  EXPECT_EQ(Nodes().Count(), 2);
  EXPECT_EQ(Nodes().Find("#2"), nullptr);
  // The person sees what there is, and may still pick it.
  EXPECT_TRUE(Finder().Showing());
  EXPECT_TRUE(Finder().TreeView1.Visible());
  EXPECT_FALSE(Finder().ProgressBar1.Visible());
  EXPECT_FALSE(Finder().ProgressBar1_Label.Visible());

  std::vector<nlohmann::json> reports = Reports();
  ASSERT_EQ(reports.size(), 1u);
  EXPECT_EQ(reports[0]["project"], "Cordavel");
  EXPECT_EQ(reports[0]["module"], "frmFindConta");
  EXPECT_EQ(reports[0]["procedure"], "Fill_Tree");
  EXPECT_EQ(reports[0]["message"], "Element not found");
}

TEST_F(FinderTest, ACodeTwiceInTheChartStopsTheBuildAtItsSecondRow) {
  OpenDatabase(false);
  // The demo schema keeps codes unique; a chart kept elsewhere may not.
  common::SqlServer()->Execute("DROP INDEX ixPOC_Contas_codigo");
  for (const char* row : {"('1', 'Disponibilidades')", "('11', 'Caixa')", "('11', 'Caixa bis')",
                          "('12', 'Depósitos à ordem')"})
    common::SqlServer()->Execute(
        std::string("INSERT INTO tbPOC_Contas (codigo, descrit) VALUES ") + row);
  OpenFinderFromWindow();

  EXPECT_EQ(Nodes().Count(), 2);
  EXPECT_EQ(Nodes().Find("#12"), nullptr);
  std::vector<nlohmann::json> reports = Reports();
  ASSERT_EQ(reports.size(), 1u);
  EXPECT_EQ(reports[0]["project"], "Cordavel");
  EXPECT_EQ(reports[0]["procedure"], "Fill_Tree");
}

TEST_F(FinderTest, TheProgressBarRunsOneStepPerAccountAndHidesAtTheEnd) {
  OpenDatabase(true);
  std::vector<double> seen;
  desktop->whileMessagesRun = [&] {
    EXPECT_TRUE(Finder().ProgressBar1.Visible());
    EXPECT_FALSE(Finder().TreeView1.Visible());
    seen.push_back(Finder().ProgressBar1.Value());
  };
  OpenFinderFromWindow();

  const int32_t accounts = Nodes().Count();
  EXPECT_EQ(Finder().ProgressBar1.Max(), accounts);
  EXPECT_EQ(Finder().ProgressBar1.Value(), accounts);
  EXPECT_FALSE(Finder().ProgressBar1.Visible());
  EXPECT_FALSE(Finder().ProgressBar1_Label.Visible());
  EXPECT_TRUE(Finder().TreeView1.Visible());
  // Window messages ran along the way, the bar moving forward between them.
  ASSERT_GE(seen.size(), 2u);
  EXPECT_TRUE(std::is_sorted(seen.begin(), seen.end()));
  EXPECT_LE(seen.size(), 101u);
}

TEST_F(FinderTest, AnEmptyChartShowsAnEmptyTreeWithoutAnError) {
  OpenChart({});
  OpenFinderFromWindow();
  EXPECT_EQ(Nodes().Count(), 0);
  EXPECT_TRUE(Finder().TreeView1.Visible());
  EXPECT_FALSE(Finder().ProgressBar1.Visible());
  EXPECT_TRUE(Reports().empty());
}

TEST_F(FinderTest, AnUnreadableChartIsReportedAndLeavesTheWindowOpen) {
  OpenDatabase(false);
  common::SqlServer()->Execute("DROP VIEW vwPOC_SubContas");
  common::SqlServer()->Execute("DROP TABLE tbPOC_Contas");
  OpenFinderFromWindow();
  EXPECT_TRUE(Finder().Showing());
  EXPECT_TRUE(Finder().TreeView1.Visible());
  std::vector<nlohmann::json> reports = Reports();
  ASSERT_EQ(reports.size(), 1u);
  EXPECT_EQ(reports[0]["project"], "Cordavel");
  EXPECT_EQ(reports[0]["procedure"], "Fill_Tree");
}

}  // namespace
}  // namespace accounts::testing
