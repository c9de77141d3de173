// The debit and credit amounts and the VAT controls. A line books one amount: typing
// in the debit zeroes the credit, and the save refuses two amounts or none. Enter on
// an amount that is not "0" saves the line; on a "0" it moves on.

#include "common/modControls.h"
#include "lines/frmMainDetails.h"
#include "platform/vb/Conversions.h"

namespace lines {

void frmMainDetails::FXDebito_GotFocus() {
  common::Trap(Site("FXDebito_GotFocus"), [&] { common::BeginEdit(FXDebito, common::kValueEuro); });
}

void frmMainDetails::FXCredito_GotFocus() {
  common::Trap(Site("FXCredito_GotFocus"), [&] { common::BeginEdit(FXCredito, common::kValueEuro); });
}

void frmMainDetails::FXIVA_Base_Tributavel_GotFocus() {
  common::Trap(Site("FXIVA_Base_Tributavel_GotFocus"),
               [&] { common::BeginEdit(FXIVA_Base_Tributavel, common::kValueEuro); });
}

void frmMainDetails::FXDebito_LostFocus() {
  common::Trap(Site("FXDebito_LostFocus"), [&] { common::EndEdit(FXDebito, common::kValueEuro); });
}

void frmMainDetails::FXCredito_LostFocus() {
  common::Trap(Site("FXCredito_LostFocus"), [&] { common::EndEdit(FXCredito, common::kValueEuro); });
}

void frmMainDetails::FXIVA_Base_Tributavel_LostFocus() {
  common::Trap(Site("FXIVA_Base_Tributavel_LostFocus"),
               [&] { common::EndEdit(FXIVA_Base_Tributavel, common::kValueEuro); });
}

// A cleared or garbled amount becomes 0 rather than an empty value the save could not
// test. It never refuses.
void frmMainDetails::AmountValidate(forms::TextBox& amount, const char* procedure) {
  common::Trap(Site(procedure), [&] {
    if (vb::IsNumeric(vb::Variant(amount.Text()))) return;
    amount.SetTag("0");
    common::FormatControlText(amount, common::kValueEuro);
  });
}

void frmMainDetails::FXDebito_Validate(int& Cancel) { AmountValidate(FXDebito, "FXDebito_Validate"); }

void frmMainDetails::FXCredito_Validate(int& Cancel) { AmountValidate(FXCredito, "FXCredito_Validate"); }

void frmMainDetails::FXDebito_KeyPress(int& KeyAscii) {
  common::Trap(Site("FXDebito_KeyPress"), [&] {
    if (KeyAscii == forms::vbKeyReturn) return;
    common::SetControlValue(FXCredito, vb::Variant(0), common::kValuePlain);
    common::FormatControlText(FXCredito, common::kValueEuro);
  });
}

// The text is compared as typed: "0" moves on, anything else (empty and "0,00"
// included) saves, and the save's checks then judge it.
void frmMainDetails::AmountKeyDown(forms::TextBox& amount, int KeyCode, forms::Control& whenZero,
                                   const char* procedure) {
  common::Trap(Site(procedure), [&] {
    if (KeyCode != forms::vbKeyReturn && KeyCode != forms::vbKeyRight) return;
    if (amount.Text() == "0") return FocusIfShown(whenZero);
    if (!Command1.Visible()) return;  // a final entry's line is only shown
    // Moving to OK first lets the field's leave rules store what was typed.
    FocusIfShown(Command1);
    forms::DoEvents();
    Command1_Click();
  });
}

void frmMainDetails::FXDebito_KeyDown(int& KeyCode, int Shift) {
  if (KeyCode == forms::vbKeyLeft) {
    common::Trap(Site("FXDebito_KeyDown"), [&] { FocusIfShown(FXRef); });
    return;
  }
  AmountKeyDown(FXDebito, KeyCode, FXCredito, "FXDebito_KeyDown");
}

void frmMainDetails::FXCredito_KeyDown(int& KeyCode, int Shift) {
  if (KeyCode == forms::vbKeyLeft) {
    common::Trap(Site("FXCredito_KeyDown"), [&] { FocusIfShown(FXConta); });
    return;
  }
  AmountKeyDown(FXCredito, KeyCode, FXConta_Codigo, "FXCredito_KeyDown");
}

// Enter on the entry number or a VAT control saves at once.
void frmMainDetails::SaveOnEnter_KeyDown(int& KeyCode, int Shift) {
  if (KeyCode == forms::vbKeyReturn) Command1_Click();
}

void frmMainDetails::FXIVA_Click() { DoPaint(); }

}  // namespace lines
