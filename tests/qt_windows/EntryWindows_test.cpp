// A whole entry kept by keyboard and mouse in the real windows: the header typed, the
// line editor opened with F2, the account picked in the account tree, a description in
// the description picker, the balancing line proposed and typed, then finalized.

#include <QComboBox>

#include "qt_windows/WindowsFixture.h"

namespace dvqt::windows {
namespace {

class EntryWindows : public WindowsTest {
 protected:
  // The row of the account tree whose text starts with the account's code and " - ".
  static QTreeWidgetItem* AccountRow(QTreeWidget& tree, const char* code) {
    const auto rows = tree.findItems(QString::fromLatin1(code) + QStringLiteral(" - "),
                                     Qt::MatchStartsWith | Qt::MatchRecursive);
    return rows.isEmpty() ? nullptr : rows.first();
  }

  // Keypad plus in the account code opens the tree; a double click on the account
  // picks it and hands the focus to the sub-account code.
  void PickAccountInTree(const char* code) {
    Press(Qt::Key_Plus, Qt::KeypadModifier);
    ASSERT_TRUE(QTest::qWaitFor([] { return WindowNamed(QStringLiteral("frmFindConta")); }, kPatienceMs));
    auto* tree = ControlWidget<QTreeWidget>(QStringLiteral("frmFindConta"), QStringLiteral("TreeView1"));
    ASSERT_NE(tree, nullptr);
    ASSERT_TRUE(QTest::qWaitFor([&] { return tree->isVisible() && AccountRow(*tree, code); }, kPatienceMs));
    QTreeWidgetItem* row = AccountRow(*tree, code);
    tree->scrollToItem(row);
    DoubleClick(tree->viewport(), tree->visualItemRect(row).center());
    ASSERT_TRUE(QTest::qWaitFor([] { return !WindowNamed(QStringLiteral("frmFindConta")); }, kPatienceMs))
        << "the account tree stays open after the double click";
  }

