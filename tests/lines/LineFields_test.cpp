// The line editor's fields as a person uses them: account and sub-account codes, the
// amounts, the description code and the description picker.

#include "lines/LinesFixture.h"
#include "lines/frmCodigosDorvanto.h"

namespace {

using dvtest::LinesTest;
using forms::KeyboardUser;

TEST_F(LinesTest, AccountCodeIsCheckedAndLookedUpOnLeaving) {
  auto editor = InsertLine(NewEntry());
  KeyboardUser user(*editor);

  user.TypeInto(editor->FXConta_Codigo, "12a");
  const size_t statementsBefore = statements_.size();
  EXPECT_FALSE(user.Focus(editor->FXDescrit));
  EXPECT_EQ(editor->ActiveControl(), &editor->FXConta_Codigo);
  ASSERT_EQ(desktop_->messages.size(), 1u);
  EXPECT_EQ(desktop_->messages[0].text, "Tem de indicar um valor numérico para o código da conta.");
  EXPECT_EQ(desktop_->messages[0].Icon(), forms::MsgIcon::Information);
  EXPECT_EQ(desktop_->messages[0].title, "Lançamento do Diário");
  EXPECT_EQ(statements_.size(), statementsBefore);  // nothing read

  // Enter with a refused code shows the message once and keeps the focus.
  user.Press(forms::vbKeyReturn);
  EXPECT_EQ(desktop_->messages.size(), 2u);
  EXPECT_EQ(editor->ActiveControl(), &editor->FXConta_Codigo);

  // A known code fills the account and moves on to the sub-account, which starts from
  // the account's code with the caret after it.
  editor->FXConta_Codigo.SetText("221");
  user.Press(forms::vbKeyReturn);
  EXPECT_EQ(editor->FXConta.Text(), "Fornecedores, c/c");
  EXPECT_EQ(editor->FXConta.Tag(), std::to_string(ContaId("221")));
  EXPECT_EQ(editor->ActiveControl(), &editor->FXSubconta_codigo);
  EXPECT_EQ(editor->FXSubconta_codigo.Text(), "221");
  EXPECT_EQ(editor->FXSubconta_codigo.SelStart(), 3);

  // A number that is no account clears the account silently; so does an empty code.
  for (const char* code : {"99999", ""}) {
    user.TypeInto(editor->FXConta_Codigo, "");
    editor->FXConta_Codigo.SetText("221");
    user.Focus(editor->FXRef);
    ASSERT_EQ(editor->FXConta.Tag(), std::to_string(ContaId("221")));
    user.Focus(editor->FXConta_Codigo);
    editor->FXConta_Codigo.SetText(code);
    user.Press(forms::vbKeyReturn);
    EXPECT_EQ(editor->FXConta.Tag(), "") << code;
    EXPECT_EQ(editor->FXConta.Text(), "") << code;
    EXPECT_EQ(editor->FXConta_Codigo.Text(), "") << code;
  }
  EXPECT_EQ(desktop_->messages.size(), 2u);
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

TEST_F(LinesTest, SubAccountCodeIsMatchedAsTextAndBringsItsAccount) {
  auto editor = InsertLine(NewEntry());
  KeyboardUser user(*editor);

  user.TypeInto(editor->FXSubconta_codigo, "11a003");
  user.Press(forms::vbKeyReturn);
  EXPECT_EQ(desktop_->messages.back().text, "Tem de indicar um valor numérico para o código da subconta.");
  EXPECT_EQ(editor->ActiveControl(), &editor->FXSubconta_codigo);

  editor->FXSubconta_codigo.SetText("11003");
  user.Press(forms::vbKeyReturn);
  EXPECT_EQ(editor->FXSubconta.Text(), "Fundo de maneio");
  EXPECT_EQ(editor->FXSubconta.Tag(), std::to_string(SubContaId("11003")));
  // The empty account is filled from the sub-account's own account.
  EXPECT_EQ(editor->FXConta_Codigo.Text(), "11");
  EXPECT_EQ(editor->FXConta.Text(), "Caixa");
  EXPECT_EQ(editor->ActiveControl(), &editor->FXDescrit_ID);

  // Changing the account afterwards leaves the sub-account in place.
  int32_t bancos = ContaId("12");
  editor->DoFillConta(bancos);
  EXPECT_EQ(editor->FXSubconta.Text(), "Fundo de maneio");

  // "011003" looks like the same number but is another text: no sub-account.
  user.Focus(editor->FXSubconta_codigo);
  editor->FXSubconta_codigo.SetText("011003");
  user.Press(forms::vbKeyLeft);
  EXPECT_EQ(editor->FXSubconta.Tag(), "");
  EXPECT_EQ(editor->ActiveControl(), &editor->FXConta_Codigo);
}

TEST_F(LinesTest, TypingInTheDebitZeroesTheCreditAndEnterFollowsTheAmounts) {
  const int32_t entry = NewEntry();
  AddLine(entry, "50", "0");
  auto editor = InsertLine(entry);
  KeyboardUser user(*editor);
  ASSERT_EQ(editor->FXCredito.Tag(), "50");

  // Enter on a debit of 0 goes to the credit, Enter on a credit of 0 back to the account.
  user.Focus(editor->FXDebito);
  EXPECT_EQ(editor->FXDebito.Text(), "0");
  user.Press(forms::vbKeyRight);
  EXPECT_EQ(editor->ActiveControl(), &editor->FXCredito);
  EXPECT_EQ(editor->FXCredito.Tag(), "50");  // arrows and Enter type nothing
  editor->FXCredito.SetText("0");
  user.Press(forms::vbKeyReturn);
  EXPECT_EQ(editor->ActiveControl(), &editor->FXConta_Codigo);

  // Any character typed in the debit, Backspace included, zeroes the credit.
  editor->FXCredito.SetTag("50");
  user.Focus(editor->FXDebito);
  user.Press(forms::vbKeyBack);
  EXPECT_EQ(editor->FXCredito.Tag(), "0");
  EXPECT_EQ(editor->FXCredito.Text(), "€ 0,00");

  // Letters become 0 on leaving; a regional number is kept as the raw value.
  user.Type("abc");
  user.Press(forms::vbKeyLeft);
  EXPECT_EQ(editor->ActiveControl(), &editor->FXRef);
  EXPECT_EQ(editor->FXDebito.Tag(), "0");
  EXPECT_EQ(editor->FXDebito.Text(), "€ 0,00");
  user.TypeInto(editor->FXDebito, "1234,5");
  user.Focus(editor->FXRef);
  EXPECT_EQ(editor->FXDebito.Tag(), "1234,5");
  EXPECT_EQ(editor->FXDebito.Text(), "€ 1.234,50");
}

TEST_F(LinesTest, DescriptionCodeBringsTheFirstMatchingDescription) {
  auto editor = InsertLine(NewEntry());
  KeyboardUser user(*editor);

  user.TypeInto(editor->FXDescrit_ID, "SA");
  user.Press(forms::vbKeyReturn);
  EXPECT_EQ(editor->ActiveControl(), &editor->FXDescrit);
  EXPECT_EQ(editor->FXDescrit.Text(), "Processamento de salários");
  EXPECT_EQ(editor->FXDescrit_ID.Text(), "SA");  // the code stays as typed

  // No match empties the code and keeps the description; a quote breaks nothing.
  for (const char* code : {"ZZZ", "O'K"}) {
    user.TypeInto(editor->FXDescrit_ID, code);
    user.Press(forms::vbKeyRight);
    EXPECT_EQ(editor->FXDescrit_ID.Text(), "") << code;
    EXPECT_EQ(editor->FXDescrit.Text(), "Processamento de salários") << code;
  }
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

TEST_F(LinesTest, PickerCopiesTheChosenDescription) {
  auto editor = InsertLine(NewEntry());
  KeyboardUser user(*editor);
  const std::string salarios =
      "#" + std::to_string(Key("SELECT descrit_id FROM tbPOC_Dorvantos_Codigos WHERE codigo = 'SAL'"));

  struct Way {
    const char* name;
    std::function<void(forms::Form&)> act;
    const char* code;  // "" when nothing is copied
  };
  const Way ways[] = {
      {"double click",
       [&](forms::Form& f) {
         auto& picker = dynamic_cast<lines::frmCodigosDorvanto&>(f);
         KeyboardUser(picker).DoubleClickItem(picker.ListView1, salarios);
       },
       "SAL"},
      {"Enter",
       [&](forms::Form& f) {
         auto& picker = dynamic_cast<lines::frmCodigosDorvanto&>(f);
         KeyboardUser person(picker);
         person.ClickItem(picker.ListView1, salarios);
         person.Press(forms::vbKeyDown);
         person.Press(forms::vbKeyReturn);
       },
       "SEG"},
      {"Cancelar",
       [&](forms::Form& f) {
         auto& picker = dynamic_cast<lines::frmCodigosDorvanto&>(f);
         KeyboardUser(picker).Click(picker.Command1);
       },
       ""},
      {"close box", [&](forms::Form& f) { KeyboardUser(f).CloseWindow(); }, "ABT"},
  };
  for (const Way& way : ways) {
    SCOPED_TRACE(way.name);
    editor->FXDescrit_ID.SetText("");
    editor->FXDescrit.SetText("");
    desktop_->WhenShown("frmCodigosDorvanto", way.act);
    KeyboardUser(*editor).ClickButton(editor->Toolbar1, "procurar");
    EXPECT_EQ(desktop_->modalForms.back(), "frmCodigosDorvanto");
    EXPECT_EQ(editor->FXDescrit_ID.Text(), way.code);
    EXPECT_EQ(editor->FXDescrit.Text().empty(), std::string(way.code).empty());
    EXPECT_EQ(editor->MousePointer(), forms::vbDefault);
  }
  EXPECT_TRUE(desktop_->leftOpen.empty());
  for (forms::Form* form : forms::LoadedForms()) EXPECT_NE(form->Name(), "frmCodigosDorvanto");
}

TEST_F(LinesTest, PickerListsCodesRefusesEditingAndSortsByTheClickedColumn) {
  lines::frmCodigosDorvanto picker;
  picker.Show();
  KeyboardUser person(picker);
  forms::ListItemList& items = picker.ListView1.ListItems();
  ASSERT_GT(items.Count(), 2);
  EXPECT_EQ(items(1).Text(), "ABT");
  EXPECT_EQ(items(1).SubItems(1), "Abertura do exercício");
  EXPECT_TRUE(items(1).Selected());
  EXPECT_FALSE(person.EditLabel(picker.ListView1, items(1).Key()));

  person.ClickColumn(picker.ListView1, 2);  // "Descrição"
  EXPECT_EQ(items(1).SubItems(1), "Abertura do exercício");
  EXPECT_EQ(items(2).SubItems(1), "Amortizações do exercício");
  person.ClickColumn(picker.ListView1, 1);  // "Código"
  EXPECT_EQ(items(2).Text(), "AGU");

  // On screen it only hides when asked to unload; hidden, it unloads.
  EXPECT_FALSE(picker.Unload());
  EXPECT_TRUE(picker.Loaded());
  EXPECT_TRUE(picker.Unload());
}

}  // namespace

namespace {

forms::Form* LoadedForm(const std::string& name) {
  for (forms::Form* form : forms::LoadedForms())
    if (form->Name() == name) return form;
  return nullptr;
}

using dvtest::LinesTest;

TEST_F(LinesTest, AccountFinderHandsItsPickBackAndClosesWithTheEditor) {
  auto editor = InsertLine(NewEntry());
  forms::KeyboardUser(*editor).Focus(editor->FXConta_Codigo);
  forms::KeyboardUser(*editor).Press(forms::vbKeyAdd);
  EXPECT_EQ(editor->FXConta_Codigo.Text(), "");  // the plus is not typed into the code
  forms::Form* finder = LoadedForm("frmFindConta");
  ASSERT_NE(finder, nullptr);
  EXPECT_TRUE(finder->Showing());
  EXPECT_EQ(editor->MousePointer(), forms::vbDefault);

  forms::KeyboardUser(*finder).DoubleClickNode(finder->Ctl<forms::TreeView>("TreeView1"), "#12");
  EXPECT_EQ(editor->FXConta_Codigo.Text(), "12");
  EXPECT_EQ(editor->FXConta.Text(), "Depósitos à ordem");
  EXPECT_EQ(editor->ActiveControl(), &editor->FXSubconta_codigo);

  editor->DoProcurarConta();
  ASSERT_NE(LoadedForm("frmFindConta"), nullptr);
  editor->Command2_Click();
  EXPECT_EQ(LoadedForm("frmFindConta"), nullptr);
}

TEST_F(LinesTest, SearchingAgainReplacesTheOpenFinderAndKeepsTheEditor) {
  auto editor = InsertLine(NewEntry());
  editor->DoProcurarConta();
  forms::Form* first = LoadedForm("frmFindConta");
  ASSERT_NE(first, nullptr);
  editor->DoProcurarConta();
  // The first finder went without a pick; it must not take the editor with it.
  EXPECT_TRUE(editor->Showing());
  forms::Form* second = LoadedForm("frmFindConta");
  ASSERT_NE(second, nullptr);
  forms::KeyboardUser(*second).DoubleClickNode(second->Ctl<forms::TreeView>("TreeView1"), "#12");
  EXPECT_EQ(editor->FXConta_Codigo.Text(), "12");
}

}  // namespace
