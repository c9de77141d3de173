#include "common/modControls.h"

#include <gtest/gtest.h>

#include <memory>

#include "platform/forms/Forms.h"
#include "platform/forms/ScriptedDesktop.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"
#include "platform/vb/Locale.h"

namespace {

using namespace common;

// An editor with one field of each kind the windows bind, the numeric boxes wired to
// the editing protocol the way the windows wire them.
class frmBinding : public forms::Form {
 public:
  frmBinding() : Form(Design()) {
    Wire(FXDebito, kValueEuro);
    Wire(FXTaxa, kValuePercent);
    Wire(FXValor, kValueNumber);
    Wire(FXQuantidade, kValueNumber3);
    Wire(FXPreco, kValueEuro3);
    Wire(FXLinhas, kValueWhole);
  }

  forms::TextBox& FXDebito = Ctl<forms::TextBox>("FXDebito");
  forms::TextBox& FXTaxa = Ctl<forms::TextBox>("FXTaxa");
  forms::TextBox& FXValor = Ctl<forms::TextBox>("FXValor");
  forms::TextBox& FXQuantidade = Ctl<forms::TextBox>("FXQuantidade");
  forms::TextBox& FXPreco = Ctl<forms::TextBox>("FXPreco");
  forms::TextBox& FXLinhas = Ctl<forms::TextBox>("FXLinhas");
  forms::TextBox& FXObs = Ctl<forms::TextBox>("FXObs");
  forms::Label& FXTotal = Ctl<forms::Label>("FXTotal");
  forms::ComboBox& FXTipo = Ctl<forms::ComboBox>("FXTipo");
  forms::ComboBox& FXReferencia = Ctl<forms::ComboBox>("FXReferencia");
  forms::ListBox& FXContas = Ctl<forms::ListBox>("FXContas");
  forms::DTPicker& FXData = Ctl<forms::DTPicker>("FXData");
  forms::CheckBox& FXIva = Ctl<forms::CheckBox>("FXIva");
  forms::OptionButton& FXDebitoOpt = Ctl<forms::OptionButton>("FXDebitoOpt");
  forms::Frame& Frame1 = Ctl<forms::Frame>("Frame1");

 private:
  void Wire(forms::TextBox& box, int32_t kind) {
    box.GotFocus = [&box, kind] { BeginEdit(box, kind); };
    box.LostFocus = [&box, kind] { EndEdit(box, kind); };
  }

  static forms::FormDesign Design() {
    auto box = [](const char* name, int32_t top) {
      return forms::ControlDesign{.name = name, .type = forms::ControlType::TextBox,
                                  .left = 120, .top = top, .width = 1800, .height = 315};
    };
    return {.name = "frmBinding",
            .caption = "Ligação",
            .width = 6000,
            .height = 6000,
            .controls = {
                // First in tab order, so that showing the form puts the focus there.
                box("FXObs", 2280),
                box("FXDebito", 120), box("FXTaxa", 480), box("FXValor", 840),
                box("FXQuantidade", 1200), box("FXPreco", 1560), box("FXLinhas", 1920),
                {.name = "FXTotal", .type = forms::ControlType::Label},
                {.name = "FXTipo", .type = forms::ControlType::ComboBox,
                 .properties = {{"Style", forms::vbComboDropDownList}}},
                {.name = "FXReferencia", .type = forms::ControlType::ComboBox},
                {.name = "FXContas", .type = forms::ControlType::ListBox},
                {.name = "FXData", .type = forms::ControlType::DTPicker},
                {.name = "FXIva", .type = forms::ControlType::CheckBox},
                {.name = "FXDebitoOpt", .type = forms::ControlType::OptionButton},
                {.name = "Frame1", .type = forms::ControlType::Frame},
            }};
  }
};

class ControlBinding : public ::testing::Test {
 protected:
  void SetUp() override {
    vb::SetLocale(vb::Locale{});
    forms::Desktop::Install(desktop);
    form.Show();
  }
  void TearDown() override {
    form.Unload();
    forms::Desktop::Install(nullptr);
  }

  // A person clicks into the box, types over what it shows and leaves it.
  void TypeAndLeave(forms::TextBox& box, std::string_view text) {
    ASSERT_TRUE(user.Focus(box));
    user.Type(text);
    ASSERT_TRUE(user.Focus(form.FXObs));
  }

