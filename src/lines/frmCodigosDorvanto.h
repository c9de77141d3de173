#pragma once
// frmCodigosDorvanto, the picker of predefined line descriptions: a list of code and
// description, chosen with a double click, Enter or "&OK", left with "Cancelar".
//
// The opener shows it modally and reads Cancelar and the list's selected item when the
// modal display returns. So that there is something left to read, the picker never
// unloads while it is on screen: asked to, it only hides itself, and the opener then
// unloads it for good. The close box follows the same rule and, since it leaves
// Cancelar unset, counts as choosing the selected item.

#include "platform/forms/Forms.h"
#include "platform/vb/Object.h"

namespace lines {

class frmCodigosDorvanto : public forms::Form {
 public:
  frmCodigosDorvanto();

  // The form that opened the picker; the picker itself does not use it.
  // The opener; held weakly, as the opener keeps its picker.
  std::weak_ptr<vb::Object> MainForm;
  // Set when the person left with "Cancelar"; false whenever the picker opens.
  bool Cancelar = false;

  forms::ListView& ListView1 = Ctl<forms::ListView>("ListView1");
  forms::CommandButton& Command2 = Ctl<forms::CommandButton>("Command2");  // &OK
  forms::CommandButton& Command1 = Ctl<forms::CommandButton>("Command1");  // Cancelar

 protected:
  void Form_Load() override;
  void Form_Unload(int& Cancel) override;

 private:
  static forms::FormDesign Design();
  // Each trapped procedure first undoes a transaction left open on the shared
  // connection, then reports.
  void Trapped(const char* procedure, const std::function<void()>& body);

  void Command1_Click();
  void Command2_Click();
  void ListView1_ColumnClick(forms::ColumnHeader& ColumnHeader);
  void ListView1_BeforeLabelEdit(int& Cancel);
  void ListView1_DblClick();
  void ListView1_KeyDown(int& KeyCode, int Shift);
};

}  // namespace lines