  // Keypad plus in the description code opens the picker, modal; a double click on
  // the code's row chooses it.
  void PickDescription(const char* code) {
    WhenShown("frmCodigosDorvanto", [code] {
      auto* list = ControlWidget<QTreeWidget>(QStringLiteral("frmCodigosDorvanto"), QStringLiteral("ListView1"));
      if (!list) return;
      const auto rows = list->findItems(QString::fromLatin1(code), Qt::MatchExactly, 0);
      if (rows.isEmpty()) return;
      list->scrollToItem(rows.first());
      DoubleClick(list->viewport(), list->visualItemRect(rows.first()).center());
    });
    Press(Qt::Key_Plus, Qt::KeypadModifier);
    ASSERT_TRUE(AllAnswered());
    ASSERT_FALSE(WindowNamed(QStringLiteral("frmCodigosDorvanto"))) << "the picker stays open";
  }
};

TEST_F(EntryWindows, AnEntryTypedThroughItsWindowsIsBalancedFinalizedAndClosed) {
  OpenNewEntry();
  // The header, field after field with Tab.
  ASSERT_TRUE(FocusOn("frmMain", "FXData"));
  Press(Qt::Key_Tab);
  ASSERT_TRUE(FocusOn("frmMain", "FXTipo_Diario_ID"));
  // The journal types come in alphabetical order: the second is "Bancos".
  Press(Qt::Key_Down);
  Press(Qt::Key_Down);
  auto* journal = ControlWidget<QComboBox>(QStringLiteral("frmMain"), QStringLiteral("FXTipo_Diario_ID"));
  ASSERT_NE(journal, nullptr);
  EXPECT_EQ(journal->currentText().toStdString(), "Bancos");
  Press(Qt::Key_Tab);
  ASSERT_TRUE(FocusOn("frmMain", "FXDorvanto_No"));
  Type("D-101");
  Press(Qt::Key_Tab);
  ASSERT_TRUE(FocusOn("frmMain", "FXReferencia"));
  Type("Depósito nº 7");
  Press(Qt::Key_F2);

  // The first line: the account from the tree, the rest of the sub-account code, the
  // description from the picker, a reference and the debit; Enter moves on and, on the
  // amount, saves.
  ASSERT_TRUE(WaitForWindow("frmMainDetails"));
  ASSERT_TRUE(FocusOn("frmMainDetails", "FXConta_Codigo"));
  PickAccountInTree("12");
  ASSERT_TRUE(FocusOn("frmMainDetails", "FXSubconta_codigo"));
  EXPECT_EQ(ShownText("frmMainDetails", "FXConta").toStdString(), "Depósitos à ordem");
  Type("001");
  Press(Qt::Key_Return);
  ASSERT_TRUE(FocusOn("frmMainDetails", "FXDescrit_ID"));
  EXPECT_EQ(ShownText("frmMainDetails", "FXSubconta").toStdString(), "Caixa Geral de Depósitos - c/ 0035 0123");
  PickDescription("DEP");
  ASSERT_TRUE(FocusOn("frmMainDetails", "FXDescrit_ID"));
  EXPECT_EQ(ShownText("frmMainDetails", "FXDescrit").toStdString(), "Depósito em numerário");
  Press(Qt::Key_Return);
  ASSERT_TRUE(FocusOn("frmMainDetails", "FXDescrit"));
  Press(Qt::Key_Return);
  ASSERT_TRUE(FocusOn("frmMainDetails", "FXRef"));
  Type("T-7");
  Press(Qt::Key_Return);
  ASSERT_TRUE(FocusOn("frmMainDetails", "FXDebito"));
  Type("250,5");
  Press(Qt::Key_Return);

  // The entry does not balance: a new line editor proposes the credit that does.
  ASSERT_TRUE(QTest::qWaitFor([] { return ShownText("frmMain", "FXTotal_Debitos") == QStringLiteral("€ 250,50"); },
                              kPatienceMs));
  // The next line editor has the keyboard, whatever the window system did with the
  // activation when the saved line's editor went.
  ASSERT_TRUE(WaitForWindow("frmMainDetails"));
  ASSERT_TRUE(FocusOn("frmMainDetails", "FXConta_Codigo"));
  EXPECT_EQ(ShownText("frmMainDetails", "FXCredito").toStdString(), "€ 250,50");
  Type("11");
  Press(Qt::Key_Return);
  ASSERT_TRUE(FocusOn("frmMainDetails", "FXSubconta_codigo"));
  Type("001");
  Press(Qt::Key_Return);
  ASSERT_TRUE(FocusOn("frmMainDetails", "FXDescrit_ID"));
  Type("DEP");
  Press(Qt::Key_Return);
  ASSERT_TRUE(FocusOn("frmMainDetails", "FXDescrit"));
  EXPECT_EQ(ShownText("frmMainDetails", "FXDescrit").toStdString(), "Depósito em numerário");
  Press(Qt::Key_Return);
  ASSERT_TRUE(FocusOn("frmMainDetails", "FXRef"));
  Press(Qt::Key_Return);
  ASSERT_TRUE(FocusOn("frmMainDetails", "FXDebito"));
  // No debit on this line: Enter on the zero goes on to the proposed credit.
  EXPECT_EQ(ShownText("frmMainDetails", "FXDebito").toStdString(), "0");
  Press(Qt::Key_Return);
  ASSERT_TRUE(FocusOn("frmMainDetails", "FXCredito"));
  Press(Qt::Key_Return);

  // Balanced: no further line editor, and the totals say so.
  ASSERT_TRUE(QTest::qWaitFor([] { return ShownText("frmMain", "FXTotal_Creditos") == QStringLiteral("€ 250,50"); },
                              kPatienceMs));
  ASSERT_TRUE(WaitForWindow("frmMain"));
  EXPECT_EQ(WindowNamed(QStringLiteral("frmMainDetails")), nullptr);
  EXPECT_EQ(ShownText("frmMain", "FXTotal_Debitos").toStdString(), "€ 250,50");
  auto* list = ControlWidget<QTreeWidget>(QStringLiteral("frmMain"), QStringLiteral("ListView1"));
  ASSERT_NE(list, nullptr);
  EXPECT_EQ(list->topLevelItemCount(), 2);

  ClickToolbarButton("frmMain", "Toolbar1", "finalizar");
  EXPECT_EQ(Number("SELECT finalizado FROM tbPOC_Dorvantos"), 1);
  ClickToolbarButton("frmMain", "Toolbar1", "fechar");
  EXPECT_TRUE(QTest::qWaitFor([] { return !WindowNamed(QStringLiteral("frmMain")); }, kPatienceMs));
  EXPECT_TRUE(messages_.empty()) << messages_.front();

  // What the database keeps: the header as typed, both lines numbered in order, the
  // entry's value.
  EXPECT_EQ(vb::CStr(Scalar("SELECT dorvanto_no FROM tbPOC_Dorvantos")), "D-101");
  EXPECT_EQ(vb::CStr(Scalar("SELECT referencia FROM tbPOC_Dorvantos")), "Depósito nº 7");
  EXPECT_EQ(vb::CStr(Scalar("SELECT d.descrit FROM tbPOC_Dorvantos v JOIN tbPOC_Diario_Tipos d "
                            "ON d.tipo_diario_id = v.tipo_diario_id")),
            "Bancos");
  EXPECT_DOUBLE_EQ(vb::CDbl(Scalar("SELECT valor FROM tbPOC_Dorvantos")), 250.5);
  auto rs = ado::Recordset::Create();
  rs->Open("SELECT reg_no, conta, sub_conta_descrit, descrit, ref, debito, credito FROM "
           "tbPOC_Dorvantos_Details ORDER BY diario_id",
           common::SqlServer());
  std::vector<std::string> rows;
  for (; !rs->Eof(); rs->MoveNext()) {
    std::string row;
    for (int32_t i = 0; i < 7; ++i) row += vb::CStr(rs->Fields(i).Value().IsNull() ? vb::Variant("") : rs->Fields(i).Value()) + "|";
    rows.push_back(row);
  }
  rs->Close();
  EXPECT_EQ(rows, (std::vector<std::string>{
                      "1|12|Caixa Geral de Depósitos - c/ 0035 0123|Depósito em numerário|T-7|250,5|0|",
                      "2|11|Caixa - Sede (Lisboa)|Depósito em numerário||0|250,5|",
                  }));
}

}  // namespace
}  // namespace dvqt::windows
