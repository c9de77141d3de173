#pragma once
// frmMainDetails, the line editor: one row of tbPOC_Dorvantos_Details with its account,
// sub-account, description, reference, one amount and the VAT data.
//
// The header editor creates a fresh editor for every line, sets MainClass to itself and
// calls exactly one of DoInsert, DoOpen or DoRemove by name:
//
//   created --DoInsert--> new line (visible) ----OK ok----> hidden, call-backs, unloaded
//           --DoOpen----> existing line (visible) ----------^
//                         final entry: read-only, "&Fechar" only
//           --DoRemove--> never shown; unloaded when the line was deleted
//   Cancel or the close box: unloaded, nothing written, nobody told.
//
// The fields' behaviour lives in one file per concern: the lifecycle, the save, the
// account and sub-account fields, the amounts and VAT, and the descriptions.

#include <cstdint>
#include <memory>
#include <string>

#include "common/ErrorTrap.h"
#include "entry/modLayout.h"
#include "platform/forms/Forms.h"
#include "platform/vb/Object.h"

namespace lines {

// The class the line editor creates to pick a sub-account.
inline constexpr const char* kRecordFinderProgId = "RecordFinder.General";
// The table key the record finder knows the sub-accounts by.
inline constexpr const char* kSubContasTable = "POC_SUBCONTAS";

struct LineLiterals;

class frmMainDetails : public forms::Form {
 public:
  frmMainDetails();

  // The header editor that opened this one; without it OK makes no call-backs.
  // Held weakly: the header editor keeps the line editor it opened last.
  std::weak_ptr<vb::Object> MainClass;
  int32_t Diario_ID = 0;
  int32_t Dorvanto_ID = 0;

  void DoInsert(int32_t& p_Dorvanto_ID);
  void DoOpen(int32_t& p_Diario_ID);
  bool DoRemove(int32_t& p_ID);
  bool DoGravar();
  void DoPaint();
  void DoFillConta(int32_t& ID);
  void DoFillSubConta(int32_t& ID);
  void DoProcurarConta();
  void DoProcurarSubconta();
  void DoProcurarCodigos();

  void Command1_Click();  // OK
  void Command2_Click();  // Cancel

  forms::Label& Label1 = Ctl<forms::Label>("Label1");
  forms::TextBox& FXDorvanto_No = Ctl<forms::TextBox>("FXDorvanto_No");
  forms::TextBox& FXData = Ctl<forms::TextBox>("FXData");
  forms::TextBox& FXConta_Codigo = Ctl<forms::TextBox>("FXConta_Codigo");
  forms::Toolbar& FXConta_Find = Ctl<forms::Toolbar>("FXConta_Find");
  forms::TextBox& FXConta = Ctl<forms::TextBox>("FXConta");
  forms::TextBox& FXSubconta_codigo = Ctl<forms::TextBox>("FXSubconta_codigo");
  forms::Toolbar& FXSubconta_Find = Ctl<forms::Toolbar>("FXSubconta_Find");
  forms::TextBox& FXSubconta = Ctl<forms::TextBox>("FXSubconta");
  forms::TextBox& FXDescrit_ID = Ctl<forms::TextBox>("FXDescrit_ID");
  forms::Toolbar& Toolbar1 = Ctl<forms::Toolbar>("Toolbar1");
  forms::TextBox& FXDescrit = Ctl<forms::TextBox>("FXDescrit");
  forms::TextBox& FXRef = Ctl<forms::TextBox>("FXRef");
  forms::TextBox& FXDebito = Ctl<forms::TextBox>("FXDebito");
  forms::TextBox& FXCredito = Ctl<forms::TextBox>("FXCredito");
  forms::CheckBox& FXIVA = Ctl<forms::CheckBox>("FXIVA");
  forms::Label& FXIVA_Tx_ID_Label = Ctl<forms::Label>("FXIVA_Tx_ID_Label");
  forms::ComboBox& FXIVA_Tx_ID = Ctl<forms::ComboBox>("FXIVA_Tx_ID");
  forms::Label& FXIVA_Base_Tributavel_Label = Ctl<forms::Label>("FXIVA_Base_Tributavel_Label");
  forms::TextBox& FXIVA_Base_Tributavel = Ctl<forms::TextBox>("FXIVA_Base_Tributavel");
  forms::CheckBox& FXIVA_Apuramento = Ctl<forms::CheckBox>("FXIVA_Apuramento");
  forms::CommandButton& Command1 = Ctl<forms::CommandButton>("Command1");
  forms::CommandButton& Command2 = Ctl<forms::CommandButton>("Command2");

