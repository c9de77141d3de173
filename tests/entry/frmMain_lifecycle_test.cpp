// The entry's lifecycle in the header editor: new, open, save, remove, restart, totals.

#include "frmMain_fixture.h"

namespace entry::testing {
namespace {

using vb::Variant;

vb::Date Day(int y, int m, int d, int h = 0, int n = 0) { return *vb::DateSerial(y, m, d, h, n); }

const std::string kSecondParagraph =
    "\n\r\n\rNão tem permissões para alterar registos dentro do periodo de fecho, contacte o "
    "administrador do sistema para que este lhe estabeleça as permissões necessárias.";

TEST_F(HeaderEditorTest, ANewEntryIsCreatedAtOnceWithTheUserAsCreatorAndNothingUnsaved) {
  form->DoInsert();
  const int32_t id = form->Dorvanto_ID;
  ASSERT_NE(id, 0);
  const std::string row = " FROM tbPOC_Dorvantos WHERE dorvanto_id = " + std::to_string(id);
  EXPECT_EQ(vb::CStr(Scalar("SELECT created_by" + row)), "ana");
  EXPECT_EQ(vb::CDbl(Scalar("SELECT valor" + row)), 0);
  EXPECT_EQ(vb::CLng(Scalar("SELECT finalizado" + row)), 0);
  for (const char* empty : {"dorvanto_no", "tipo_diario_id", "obs"})
    EXPECT_TRUE(Scalar(std::string("SELECT ") + empty + row).IsNull()) << empty;

  EXPECT_EQ(form->FXCreated_By.Text(), "ana");
  EXPECT_EQ(vb::DateOnly(form->FXData.Value()), vb::DateOnly(vb::Now()));
  EXPECT_EQ(form->FXTipo_Diario_ID.ListIndex(), -1);
  EXPECT_FALSE(form->SaveMark());
  EXPECT_EQ(form->FXContador.Text(), "€ 0,00");
  EXPECT_EQ(form->FXTotal_Debitos.Text(), "€ 0,00");
  EXPECT_EQ(form->FXTotal_Creditos.Text(), "€ 0,00");
  EXPECT_TRUE(form->Visible());
  EXPECT_EQ(form->MousePointer(), forms::vbDefault);
}

TEST_F(HeaderEditorTest, ANewEntryTakesTheRememberedDateAndJournalAsUnsavedChanges) {
  Remember("LastData", "15-03-2024");
  Remember("LastDiario_ID", std::to_string(Journal("Bancos")));
  form->DoInsert();
  EXPECT_EQ(form->FXData.Value(), Day(2024, 3, 15));
  ASSERT_GE(form->FXTipo_Diario_ID.ListIndex(), 0);
  EXPECT_EQ(form->FXTipo_Diario_ID.Text(), "Bancos");
  EXPECT_TRUE(form->SaveMark());

  // The first save takes them to the database.
  ASSERT_TRUE(form->DoGravar());
  const std::string row = " FROM tbPOC_Dorvantos WHERE dorvanto_id = " + std::to_string(form->Dorvanto_ID);
  EXPECT_EQ(vb::CLng(Scalar("SELECT tipo_diario_id" + row)), Journal("Bancos"));
  EXPECT_EQ(vb::CDate(Scalar("SELECT data" + row)), Day(2024, 3, 15));
}

TEST_F(HeaderEditorTest, RememberedValuesThatAreNoDateOrNoJournalAreIgnored) {
  Remember("LastData", "amanhã");
  Remember("LastDiario_ID", "Caixa");
  form->DoInsert();
  EXPECT_EQ(vb::DateOnly(form->FXData.Value()), vb::DateOnly(vb::Now()));
  EXPECT_EQ(form->FXTipo_Diario_ID.ListIndex(), -1);
  EXPECT_FALSE(form->SaveMark());

  auto second = NewForm();
  Remember("LastDiario_ID", "9999");
  second->DoInsert();
  EXPECT_EQ(second->FXTipo_Diario_ID.ListIndex(), -1);
  second->Hide();
  second->Unload();
}

TEST_F(HeaderEditorTest, OpeningShowsTheHeaderAndTheLinesCommonValuesWithNothingUnsaved) {
  const int32_t code = Integration("Apuramento de IVA");
  const int32_t id = AddEntry(", dorvanto_no, obs, referencia, tipo_diario_id, tipo_id",
                              ", 'D-7', 'notas', 'REF 1', " + std::to_string(Journal("Vendas")) +
                                  ", " + std::to_string(code));
  AddLine(id, "10", "0", ", tipo_id, related_id",
          ", " + std::to_string(Integration("Facturas de clientes")) + ", 77");
  Open(id);
  EXPECT_EQ(form->FXData.Value(), Day(2024, 5, 10, 9, 15));
  EXPECT_EQ(form->FXTipo_Diario_ID.Text(), "Vendas");
  EXPECT_EQ(form->FXDorvanto_No.Text(), "D-7");
  EXPECT_EQ(form->FXObs.Text(), "notas");
  EXPECT_EQ(form->FXReferencia.Text(), "REF 1");
  EXPECT_EQ(form->FXTipo_ID.Text(), std::to_string(code) + " - Apuramento de IVA");
  EXPECT_EQ(form->FXTipo.Text(), "Facturas de clientes");
  EXPECT_EQ(form->FXRelated_ID.Text(), "77");
  EXPECT_FALSE(form->SaveMark());

  // The same window reused for an entry without lines or system code shows none of
  // the last entry's, so saving cannot copy them onto this entry's lines later.
  const int32_t other = AddEntry();
  form->DoOpen(other);
  EXPECT_EQ(form->FXTipo_ID.Text(), "");
  EXPECT_EQ(form->FXTipo.ListIndex(), -1);
  EXPECT_EQ(form->FXRelated_ID.Text(), "");
  EXPECT_EQ(form->FXTipo_Diario_ID.ListIndex(), -1);
}

TEST_F(HeaderEditorTest, SavingWritesTheHeaderTheLinesAndRemembersTheDefaults) {
  const int32_t id = AddEntry(", obs, dorvanto_no", ", 'velhas', 'X'");
  AddLine(id, "10", "0");
  AddLine(id, "0", "10");
  Open(id);
  forms::KeyboardUser user(*form);
  ASSERT_TRUE(user.ChooseDate(form->FXData, Day(2024, 6, 3, 14, 30)));
  ASSERT_TRUE(user.Choose(form->FXTipo_Diario_ID, "Compras"));
  ASSERT_TRUE(user.Choose(form->FXTipo, "Facturas de fornecedores"));
  form->FXReferencia.SetText("  FT 2024/12 ");
  form->FXObs.SetText("   ");
  form->FXDorvanto_No.SetText("");
  form->FXRelated_ID.SetText("42");
  EXPECT_TRUE(form->SaveMark());

  ASSERT_TRUE(form->DoGravar());
  EXPECT_FALSE(form->SaveMark());
  const std::string row = " FROM tbPOC_Dorvantos WHERE dorvanto_id = " + std::to_string(id);
  EXPECT_EQ(vb::CDate(Scalar("SELECT data" + row)), Day(2024, 6, 3));  // the day only
  EXPECT_EQ(vb::CLng(Scalar("SELECT tipo_diario_id" + row)), Journal("Compras"));
  EXPECT_EQ(vb::CStr(Scalar("SELECT referencia" + row)), "FT 2024/12");
  EXPECT_TRUE(Scalar("SELECT obs" + row).IsNull());
  EXPECT_TRUE(Scalar("SELECT dorvanto_no" + row).IsNull());
  const std::string lines = " FROM tbPOC_Dorvantos_Details WHERE dorvanto_id = " + std::to_string(id);
  EXPECT_EQ(vb::CLng(Scalar("SELECT COUNT(*)" + lines + " AND data = CONVERT(DATETIME,'2024-06-03 00:00:00',102)"
                            " AND related_id = 42 AND tipo_id = " +
                            std::to_string(Integration("Facturas de fornecedores")))),
            2);
  EXPECT_EQ(vb::CStr(Remembered("LastData")), "03-06-2024");
  EXPECT_EQ(vb::CStr(Remembered("LastDiario_ID")), std::to_string(Journal("Compras")));

  // No journal type: null stored, the remembered one kept; a series number that is no
  // number stores null on every line.
  form->FXTipo_Diario_ID.SetListIndex(-1);
  form->FXRelated_ID.SetText("abc");
  ASSERT_TRUE(form->DoGravar());
  EXPECT_TRUE(Scalar("SELECT tipo_diario_id" + row).IsNull());
  EXPECT_EQ(vb::CStr(Remembered("LastDiario_ID")), std::to_string(Journal("Compras")));
  EXPECT_EQ(vb::CLng(Scalar("SELECT COUNT(*)" + lines + " AND related_id IS NULL")), 2);
}

TEST_F(HeaderEditorTest, SavingAFinalEntryLeavesItsDateAndItsLinesDatesAlone) {
  const int32_t id = AddEntry(", finalizado", ", 1");
  AddLine(id, "10", "0", ", data", ", CONVERT(DATETIME,'2024-05-10 00:00:00',102)");
  Open(id);
  ASSERT_FALSE(form->FXData.Enabled());
  form->FXData.SetValue(Day(2024, 8, 1));
  form->FXReferencia.SetText("nova");
  form->FXRelated_ID.SetText("9");
  ASSERT_TRUE(form->DoGravar());
  EXPECT_EQ(vb::CDate(Scalar("SELECT data FROM tbPOC_Dorvantos WHERE dorvanto_id = " + std::to_string(id))),
            Day(2024, 5, 10, 9, 15));
  EXPECT_EQ(vb::CDate(Scalar("SELECT data FROM tbPOC_Dorvantos_Details WHERE dorvanto_id = " +
                             std::to_string(id))),
            Day(2024, 5, 10));
  EXPECT_EQ(vb::CStr(Scalar("SELECT referencia FROM tbPOC_Dorvantos WHERE dorvanto_id = " + std::to_string(id))),
            "nova");
  EXPECT_EQ(vb::CLng(Scalar("SELECT related_id FROM tbPOC_Dorvantos_Details WHERE dorvanto_id = " +
                            std::to_string(id))),
            9);
}

TEST_F(HeaderEditorTest, SavingIntoAClosedPeriodIsRefusedWithoutWriting) {
  const int32_t id = AddEntry();
  Open(id);
  form->FXData.SetValue(Day(2009, 6, 30));
  form->FXObs.SetText("não entra");
  EXPECT_FALSE(form->DoGravar());
  ASSERT_EQ(desktop->messages.size(), 1u);
  const forms::MessageBox& box = desktop->messages[0];
  EXPECT_EQ(box.text, "Não é possivel realizar o comando! Este registo está bloqueado." + kSecondParagraph);
  EXPECT_EQ(box.title, "Sistema de Segurança");
  EXPECT_EQ(box.style, forms::vbCritical | forms::vbSystemModal);
  EXPECT_TRUE(form->SaveMark());
  EXPECT_TRUE(Scalar("SELECT obs FROM tbPOC_Dorvantos WHERE dorvanto_id = " + std::to_string(id)).IsNull());
  EXPECT_EQ(form->MousePointer(), forms::vbDefault);
}

TEST_F(HeaderEditorTest, SavingWithoutAnEntryOrWhenTheDatabaseFailsSaysSo) {
  form->Load();
  form->FXData.SetValue(vb::Now());
  EXPECT_FALSE(form->DoGravar());
  ASSERT_EQ(desktop->messages.size(), 1u);
  EXPECT_EQ(desktop->messages[0].text, "Não foi possível gravar as alterações.");
  EXPECT_EQ(desktop->messages[0].style, forms::vbCritical);
  EXPECT_EQ(desktop->messages[0].title, "Lançamento no Diário");

  // The header is written, then the lines cannot be: the person is told and the
  // failure reported; the header stays written.
  const int32_t id = AddEntry();
  Open(id);
  Execute("DROP VIEW vwPOC_Dorvantos_Details");
  Execute("DROP TABLE tbPOC_Dorvantos_Details");
  form->FXObs.SetText("escrito");
  EXPECT_FALSE(form->DoGravar());
  ASSERT_EQ(desktop->messages.size(), 2u);
  EXPECT_EQ(desktop->messages[1].text.rfind("Erro: Não foi possível gravar as alterações. ", 0), 0u);
  EXPECT_EQ(desktop->messages[1].style, forms::vbOKOnly);
  EXPECT_EQ(desktop->messages[1].title, forms::ApplicationTitle());
  EXPECT_NE(TakeErrors().find("frmMain.DoGravar"), std::string::npos);
  EXPECT_EQ(vb::CStr(Scalar("SELECT obs FROM tbPOC_Dorvantos WHERE dorvanto_id = " + std::to_string(id))),
            "escrito");
  EXPECT_EQ(form->MousePointer(), forms::vbDefault);
}

TEST_F(HeaderEditorTest, RemovingIsRefusedToOthersAndInClosedPeriodsAndAskedOtherwise) {
  const int32_t mine = AddEntry();
  AddLine(mine, "5", "0");
  const int32_t theirs = AddEntry();
  Execute("UPDATE tbPOC_Dorvantos SET created_by = 'Ana' WHERE dorvanto_id = " + std::to_string(theirs));
  auto count = [&](int32_t id) {
    return vb::CLng(Scalar("SELECT COUNT(*) FROM tbPOC_Dorvantos WHERE dorvanto_id = " + std::to_string(id)));
  };

  // The owner is compared with its letter case.
  Open(theirs);
  form->DoRemove(theirs);
  ASSERT_EQ(desktop->messages.size(), 1u);
  EXPECT_EQ(desktop->messages[0].text,
            "Não é possivel realizar o comando! Este registo está bloqueado porque pertence ao user "
            "'Ana'." + kSecondParagraph);
  EXPECT_EQ(desktop->messages[0].style, forms::vbCritical | forms::vbSystemModal);
  EXPECT_EQ(desktop->messages[0].title, "Sistema de Segurança");
  EXPECT_EQ(count(theirs), 1);

  Open(mine);
  form->FXData.SetValue(Day(2009, 1, 2));
  form->DoRemove(mine);
  ASSERT_EQ(desktop->messages.size(), 2u);
  EXPECT_EQ(desktop->messages[1].title, "Sistema de Segurança");
  EXPECT_EQ(desktop->messages[1].text.rfind("Não é possivel realizar o comando! Este registo está bloqueado.\n", 0), 0u);

  Open(mine);
  desktop->QueueAnswer(forms::vbNo);
  form->DoRemove(mine);
  ASSERT_EQ(desktop->messages.size(), 3u);
  EXPECT_EQ(desktop->messages[2].text, "Deseja mesmo remover este lançamento ?");
  EXPECT_EQ(desktop->messages[2].title, "Remover lançamento");
  EXPECT_EQ(desktop->messages[2].style, forms::vbQuestion | forms::vbYesNo);
  EXPECT_EQ(count(mine), 1);
  EXPECT_TRUE(form->Showing());

  desktop->QueueAnswer(forms::vbYes);
  form->DoRemove(mine);
  EXPECT_EQ(count(mine), 0);
  EXPECT_EQ(vb::CLng(Scalar("SELECT COUNT(*) FROM tbPOC_Dorvantos_Details WHERE dorvanto_id = " +
                            std::to_string(mine))),
            0);
  EXPECT_FALSE(form->Loaded());
  EXPECT_EQ(vb::CLng(caller->OnlyCall("RemoteKey").at(0)), mine);
}

TEST_F(HeaderEditorTest, RemovingAnEntryAlreadyGoneClosesWithoutAsking) {
  const int32_t id = AddEntry();
  Open(id);
  Execute("DELETE FROM tbPOC_Dorvantos WHERE dorvanto_id = " + std::to_string(id));
  form->DoRemove(id);
  EXPECT_TRUE(desktop->messages.empty());
  EXPECT_FALSE(form->Loaded());
}

TEST_F(HeaderEditorTest, TotalsAndTheJournalCounterShowEuros) {
  const int32_t bancos = Journal("Bancos");
  const int32_t id = AddEntry(", tipo_diario_id", ", " + std::to_string(bancos));
  AddLine(id, "1234.5", "0");
  AddLine(id, "0", "1000");
  AddLine(id, "0", "234.5");
  // Other entries of the same journal and day count with their valor, final or not;
  // another day or another journal does not.
  Execute("INSERT INTO tbPOC_Dorvantos (data, tipo_diario_id, valor, finalizado) VALUES "
          "(CONVERT(DATETIME,'2024-05-10 18:00:00',102), " + std::to_string(bancos) + ", 2500.75, 1)");
  Execute("INSERT INTO tbPOC_Dorvantos (data, tipo_diario_id, valor, finalizado) VALUES "
          "(CONVERT(DATETIME,'2024-05-10 08:00:00',102), " + std::to_string(bancos) + ", -500, 0)");
  Execute("INSERT INTO tbPOC_Dorvantos (data, tipo_diario_id, valor, finalizado) VALUES "
          "(CONVERT(DATETIME,'2024-05-11 00:00:00',102), " + std::to_string(bancos) + ", 7, 1)");
  Execute("INSERT INTO tbPOC_Dorvantos (data, tipo_diario_id, valor, finalizado) VALUES "
          "(CONVERT(DATETIME,'2024-05-10 00:00:00',102), " + std::to_string(Journal("Caixa")) + ", 9, 1)");
  Open(id);
  EXPECT_EQ(form->FXTotal_Debitos.Text(), "€ 1.234,50");
  EXPECT_EQ(form->FXTotal_Debitos.Tag(), "1234,5");
  EXPECT_EQ(form->FXTotal_Creditos.Text(), "€ 1.234,50");
  EXPECT_EQ(form->FXContador.Text(), "€ 2.000,75");

  // Members the line editor reads by name.
  auto debitos = form->Get("FXTotal_Debitos").AsObject();
  EXPECT_EQ(vb::CStr(debitos->Get("Text")), "€ 1.234,50");

  Execute("UPDATE tbPOC_Dorvantos SET valor = -3000 WHERE valor = 2500.75");
  form->DoFillContador();
  EXPECT_EQ(form->FXContador.Text(), "€ -3.500,00");
}

TEST_F(HeaderEditorTest, NextLineOpensALineEditorOnlyWhileTheEntryTakesLines) {
  const int32_t id = AddEntry();
  Open(id);
  form->Call("DoInsertDorvanto");
  ASSERT_EQ(lineEditors.size(), 1u);
  EXPECT_EQ(vb::CLng(lineEditors[0]->OnlyCall("DoInsert").at(0)), id);
  EXPECT_EQ(lineEditors[0]->objects["MainClass"].lock(), form);

  Execute("UPDATE tbPOC_Dorvantos SET finalizado = 1 WHERE dorvanto_id = " + std::to_string(id));
  form->DoOpen(id);
  form->Call("DoInsertDorvanto");
  EXPECT_EQ(lineEditors.size(), 1u);
}

TEST_F(HeaderEditorTest, RestartSavesFinalizesAndHandsOverToANewWindow) {
  const int32_t id = AddEntry();
  Open(id);
  form->FXObs.SetText("antes do fim");
  form->finalizeAnswer = false;
  form->DoRestart();
  EXPECT_EQ(form->finalizations, 1);
  EXPECT_TRUE(headerEditors.empty());
  EXPECT_TRUE(form->Showing());
  EXPECT_EQ(vb::CStr(Scalar("SELECT obs FROM tbPOC_Dorvantos WHERE dorvanto_id = " + std::to_string(id))),
            "antes do fim");

  form->finalizeAnswer = true;
  forms::KeyboardUser(*form).Focus(form->ListView1);
  forms::KeyboardUser(*form).Press(forms::vbKeyF3);
  ASSERT_EQ(headerEditors.size(), 1u);
  Recorder& next = *headerEditors[0];
  EXPECT_EQ(next.objects["MainClass"].lock(), mainClass);
  EXPECT_EQ(next.objects["CallBackClass"].lock(), caller);
  next.OnlyCall("DoInsert");
  EXPECT_FALSE(form->Loaded());
  EXPECT_EQ(vb::CLng(caller->OnlyCall("RemoteKey").at(0)), id);
}

}  // namespace
}  // namespace entry::testing