  std::shared_ptr<forms::ScriptedDesktop> desktop = std::make_shared<forms::ScriptedDesktop>();
  frmBinding form;
  forms::KeyboardUser user{form};
};

TEST_F(ControlBinding, EuroBoxShowsFormattedEditsRawAndSavesTheRawValue) {
  SetControlValue(form.FXDebito, 1234.5, kValueEuro);
  EXPECT_EQ(form.FXDebito.Text(), "€ 1.234,50");
  EXPECT_EQ(form.FXDebito.Tag(), "1234,5");

  ASSERT_TRUE(user.Focus(form.FXDebito));
  EXPECT_EQ(form.FXDebito.Text(), "1234,5");
  EXPECT_EQ(form.FXDebito.SelStart(), 0);
  EXPECT_EQ(form.FXDebito.SelLength(), 6);

  user.Type("12.5");  // the numeric keypad's point is the decimal symbol
  ASSERT_TRUE(user.Focus(form.FXObs));
  EXPECT_EQ(form.FXDebito.Tag(), "12,5");
  EXPECT_EQ(form.FXDebito.Text(), "€ 12,50");
  EXPECT_EQ(ControlSqlValue(form.FXDebito, kValueEuro), "12.5");

  SetControlValue(form.FXDebito, -3, kValueEuro);
  EXPECT_EQ(form.FXDebito.Text(), "€ -3,00");
}

TEST_F(ControlBinding, WhatIsTypedIntoANumericBoxAlwaysSavesAsWhatItShows) {
  TypeAndLeave(form.FXDebito, "abc");
  EXPECT_EQ(form.FXDebito.Text(), "€ 0,00");
  EXPECT_EQ(ControlSqlValue(form.FXDebito, kValueEuro), "0");

  TypeAndLeave(form.FXValor, "x1");
  EXPECT_EQ(form.FXValor.Text(), "0,00");

  // Typed back as shown, with grouping or the currency symbol: the raw value is the
  // number, not a text the server could not read.
  TypeAndLeave(form.FXDebito, "1.234,50");
  EXPECT_EQ(form.FXDebito.Text(), "€ 1.234,50");
  EXPECT_EQ(ControlSqlValue(form.FXDebito, kValueEuro), "1234.5");
  TypeAndLeave(form.FXDebito, "€ 7,25");
  EXPECT_EQ(form.FXDebito.Tag(), "7,25");
  EXPECT_EQ(ControlSqlValue(form.FXDebito, kValueEuro), "7.25");
}

TEST_F(ControlBinding, ClearedBoxKeepsItsRawValueButSavesNull) {
  SetControlValue(form.FXDebito, 50, kValueEuro);
  ASSERT_TRUE(user.Focus(form.FXDebito));
  user.Press(forms::vbKeyBack);  // everything is selected on entry
  EXPECT_EQ(form.FXDebito.Text(), "");
  ASSERT_TRUE(user.Focus(form.FXObs));
  EXPECT_EQ(form.FXDebito.Tag(), "50");
  EXPECT_EQ(form.FXDebito.Text(), "");
  EXPECT_EQ(ControlSqlValue(form.FXDebito, kValueEuro), "null");

  // A box without a raw value enters empty.
  form.FXValor.SetTag("");
  form.FXValor.SetText("stale");
  ASSERT_TRUE(user.Focus(form.FXValor));
  EXPECT_EQ(form.FXValor.Text(), "");
}

TEST_F(ControlBinding, PercentageBoxKeepsTheFractionAndEditsHundredths) {
  SetControlValue(form.FXTaxa, 0.15, kValuePercent);
  EXPECT_EQ(form.FXTaxa.Text(), "15,00 %");

  ASSERT_TRUE(user.Focus(form.FXTaxa));
  EXPECT_EQ(form.FXTaxa.Text(), "15");  // single precision, without its binary noise
  user.Type("20");
  ASSERT_TRUE(user.Focus(form.FXObs));
  EXPECT_EQ(form.FXTaxa.Tag(), "0,2");
  EXPECT_EQ(form.FXTaxa.Text(), "20,00 %");
  EXPECT_EQ(ControlSqlValue(form.FXTaxa, kValuePercent), "0.2");

  // The point means a decimal here as in every numeric box: 12.5 % is not 125 %.
  TypeAndLeave(form.FXTaxa, "12.5");
  EXPECT_EQ(form.FXTaxa.Tag(), "0,125");
  EXPECT_EQ(form.FXTaxa.Text(), "12,50 %");
}

TEST_F(ControlBinding, ThreeDecimalKindsEditRoundedHalvesToEven) {
  SetControlValue(form.FXQuantidade, 0.0625, kValueNumber3);
  ASSERT_TRUE(user.Focus(form.FXQuantidade));
  EXPECT_EQ(form.FXQuantidade.Text(), "0,062");
  EXPECT_EQ(form.FXQuantidade.Tag(), "0,0625");  // the raw value itself is not rounded
  SetControlValue(form.FXPreco, 0.1875, kValueEuro3);
  ASSERT_TRUE(user.Focus(form.FXPreco));
  EXPECT_EQ(form.FXPreco.Text(), "0,188");

  SetControlValue(form.FXPreco, 1234.5678, kValueEuro3);
  EXPECT_EQ(form.FXPreco.Text(), "€ 1.234,568");
  SetControlValue(form.FXQuantidade, -2.5, kValueNumber3);
  EXPECT_EQ(form.FXQuantidade.Text(), "- 2,500");
  // After an edit the plain number shows its own minus sign.
  TypeAndLeave(form.FXQuantidade, "-2.5");
  EXPECT_EQ(form.FXQuantidade.Text(), "-2,500");
  SetControlValue(form.FXValor, -2.5, kValueNumber);
  EXPECT_EQ(form.FXValor.Text(), "- 2,50");
}

TEST_F(ControlBinding, WholeNumberBoxRoundsHalvesToEven) {
  SetControlValue(form.FXLinhas, 2.5, kValueWhole);
  EXPECT_EQ(form.FXLinhas.Text(), "2");
  EXPECT_EQ(form.FXLinhas.Tag(), "2,5");
  ASSERT_TRUE(user.Focus(form.FXLinhas));
  EXPECT_EQ(form.FXLinhas.Tag(), "2");
  user.Type("3.5");
  ASSERT_TRUE(user.Focus(form.FXObs));
  EXPECT_EQ(form.FXLinhas.Tag(), "4");
  EXPECT_EQ(form.FXLinhas.Text(), "4");
  EXPECT_EQ(ControlSqlValue(form.FXLinhas, kValueWhole), "4");
}

TEST_F(ControlBinding, RawValueThatIsNoNumberReachesTheCaller) {
  form.FXPreco.SetTag("abc");
  EXPECT_THROW(BeginEdit(form.FXPreco, kValueEuro3), vb::Error);
}

TEST_F(ControlBinding, PlainDateAndTextKindsOfTextBoxes) {
  forms::TextBox& box = form.FXObs;
  SetControlValue(box, 1234.5, kValuePlain);
  EXPECT_EQ(box.Text(), "1234,5");
  EXPECT_EQ(ControlSqlValue(box, kValuePlain), "1234.5");
  SetControlValue(box, "O'Brien", kValuePlain);
  EXPECT_EQ(box.Tag(), "1234,5");  // text goes to Text only
  box.SetTag("");
  EXPECT_EQ(ControlSqlValue(box, kValuePlain), "'O' + CHAR(39) + 'Brien'");

  SetControlValue(box, *vb::DateSerial(2024, 3, 7, 10, 30), kValueDate);
  EXPECT_EQ(box.Text(), "07-03-2024");
  EXPECT_EQ(ControlSqlValue(box, kValueDate), "CONVERT(DATETIME,'2024-03-07 00:00:00',102)");

  SetControlValue(box, "  Caixa  ", kValueText);
  EXPECT_EQ(ControlSqlValue(box, kValueText), "'Caixa'");
  box.SetTag("x");
  EndEdit(box, kValueText);
  EXPECT_EQ(box.Tag(), "");

  SetControlValue(box, vb::Variant::Null(), kValueEuro);
  EXPECT_EQ(box.Text(), "");
  EXPECT_EQ(box.Tag(), "");
  EXPECT_EQ(ControlSqlValue(box, kValuePlain), "null");
  // An unknown kind neither shows nor saves anything.
  SetControlValue(box, 5, 9);
  EXPECT_EQ(box.Text(), "");
  box.SetText("5");
  EXPECT_EQ(ControlSqlValue(box, 9), "");
}

TEST_F(ControlBinding, EmptyRawValueNeverLeavesAnOldAmountShown) {
  SetControlValue(form.FXDebito, 10, kValueEuro);
  SetControlValue(form.FXDebito, "", kValueEuro);
  EXPECT_EQ(form.FXDebito.Text(), "");
  EXPECT_EQ(ControlSqlValue(form.FXDebito, kValueEuro), "null");
}

TEST_F(ControlBinding, LabelsShowTheValueAndKeepTheirRawValueWhenBlanked) {
  SetControlValue(form.FXTotal, 1500, kValueEuro);
  EXPECT_EQ(form.FXTotal.Caption(), "€ 1.500,00");
  EXPECT_EQ(form.FXTotal.Tag(), "1500");
  SetControlValue(form.FXTotal, vb::Variant::Null(), kValueEuro);
  EXPECT_EQ(form.FXTotal.Caption(), "");
  EXPECT_EQ(form.FXTotal.Tag(), "1500");

  SetControlValue(form.FXTotal, "n/d", kValueWhole);
  EXPECT_EQ(form.FXTotal.Caption(), "n/d");
  SetControlValue(form.FXTotal, 7.5, kValueWhole);
  EXPECT_EQ(form.FXTotal.Caption(), "8");
  EXPECT_EQ(ControlSqlValue(form.FXTotal, kValueWhole), "");
}

TEST_F(ControlBinding, ListsAreSetAndSavedByItemData) {
  for (forms::ListControl* list : {static_cast<forms::ListControl*>(&form.FXTipo),
                                   static_cast<forms::ListControl*>(&form.FXContas)}) {
    SCOPED_TRACE(list->Name());
    list->AddItem("Caixa");
    list->SetItemData(list->NewIndex(), 11);
    list->AddItem("Bancos");
    list->SetItemData(list->NewIndex(), 12);
    EXPECT_EQ(ControlSqlValue(*list, kValuePlain), "null");

    SetControlValue(*list, 12, kValuePlain);
    EXPECT_EQ(list->ListIndex(), 1);
    EXPECT_EQ(ControlSqlValue(*list, kValuePlain), "12");
    SetControlValue(*list, 99, kValuePlain);  // not among the entries
    EXPECT_EQ(list->ListIndex(), 1);
    SetControlValue(*list, 11.0, kValuePlain);
    EXPECT_EQ(list->ListIndex(), 0);
    SetControlValue(*list, "abc", kValuePlain);
    EXPECT_EQ(list->ListIndex(), -1);
    SetControlValue(*list, 11, kValuePlain);
    SetControlValue(*list, vb::Variant::Null(), kValuePlain);
    EXPECT_EQ(list->ListIndex(), -1);
  }

  // A combo box that takes any text is a text field.
  SetControlValue(form.FXReferencia, "FT 12/2024", kValuePlain);
  EXPECT_EQ(form.FXReferencia.Text(), "FT 12/2024");
  EXPECT_EQ(ControlSqlValue(form.FXReferencia, kValuePlain), "'FT 12/2024'");
  SetControlValue(form.FXReferencia, vb::Variant::Null(), kValuePlain);
  EXPECT_EQ(ControlSqlValue(form.FXReferencia, kValuePlain), "null");
}

TEST_F(ControlBinding, DatePickerHoldsTheEmptyDateForNull) {
  SetControlValue(form.FXData, *vb::DateSerial(2024, 12, 31), kValueDate);
  EXPECT_EQ(ControlSqlValue(form.FXData, kValueDate),
            "CONVERT(DATETIME,'2024-12-31 00:00:00',102)");
  SetControlValue(form.FXData, vb::Variant::Null(), kValueDate);
  EXPECT_EQ(form.FXData.Value(), vb::kEmptyDate);
  EXPECT_EQ(ControlSqlValue(form.FXData, kValueDate), "null");
  SetControlValue(form.FXData, "15-06-2023", kValueDate);
  EXPECT_EQ(form.FXData.Value(), *vb::DateSerial(2023, 6, 15));
  SetControlValue(form.FXData, "amanhã", kValueDate);
  EXPECT_EQ(form.FXData.Value(), vb::kEmptyDate);
}

TEST_F(ControlBinding, CheckAndOptionButtonsAreSetByAnyNumberButZero) {
  struct Case {
    vb::Variant value;
    int expected;
  };
  const Case cases[] = {{1, 1}, {0, 0}, {true, 1}, {2.5, 1}, {"3", 1}, {"0", 0},
                        {"abc", 0}, {vb::Variant::Null(), 0}};
  for (const Case& c : cases) {
    SCOPED_TRACE(c.value.Debug());
    SetControlValue(form.FXIva, c.value, kValuePlain);
    EXPECT_EQ(form.FXIva.Value(), c.expected);
    EXPECT_EQ(ControlSqlValue(form.FXIva, kValuePlain), c.expected ? "1" : "0");
    SetControlValue(form.FXDebitoOpt, c.value, kValuePlain);
    EXPECT_EQ(form.FXDebitoOpt.Value(), c.expected == 1);
    EXPECT_EQ(ControlSqlValue(form.FXDebitoOpt, kValuePlain), c.expected ? "1" : "0");
  }
}

TEST_F(ControlBinding, OtherControlsAreLeftAlone) {
  form.Frame1.SetCaption("Cabeçalho");
  SetControlValue(form.Frame1, 5, kValuePlain);
  EXPECT_EQ(form.Frame1.Caption(), "Cabeçalho");
  EXPECT_EQ(form.Frame1.Tag(), "");
  EXPECT_EQ(ControlSqlValue(form.Frame1, kValuePlain), "");
}

}  // namespace
