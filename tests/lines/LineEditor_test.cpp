// The line editor's lifecycle: the proposed balancing amount, the save's checks and
// statements, the call-backs into the header editor, removal and final entries.

#include "lines/LinesFixture.h"

namespace {

using dvtest::LinesTest;
using forms::KeyboardUser;

struct Totals {
  const char* debitos;
  const char* creditos;
  const char* debit_tag;
  const char* credit_tag;
  const char* credit_text;
};

TEST_F(LinesTest, NewLineProposesTheAmountThatBalancesTheEntry) {
  const Totals cases[] = {
      {"150", "100", "0", "50", "€ 50,00"},  {"100", "130", "30", "0", "€ 0,00"},
      {"75.5", "75.5", "0", "0", "€ 0,00"},  {"0.125", "0", "0", "0,12", "€ 0,12"},
      {"0.135", "0", "0", "0,14", "€ 0,14"}, {nullptr, nullptr, "0", "0", "€ 0,00"},
  };
  for (const Totals& c : cases) {
    SCOPED_TRACE(c.debitos ? c.debitos : "no lines");
    const int32_t entry = NewEntry();
    if (c.debitos) {
      AddLine(entry, c.debitos, "0");
      AddLine(entry, "0", c.creditos);
    }
    auto editor = InsertLine(entry);
    ASSERT_TRUE(editor->Visible());
    EXPECT_EQ(editor->FXDebito.Tag(), c.debit_tag);
    EXPECT_EQ(editor->FXCredito.Tag(), c.credit_tag);
    EXPECT_EQ(editor->FXCredito.Text(), c.credit_text);
    EXPECT_EQ(editor->FXDorvanto_No.Text(), "17");
    editor->Unload();
  }
}

TEST_F(LinesTest, NewLineOfNoEntryUnloadsAtOnce) {
  for (int32_t entry : {0, 999}) {
    auto editor = InsertLine(entry);
    EXPECT_FALSE(editor->Loaded()) << entry;
  }
}

TEST_F(LinesTest, SaveChecksRunInOrderAndWriteNothing) {
  const int32_t entry = NewEntry();
  auto editor = InsertLine(entry);
  KeyboardUser user(*editor);
  const char* kTitle = "Lançamento do Diário";

  auto okAndLastMessage = [&] {
    size_t before = desktop_->messages.size();
    user.Click(editor->Command1);
    EXPECT_EQ(desktop_->messages.size(), before + 1);
    EXPECT_EQ(desktop_->messages.back().Icon(), forms::MsgIcon::Critical);
    EXPECT_EQ(desktop_->messages.back().title, kTitle);
    return desktop_->messages.back().text;
  };

  user.Focus(editor->FXRef);
  EXPECT_EQ(okAndLastMessage(),
            "Tem definir um valor para o campo débito ou crédito, não podem ser os dois iguais a zero.");
  EXPECT_EQ(editor->ActiveControl(), &editor->Command1);  // the focus stays on OK

  editor->FXDebito.SetTag("10");
  editor->FXCredito.SetTag("5");
  EXPECT_EQ(okAndLastMessage(),
            "Tem de definir um valor para um dos campos de débito ou crédito, não pode definir valor nos dois.");
  EXPECT_EQ(editor->ActiveControl(), &editor->FXDebito);

  editor->FXCredito.SetTag("0");
  EXPECT_EQ(okAndLastMessage(), "Tem de indicar a conta para este lançamento.");
  EXPECT_EQ(editor->ActiveControl(), &editor->FXConta);

  int32_t conta = ContaId("11");
  editor->DoFillConta(conta);
  EXPECT_EQ(okAndLastMessage(), "Tem de indicar a subconta deste lançamento.");
  EXPECT_EQ(editor->ActiveControl(), &editor->FXSubconta);

  EXPECT_TRUE(editor->Visible());
  EXPECT_TRUE(StatementsStartingWith("INSERT").empty());
  EXPECT_TRUE(header_->filled.empty());
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

TEST_F(LinesTest, TypedLineIsInsertedThenUpdatedWithTheExactStatements) {
  const int32_t entry = NewEntry();
  const int32_t conta = ContaId("11");
  const int32_t subconta = SubContaId("11001");
  auto editor = InsertLine(entry);
  KeyboardUser user(*editor);

  // The whole line from the keyboard: Enter walks from field to field and, on an
  // amount, saves.
  user.Type("11");
  user.Press(forms::vbKeyReturn);
  EXPECT_EQ(editor->FXSubconta_codigo.Text(), "11");  // started from the account code
  user.Type("001");
  user.Press(forms::vbKeyReturn);
  user.Type("ABT");
  user.Press(forms::vbKeyReturn);
  EXPECT_EQ(editor->FXDescrit.Text(), "Abertura do exercício");
  user.Press(forms::vbKeyReturn);
  user.Type("F'12");
  user.Press(forms::vbKeyReturn);
  user.Type("12,5");
  user.Press(forms::vbKeyReturn);

  EXPECT_FALSE(editor->Loaded());
  const std::string ids = std::to_string(entry) + ", " + std::to_string(conta) + ", " +
                          std::to_string(subconta);
  ASSERT_EQ(StatementsStartingWith("INSERT").size(), 1u);
  EXPECT_EQ(StatementsStartingWith("INSERT")[0],
            "INSERT INTO tbPOC_Dorvantos_Details (dorvanto_id, conta_id, sub_conta_id, codigo, "
            "descrit, ref, debito, credito, iva, iva_tx_id, iva_base_tributavel, iva_apuramento) "
            "VALUES (" + ids + ", 'ABT', 'Abertura do exercício', 'F' + CHAR(39) + '12', 12.5, 0, 0, "
            "Null, Null, Null)");
  const int32_t line = Key("SELECT max(diario_id) FROM tbPOC_Dorvantos_Details");
  EXPECT_EQ(vb::CStr(Scalar("SELECT ref FROM tbPOC_Dorvantos_Details WHERE diario_id = " +
                            std::to_string(line))),
            "F'12");
  EXPECT_EQ(header_->filled, std::vector<int32_t>{line});
  EXPECT_EQ(header_->newLinesAsked, 0);  // the stand-in's totals are equal

  // Opened again, it is updated; VAT ticked with a rate and the settlement mark.
  auto again = NewEditor();
  int32_t key = line;
  again->DoOpen(key);
  KeyboardUser person(*again);
  EXPECT_EQ(again->FXDebito.Text(), "€ 12,50");
  EXPECT_FALSE(again->FXIVA_Tx_ID.Enabled());
  person.Click(again->FXIVA);
  EXPECT_TRUE(again->FXIVA_Tx_ID.Enabled());
  EXPECT_EQ(again->FXIVA_Tx_ID.BackColor(), forms::vbWindowBackground);
  person.Choose(again->FXIVA_Tx_ID, 0);
  person.Click(again->FXIVA_Apuramento);
  person.Click(again->Command1);
  const int32_t rate = again->FXIVA_Tx_ID.ItemData(0);

  ASSERT_EQ(StatementsStartingWith("UPDATE").size(), 1u);
  EXPECT_EQ(StatementsStartingWith("UPDATE")[0],
            "UPDATE tbPOC_Dorvantos_Details SET conta_id = " + std::to_string(conta) +
                ", sub_conta_id = " + std::to_string(subconta) +
                ", codigo = 'ABT', descrit = 'Abertura do exercício', ref = 'F' + CHAR(39) + '12', "
                "debito = 12.5, credito = 0, iva = 1, iva_tx_id = " + std::to_string(rate) +
                ", iva_base_tributavel = null, iva_apuramento = 1 WHERE diario_id = " +
                std::to_string(line));
  EXPECT_EQ(Count("iva = 1 AND iva_apuramento = 1 AND iva_tx_id = " + std::to_string(rate)), 1);

  // Unticked, the VAT columns are written null although the controls still show values.
  auto third = NewEditor();
  third->DoOpen(key);
  KeyboardUser(*third).Click(third->FXIVA);
  EXPECT_FALSE(third->FXIVA_Tx_ID.Enabled());
  EXPECT_EQ(third->FXIVA_Tx_ID.ListIndex(), 0);
  EXPECT_TRUE(third->DoGravar());
  EXPECT_EQ(Count("iva = 0 AND iva_tx_id IS NULL AND iva_apuramento IS NULL"), 1);
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

TEST_F(LinesTest, LineIsBookedToItsSubAccountsOwnAccount) {
  const int32_t entry = NewEntry();
  auto editor = InsertLine(entry);
  int32_t caixa = ContaId("12");
  editor->DoFillConta(caixa);
  int32_t subconta = SubContaId("11002");
  editor->DoFillSubConta(subconta);
  EXPECT_EQ(editor->FXConta_Codigo.Text(), "12");  // a shown account is not replaced here
  editor->FXDebito.SetTag("3");

  ASSERT_TRUE(editor->DoGravar());
  EXPECT_EQ(editor->FXConta_Codigo.Text(), "11");
  EXPECT_EQ(editor->FXConta.Text(), "Caixa");
  EXPECT_EQ(Count("conta_id = " + std::to_string(ContaId("11"))), 1);
  EXPECT_NE(editor->Diario_ID, 0);
}

TEST_F(LinesTest, OkAsksForTheNextLineOnlyWhileTheTotalsDiffer) {
  const int32_t entry = NewEntry();
  for (const char* credit : {"€ 10,00", "€ 0,00"}) {
    header_->debitos->text = "€ 10,00";
    header_->creditos->text = credit;
    header_->newLinesAsked = 0;
    auto editor = InsertLine(entry);
    int32_t subconta = SubContaId("11001");
    editor->DoFillSubConta(subconta);
    editor->FXDebito.SetTag("10");
    editor->FXCredito.SetTag("0");
    KeyboardUser(*editor).Click(editor->Command1);
    EXPECT_FALSE(editor->Loaded());
    ASSERT_FALSE(header_->filled.empty());
    EXPECT_EQ(header_->filled.back(), editor->Diario_ID);
    EXPECT_EQ(header_->newLinesAsked, std::string(credit) == "€ 10,00" ? 0 : 1) << credit;
  }
  // Without a header editor there is nobody to call, and OK still closes.
  auto alone = InsertLine(entry);
  alone->MainClass.reset();
  int32_t subconta = SubContaId("11001");
  alone->DoFillSubConta(subconta);
  alone->FXCredito.SetTag("10");
  alone->Command1_Click();
  EXPECT_FALSE(alone->Loaded());
  EXPECT_EQ(Count("dorvanto_id = " + std::to_string(entry)), 3);
}

TEST_F(LinesTest, CancelWritesNothingAndTellsNobody) {
  const int32_t entry = NewEntry();
  auto editor = InsertLine(entry);
  KeyboardUser user(*editor);
  user.Click(editor->Command1);  // refused: no amount
  user.Click(editor->Command2);
  EXPECT_FALSE(editor->Loaded());
  EXPECT_EQ(editor->Dorvanto_ID, 0);
  EXPECT_TRUE(StatementsStartingWith("INSERT").empty());
  EXPECT_TRUE(header_->filled.empty());
}

// The row and its key come together: a key that cannot be read leaves no row behind,
// so a second OK books the line once.
TEST_F(LinesTest, LostNewKeyLeavesNoRowAndTheRetryInsertsOnce) {
  const int32_t entry = NewEntry();
  auto editor = InsertLine(entry);
  int32_t subconta = SubContaId("11001");
  editor->DoFillSubConta(subconta);
  editor->FXDebito.SetTag("8");

  cancelStatement_ = "SELECT @@Identity as last";
  testing::internal::CaptureStderr();
  EXPECT_FALSE(editor->DoGravar());
  testing::internal::GetCapturedStderr();
  EXPECT_EQ(desktop_->messages.back().text.rfind("Erro: Não foi possível gravar as alterações. ", 0), 0u);
  EXPECT_EQ(desktop_->messages.back().Icon(), forms::MsgIcon::None);
  EXPECT_EQ(Count("dorvanto_id = " + std::to_string(entry)), 0);

  cancelStatement_.clear();
  EXPECT_TRUE(editor->DoGravar());
  EXPECT_EQ(Count("dorvanto_id = " + std::to_string(entry)), 1);
}

TEST_F(LinesTest, RemoveAsksAndDeletesOnlyOnYes) {
  const int32_t entry = NewEntry();
  int32_t line = AddLine(entry, "5", "0");

  auto kept = NewEditor();
  desktop_->QueueAnswer(forms::vbNo);
  EXPECT_FALSE(kept->DoRemove(line));
  const forms::MessageBox& question = desktop_->messages.back();
  EXPECT_EQ(question.text, "Deseja mesmo remover esta linha do lançamento?");
  EXPECT_EQ(question.title, "Remover Lançamento");
  EXPECT_EQ(question.Buttons(), forms::MsgButtons::YesNo);
  EXPECT_EQ(question.Icon(), forms::MsgIcon::Question);
  EXPECT_EQ(Count("diario_id = " + std::to_string(line)), 1);

  auto removed = NewEditor();
  desktop_->QueueAnswer(forms::vbYes);
  EXPECT_TRUE(removed->DoRemove(line));
  EXPECT_EQ(Count("diario_id = " + std::to_string(line)), 0);
  EXPECT_FALSE(removed->Showing());

  const size_t asked = desktop_->messages.size();
  EXPECT_FALSE(NewEditor()->DoRemove(line));  // no row: nothing asked
  EXPECT_EQ(desktop_->messages.size(), asked);
}

TEST_F(LinesTest, LineOfAFinalEntryIsOnlyShown) {
  const int32_t entry = NewEntry(1);
  int32_t line = AddLine(entry, "5", "0", ", conta_id", ", " + std::to_string(ContaId("11")));
  auto editor = NewEditor();
  editor->DoOpen(line);
  ASSERT_TRUE(editor->Visible());
  EXPECT_FALSE(editor->Command1.Visible());
  EXPECT_EQ(editor->Command2.Caption(), "&Fechar");
  EXPECT_TRUE(editor->FXDebito.Locked());
  EXPECT_EQ(editor->FXDebito.BackColor(), forms::vbButtonFace);
  EXPECT_FALSE(editor->FXConta_Find.Buttons()(1).Enabled());
  EXPECT_FALSE(editor->FXIVA.Enabled());
  EXPECT_EQ(editor->FXConta_Codigo.Text(), "11");

  // Enter on the keys that save elsewhere writes nothing here.
  KeyboardUser user(*editor);
  user.Focus(editor->FXDorvanto_No);
  user.Press(forms::vbKeyReturn);
  user.Focus(editor->FXDebito);
  user.Press(forms::vbKeyReturn);
  EXPECT_TRUE(editor->Visible());
  EXPECT_TRUE(StatementsStartingWith("UPDATE").empty());
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

}  // namespace
