// The lines list of the header editor and the looks of the window.

#include "frmMain_fixture.h"

namespace entry::testing {
namespace {

class LinesListTest : public HeaderEditorTest {
 protected:
  void SetUp() override {
    HeaderEditorTest::SetUp();
    entry = AddEntry();
    const std::string vat23 = "(SELECT MIN(iva_id) FROM tbTaxas_Iva WHERE tx = 0.23)";
    first = AddLine(entry, "150", "0", ", descrit, ref, iva_tx_id, iva_base_tributavel, reg_no",
                    ", 'Compra de material', 'FT 1', " + vat23 + ", 121.95, 57");
    second = AddLine(entry, "0", "150", ", descrit", ", 'Pagamento'");
    third = AddLine(entry, "null", "null");
  }
  std::vector<std::string> Row(int32_t line) {
    forms::ListItem& item = form->ListView1.ListItems()(Key(line));
    std::vector<std::string> texts{item.Text()};
    for (int32_t sub = 1; sub <= 9; ++sub) texts.push_back(item.SubItems(sub));
    return texts;
  }

  int32_t entry = 0, first = 0, second = 0, third = 0;
};

TEST_F(LinesListTest, AFullFillListsEveryLineInOrderWithBlanksForWhatIsMissing) {
  Open(entry);
  EXPECT_EQ(Keys(), (std::vector<std::string>{Key(first), Key(second), Key(third)}));
  EXPECT_EQ(Row(first), (std::vector<std::string>{"57", " ", " ", " ", "Compra de material", "FT 1",
                                                  "23,00 %", "€ 121,95", "€ 150,00", " "}));
  // A zero amount and a null one both show a blank, never a formatted zero.
  EXPECT_EQ(Row(second)[8], " ");
  EXPECT_EQ(Row(second)[9], "€ 150,00");
  EXPECT_EQ(Row(third)[8], " ");
  EXPECT_EQ(Row(third)[9], " ");
  EXPECT_EQ(form->ListView1.ListItems()(Key(first)).SmallIcon(), 1);
  EXPECT_EQ(form->ListView1.SelectedItem(), nullptr);
  EXPECT_EQ(form->FXTotal_Creditos.Text(), "€ 150,00");
}

TEST_F(LinesListTest, OpeningOnALineSelectsItAndScrollsToIt) {
  Open(entry, second);
  forms::ListItem* selected = form->ListView1.SelectedItem();
  ASSERT_NE(selected, nullptr);
  EXPECT_EQ(selected->Key(), Key(second));
  EXPECT_EQ(form->ListView1.ScrolledTo(), selected);
}

TEST_F(LinesListTest, ASavedLineRefreshesTheListInPlaceAndIsSelected) {
  Open(entry, first);
  Execute("UPDATE tbPOC_Dorvantos_Details SET descrit = 'Renda', credito = 99 WHERE diario_id = " +
          std::to_string(second));
  Execute("UPDATE tbPOC_Dorvantos_Details SET ref = 'FT 2' WHERE diario_id = " + std::to_string(first));
  std::vector<vb::Variant> args{vb::Variant(second)};
  form->Invoke("DoFillDorvantos", args);  // as the line editor calls it
  EXPECT_EQ(Keys(), (std::vector<std::string>{Key(first), Key(second), Key(third)}));
  EXPECT_EQ(Row(second)[4], "Renda");
  EXPECT_EQ(Row(first)[5], "FT 2");
  EXPECT_FALSE(form->ListView1.ListItems()(Key(first)).Selected());
  EXPECT_EQ(form->ListView1.SelectedItem()->Key(), Key(second));
  EXPECT_EQ(form->ListView1.ScrolledTo()->Key(), Key(second));
  EXPECT_EQ(form->FXTotal_Creditos.Text(), "€ 99,00");
  EXPECT_EQ(form->MousePointer(), forms::vbDefault);
}

TEST_F(LinesListTest, ALineNotYetListedRebuildsTheList) {
  Open(entry);
  // Saved by this window's line editor, and one by another window meanwhile: the list
  // ends up complete either way.
  const int32_t fourth = AddLine(entry, "7", "0");
  form->DoFillDorvantos(fourth);
  EXPECT_EQ(Keys().size(), 4u);
  EXPECT_EQ(form->ListView1.SelectedItem()->Key(), Key(fourth));

  const int32_t fifth = AddLine(entry, "8", "0");
  form->DoFillDorvantos(second);
  EXPECT_EQ(Keys(), (std::vector<std::string>{Key(first), Key(second), Key(third), Key(fourth), Key(fifth)}));
  EXPECT_EQ(form->ListView1.SelectedItem()->Key(), Key(second));
  EXPECT_EQ(form->FXTotal_Debitos.Text(), "€ 165,00");
}

struct Look {
  int32_t list, totals;
  bool novo, importar, finalizar, apagar, data, tipoDiario, tipo, obsLocked;
  const std::string& caption;
};

class LooksTest : public HeaderEditorTest {
 protected:
  void ExpectLook(const Look& look) {
    EXPECT_EQ(form->ListView1.BackColor(), look.list);
    EXPECT_EQ(form->FXTotal_Debitos.BackColor(), look.totals);
    EXPECT_EQ(form->FXTotal_Creditos.BackColor(), look.totals);
    for (const char* key : {"novo", "abrir", "remover"})
      EXPECT_EQ(Button(form->Toolbar2, key).Enabled(), look.novo) << key;
    for (const char* key : {"importar", "predefinidos"})
      EXPECT_EQ(Button(form->Toolbar2, key).Enabled(), look.importar) << key;
    EXPECT_EQ(Button(form->Toolbar1, "finalizar").Caption(), look.caption);
    EXPECT_EQ(Button(form->Toolbar1, "finalizar").Enabled(), look.finalizar);
    EXPECT_EQ(Button(form->Toolbar1, "apagar").Enabled(), look.apagar);
    EXPECT_EQ(form->FXData.Enabled(), look.data);
    EXPECT_EQ(form->FXTipo_Diario_ID.Enabled(), look.tipoDiario);
    for (forms::Control* field : {static_cast<forms::Control*>(&form->FXTipo), static_cast<forms::Control*>(&form->FXRelated_ID),
                                  static_cast<forms::Control*>(&form->FXReferencia),
                                  static_cast<forms::Control*>(&form->FXDorvanto_No)}) {
      EXPECT_EQ(field->Enabled(), look.tipo) << field->Name();
      EXPECT_EQ(field->BackColor(), look.tipo ? forms::vbWindowBackground : forms::vbButtonFace) << field->Name();
    }
    EXPECT_TRUE(form->FXObs.Enabled());
    EXPECT_EQ(form->FXObs.Locked(), look.obsLocked);
  }
  static constexpr int32_t kWhite = forms::vbWindowBackground;
  static constexpr int32_t kGrey = forms::vbButtonFace;
};

TEST_F(LooksTest, OrdinaryEntriesLookOpenOrFinal) {
  const int32_t id = AddEntry();
  Open(id);
  ExpectLook({kWhite, kWhite, true, false, true, true, true, true, true, false, kFinalizarCaption});

  Execute("UPDATE tbPOC_Dorvantos SET finalizado = NULL WHERE dorvanto_id = " + std::to_string(id));
  form->DoOpen(id);  // a null counts as final
  ExpectLook({kGrey, kGrey, false, false, true, true, false, true, true, false, kReabrirCaption});
  // On a visible window the final look puts the person in the notes.
  ASSERT_TRUE(forms::KeyboardUser(*form).Focus(form->ListView1));
  form->DoPaint();
  EXPECT_EQ(form->ActiveControl(), &form->FXObs);
}

TEST_F(LooksTest, ALockedSystemDocumentLocksAllButTheNotesWhichAreReadOnly) {
  const int32_t id = AddEntry(", sistema", ", 1");
  Open(id);
  ExpectLook({kGrey, kGrey, false, false, false, false, false, false, false, true, kReabrirCaption});
}

TEST_F(LooksTest, AnUnlockedFinalSystemDocumentFreesTheHeaderButNotItsLines) {
  const int32_t id = AddEntry(", sistema, finalizado", ", 1, 1");
  Open(id);
  form->Unlock();
  ExpectLook({kGrey, kGrey, false, false, true, true, false, true, true, false, kReabrirCaption});

  Execute("UPDATE tbPOC_Dorvantos SET finalizado = 0 WHERE dorvanto_id = " + std::to_string(id));
  form->DoOpen(id);  // opening locks it again
  EXPECT_FALSE(form->FXTipo_Diario_ID.Enabled());
  form->Unlock();
  ExpectLook({kWhite, kWhite, true, false, true, true, true, true, true, false, kFinalizarCaption});
}

}  // namespace
}  // namespace entry::testing
