// The header fields: function keys, the document-number warning, the series number of
// final system documents and the password that unlocks a system document.

#include "entry/SystemDocumentPassword.h"
#include "frmMain_fixture.h"

namespace entry::testing {
namespace {

using vb::Variant;

class FieldsTest : public HeaderEditorTest {
 protected:
  forms::KeyboardUser user() { return forms::KeyboardUser(*form); }
  std::string LastMessage() { return desktop->messages.empty() ? "" : desktop->messages.back().text; }
  int Count(const std::string& text) {
    int n = 0;
    for (const auto& box : desktop->messages) n += box.text == text;
    return n;
  }
  std::string Id(int32_t id) { return std::to_string(id); }
};

constexpr const char* kDuplicate = "O número de documento interno que introduziu já existe na base de dados.";

TEST_F(FieldsTest, F2OpensALineEditorAndF3RestartsFromEveryHeaderField) {
  const int32_t id = AddEntry();
  Open(id);
  size_t opened = 0;
  for (forms::Control* field :
       {static_cast<forms::Control*>(&form->FXCreated_By), static_cast<forms::Control*>(&form->FXData),
        static_cast<forms::Control*>(&form->FXObs), static_cast<forms::Control*>(&form->FXReferencia),
        static_cast<forms::Control*>(&form->FXTipo_ID), static_cast<forms::Control*>(&form->FXTotal_Creditos),
        static_cast<forms::Control*>(&form->FXTotal_Debitos), static_cast<forms::Control*>(&form->FXDorvanto_No),
        static_cast<forms::Control*>(&form->FXTipo_Diario_ID)}) {
    ASSERT_TRUE(user().Focus(*field)) << field->Name();
    // Modifiers make no difference.
    user().Press(forms::vbKeyF2, forms::vbShiftMask);
    ASSERT_EQ(lineEditors.size(), ++opened) << field->Name();
    EXPECT_EQ(vb::CLng(lineEditors.back()->OnlyCall("DoInsert").at(0)), id);
    EXPECT_EQ(lineEditors.back()->objects["MainClass"].lock(), form);
    user().Press(forms::vbKeyF12);
    EXPECT_EQ(lineEditors.size(), opened);
  }

  // F2 does not look at the entry's state; the line editor does.
  Execute("UPDATE tbPOC_Dorvantos SET finalizado = 1 WHERE dorvanto_id = " + Id(id));
  form->DoOpen(id);
  ASSERT_TRUE(user().Focus(form->FXObs));
  user().Press(forms::vbKeyF2);
  EXPECT_EQ(lineEditors.size(), opened + 1);

  form->finalizeAnswer = false;
  ASSERT_TRUE(user().Focus(form->FXTotal_Debitos));
  user().Press(forms::vbKeyF3);
  EXPECT_EQ(form->finalizations, 1);
}

TEST_F(FieldsTest, ADocumentNumberUsedInTheSameYearWarnsOnLeavingTheFieldButIsStillSaved) {
  AddEntry(", dorvanto_no", ", 'D-1'");
  Execute("INSERT INTO tbPOC_Dorvantos (data, created_by, valor, dorvanto_no) VALUES "
          "(CONVERT(DATETIME,'2023-02-01 00:00:00',102), 'ana', 0, 'X-9')");
  const int32_t id = AddEntry();
  Open(id);

  ASSERT_TRUE(user().TypeInto(form->FXDorvanto_No, "D-1"));
  ASSERT_TRUE(user().Focus(form->FXObs));
  EXPECT_EQ(Count(kDuplicate), 1);
  EXPECT_EQ(desktop->messages.back().Icon(), forms::MsgIcon::Information);
  EXPECT_EQ(desktop->messages.back().title, form->Caption());
  ASSERT_TRUE(form->DoGravar());
  EXPECT_EQ(vb::CStr(Scalar("SELECT dorvanto_no FROM tbPOC_Dorvantos WHERE dorvanto_id = " + Id(id))), "D-1");

  // Its own number never counts; another year's number only for a date in that year.
  form->FXDorvanto_No.SetText("Z-3");
  ASSERT_TRUE(form->DoGravar());
  desktop->messages.clear();
  ASSERT_TRUE(user().Focus(form->FXDorvanto_No));
  ASSERT_TRUE(user().Focus(form->FXObs));
  form->FXDorvanto_No.SetText("X-9");
  ASSERT_TRUE(user().Focus(form->FXDorvanto_No));
  ASSERT_TRUE(user().Focus(form->FXObs));
  form->FXDorvanto_No.SetText("");
  ASSERT_TRUE(user().Focus(form->FXDorvanto_No));
  ASSERT_TRUE(user().Focus(form->FXObs));
  EXPECT_TRUE(desktop->messages.empty()) << LastMessage();

  form->FXDorvanto_No.SetText("X-9");
  form->FXData.SetValue(*vb::DateSerial(2023, 7, 1));
  ASSERT_TRUE(user().Focus(form->FXDorvanto_No));
  ASSERT_TRUE(user().Focus(form->FXObs));
  EXPECT_EQ(Count(kDuplicate), 1);
}

TEST_F(FieldsTest, F3InTheNumberFieldWarnsOfADuplicateAndStillRestarts) {
  AddEntry(", dorvanto_no", ", 'D-1'");
  Open(AddEntry());
  ASSERT_TRUE(user().TypeInto(form->FXDorvanto_No, "D-1"));
  form->finalizeAnswer = false;
  user().Press(forms::vbKeyF3);
  EXPECT_EQ(Count(kDuplicate), 1);
  EXPECT_EQ(form->finalizations, 1);
}

TEST_F(FieldsTest, DeleteInTheJournalListTakesTheJournalOffAndFinalizingThenRefuses) {
  const int32_t id = AddEntry(", tipo_diario_id", ", " + std::to_string(Journal("Vendas")));
  AddLine(id, "4", "4");
  Open(id);
  ASSERT_TRUE(user().Focus(form->FXTipo_Diario_ID));
  user().Press(forms::vbKeyDelete);
  EXPECT_EQ(form->FXTipo_Diario_ID.ListIndex(), -1);
  ASSERT_TRUE(form->DoGravar());
  EXPECT_TRUE(Scalar("SELECT tipo_diario_id FROM tbPOC_Dorvantos WHERE dorvanto_id = " + Id(id)).IsNull());
  EXPECT_FALSE(form->DoFinalizar());
  EXPECT_EQ(LastMessage(), "Tem de indicar o Diário para poder finalizar o lançamento.");
}

TEST_F(FieldsTest, ASeriesNumberIsRefusedExceptOnAFinalSystemDocumentWithoutOne) {
  const int32_t ordinary = AddEntry(", finalizado", ", 1");
  AddLine(ordinary, "1", "1");
  Open(ordinary);
  ASSERT_TRUE(user().DoubleClick(form->FXRelated_ID));
  EXPECT_EQ(LastMessage(), "Este registo não pode ser alterado, o lançamento não é de sistema.");
  EXPECT_EQ(desktop->messages.back().Icon(), forms::MsgIcon::Information);

  const int32_t open = AddEntry(", sistema, finalizado", ", 1, 0");
  form->DoOpen(open);
  ASSERT_TRUE(user().Click(form->FXRelated_ID_Label));
  EXPECT_EQ(LastMessage(), "Este registo não pode ser alterado, o lançamento não está bloqueado.");

  const int32_t numbered = AddEntry(", sistema, finalizado", ", 1, 1");
  AddLine(numbered, "1", "1", ", related_id", ", 5");
  form->DoOpen(numbered);
  ASSERT_TRUE(user().Click(form->FXRelated_ID_Label));
  EXPECT_EQ(LastMessage(), "Este registo não pode ser alterado, o lançamento já tem um Nº de Série relacionado.");
  EXPECT_TRUE(desktop->inputs.empty());
}

TEST_F(FieldsTest, ASeriesNumberIsAskedForAndWrittenToEveryLine) {
  const int32_t id = AddEntry(", sistema, finalizado", ", 1, 1");
  const int32_t a = AddLine(id, "2", "0");
  AddLine(id, "0", "2");
  Open(id);
  // A locked system document disables the field: the label is the way in.
  EXPECT_FALSE(user().DoubleClick(form->FXRelated_ID));
  const std::string related = "SELECT COUNT(*) FROM tbPOC_Dorvantos_Details WHERE dorvanto_id = " + Id(id) +
                              " AND related_id = ";

  desktop->QueueAnswer(forms::vbNo);
  ASSERT_TRUE(user().Click(form->FXRelated_ID_Label));
  EXPECT_EQ(LastMessage(), "Deseja introduzir um Nº Serie para este registo?");
  EXPECT_EQ(desktop->messages.back().Icon(), forms::MsgIcon::Question);
  EXPECT_TRUE(desktop->inputs.empty());

  desktop->QueueAnswer(forms::vbYes);
  desktop->QueueInputCancel();
  ASSERT_TRUE(user().Click(form->FXRelated_ID_Label));
  ASSERT_EQ(desktop->inputs.size(), 1u);
  EXPECT_EQ(desktop->inputs[0].prompt, "introduza o nº de sério relacionado:");
  EXPECT_EQ(desktop->inputs[0].title, "ID de Registo");
  EXPECT_EQ(desktop->inputs[0].defaultText, "");

  desktop->QueueAnswer(forms::vbYes);
  desktop->QueueInput("12a");
  ASSERT_TRUE(user().Click(form->FXRelated_ID_Label));
  EXPECT_EQ(LastMessage(), "O valor introduzido não é valido");
  EXPECT_TRUE(Scalar("SELECT related_id FROM tbPOC_Dorvantos_Details WHERE diario_id = " + Id(a)).IsNull());

  desktop->QueueAnswer(forms::vbYes);
  desktop->QueueInput("12,5");
  ASSERT_TRUE(user().Click(form->FXRelated_ID_Label));
  EXPECT_EQ(vb::CLng(Scalar(related + "12.5")), 2);
  // The field is not refreshed, so the number can be given again.
  EXPECT_EQ(form->FXRelated_ID.Text(), "");
  desktop->QueueAnswer(forms::vbYes);
  desktop->QueueInput("44");
  ASSERT_TRUE(user().Click(form->FXRelated_ID_Label));
  EXPECT_EQ(vb::CLng(Scalar(related + "44")), 2);
}

TEST_F(FieldsTest, OnlyTheExactPasswordUnlocksASystemDocument) {
  EXPECT_TRUE(IsSystemDocumentPassword("tolmarequinhoza"));
  for (const char* wrong : {"", "Tolmarequinhoza", "tolmarequinhoza ", "tolmarequinhoz", "TOLMAREQUINHOZA"})
    EXPECT_FALSE(IsSystemDocumentPassword(wrong)) << wrong;

  const int32_t id = AddEntry(", sistema", ", 1");
  Open(id);
  ASSERT_FALSE(form->FXData.Enabled());

  desktop->QueueInput("Tolmarequinhoza");
  ASSERT_TRUE(user().DoubleClick(form->Image1));
  ASSERT_EQ(desktop->inputs.size(), 1u);
  EXPECT_EQ(desktop->inputs[0].prompt, "Digite a password:");
  EXPECT_EQ(desktop->inputs[0].title, "Alteração de Documento de Sistema");
  EXPECT_EQ(LastMessage(), "A password está errada.");
  EXPECT_EQ(desktop->messages.back().Icon(), forms::MsgIcon::Critical);
  desktop->QueueInputCancel();
  ASSERT_TRUE(user().DoubleClick(form->Image1));
  EXPECT_EQ(Count("A password está errada."), 2);
  EXPECT_FALSE(form->Unlocked());
  EXPECT_FALSE(form->FXData.Enabled());

  desktop->QueueInput("tolmarequinhoza");
  ASSERT_TRUE(user().DoubleClick(form->Image1));
  EXPECT_TRUE(form->Unlocked());
  EXPECT_TRUE(form->FXData.Enabled());
  EXPECT_TRUE(Button(form->Toolbar1, "apagar").Enabled());
  EXPECT_EQ(Count("A password está errada."), 2);

  ASSERT_TRUE(user().DoubleClick(form->Image1));
  EXPECT_EQ(LastMessage(), "O registo já está desbloqueado.");
  EXPECT_EQ(desktop->inputs.size(), 3u);
}

}  // namespace
}  // namespace entry::testing