 protected:
  void Form_Load() override;
  void Form_Resize() override;
  void Form_Unload(int& Cancel) override;

 private:
  static forms::FormDesign Design();
  void BindEvents();
  void PublishMembers();
  common::TrapSite Site(const std::string& procedure) const;
  // Moves the focus by code; only a window on screen can take it.
  void FocusIfShown(forms::Control& control);
  bool IsFinal() const { return Finalizado; }

  // The save: the four checks, the account taken from the sub-account, the write.
  bool SaveChecksPass();
  void TakeAccountFromSubconta();
  bool WriteLine();
  void InsertLine(const LineLiterals& line);
  void RefuseSave(const std::string& message, forms::Control* focus);
  void NotifyHeaderEditor();

  // Account and sub-account fields.
  void ClearConta();
  void ClearSubConta();
  void FXConta_Codigo_Validate(int& Cancel);
  void FXSubconta_codigo_Validate(int& Cancel);
  void FXSubconta_codigo_GotFocus();
  void FXConta_Codigo_KeyDown(int& KeyCode, int Shift);
  void FXSubconta_codigo_KeyDown(int& KeyCode, int Shift);
  void FXConta_KeyDown(int& KeyCode, int Shift);
  void FXSubconta_KeyDown(int& KeyCode, int Shift);
  void FXConta_Find_ButtonClick(forms::ToolbarButton& Button);
  void FXSubconta_Find_ButtonClick(forms::ToolbarButton& Button);

  // Amounts and VAT.
  void FXDebito_GotFocus();
  void FXCredito_GotFocus();
  void FXIVA_Base_Tributavel_GotFocus();
  void FXDebito_LostFocus();
  void FXCredito_LostFocus();
  void FXIVA_Base_Tributavel_LostFocus();
  void FXDebito_Validate(int& Cancel);
  void FXCredito_Validate(int& Cancel);
  void FXDebito_KeyPress(int& KeyAscii);
  void FXDebito_KeyDown(int& KeyCode, int Shift);
  void FXCredito_KeyDown(int& KeyCode, int Shift);
  void SaveOnEnter_KeyDown(int& KeyCode, int Shift);
  void FXIVA_Click();
  void AmountValidate(forms::TextBox& amount, const char* procedure);
  void AmountKeyDown(forms::TextBox& amount, int KeyCode, forms::Control& whenZero,
                     const char* procedure);

  // Descriptions and the reference.
  void FXDescrit_ID_GotFocus();
  void FXDescrit_GotFocus();
  void FXDescrit_LostFocus();
  void FXDescrit_ID_LostFocus();
  void FXDescrit_ID_KeyDown(int& KeyCode, int Shift);
  void FXDescrit_KeyDown(int& KeyCode, int Shift);
  void FXRef_KeyDown(int& KeyCode, int Shift);
  void Toolbar1_ButtonClick(forms::ToolbarButton& Button);

  bool NovaLinha = false;
  bool Finalizado = false;
  // While a code is validated on leaving its field, filling the field does not move
  // the focus: the person's own move (a click on OK, say) must not be taken over.
  bool validatingConta_ = false;
  bool validatingSubconta_ = false;
  // The account finder lives while it is open; it calls DoFillConta back on this form.
  std::shared_ptr<forms::Form> accountFinder_;
  entry::FormLayout layout_;
};

}  // namespace lines
