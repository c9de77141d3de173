#pragma once
// Two windows with every kind of control, to look at the renderer: an entry editor
// with its lines list, and an account finder shown modally from it.

#include "platform/forms/Forms.h"

namespace dvqt::demo {

class frmDemoFinder : public forms::Form {
 public:
  frmDemoFinder();
  forms::TreeView& TreeView1 = Ctl<forms::TreeView>("TreeView1");
  forms::ListBox& List1 = Ctl<forms::ListBox>("List1");
  forms::CommandButton& Command1 = Ctl<forms::CommandButton>("Command1");
  forms::CommandButton& Command2 = Ctl<forms::CommandButton>("Command2");
  std::string chosen;

 private:
  void Form_Load() override;
};

class frmDemoEntry : public forms::Form {
 public:
  frmDemoEntry();
  forms::Toolbar& Toolbar1 = Ctl<forms::Toolbar>("Toolbar1");
  forms::TextBox& FXDorvanto_No = Ctl<forms::TextBox>("FXDorvanto_No");
  forms::DTPicker& FXData = Ctl<forms::DTPicker>("FXData");
  forms::ComboBox& FXTipo = Ctl<forms::ComboBox>("FXTipo");
  forms::TextBox& FXReferencia = Ctl<forms::TextBox>("FXReferencia");
  forms::TextBox& FXObs = Ctl<forms::TextBox>("FXObs");
  forms::ListView& ListView1 = Ctl<forms::ListView>("ListView1");
  forms::TextBox& FXTotal_Debitos = Ctl<forms::TextBox>("FXTotal_Debitos");
  forms::TextBox& FXTotal_Creditos = Ctl<forms::TextBox>("FXTotal_Creditos");
  forms::ProgressBar& ProgressBar1 = Ctl<forms::ProgressBar>("ProgressBar1");
  forms::CheckBox& Check1 = Ctl<forms::CheckBox>("Check1");
  forms::OptionButton& Option1 = Ctl<forms::OptionButton>("Option1");
  forms::CommandButton& cmdProcurar = Ctl<forms::CommandButton>("cmdProcurar");
  forms::Menu& mnLinhas = Ctl<forms::Menu>("mnLinhas");

 private:
  void Form_Load() override;
  void Form_QueryUnload(int& Cancel, int UnloadMode) override;
  void AddLine(const std::string& conta, double debito, double credito);
  void ListView1_KeyDown(int& KeyCode, int Shift);
  void ListView1_MouseUp(int Button, int Shift, float X, float Y);
  void FXReferencia_Validate(int& Cancel);
  void Toolbar1_ButtonClick(forms::ToolbarButton& Button);
  void cmdProcurar_Click();
  int lines_ = 0;
};

}  // namespace dvqt::demo
