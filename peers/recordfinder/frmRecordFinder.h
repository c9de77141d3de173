#pragma once
// The finder's window: a search box over a list of rows. Typing a code or part of a
// name narrows the list as the person types, the first row left is the one selected,
// and a double click, Enter or "&OK" chooses the selected row. "Cancelar" and the
// close box choose nothing.

#include <cstdint>
#include <string>

#include "FinderTables.h"
#include "platform/forms/Forms.h"

namespace recordfinder {

class frmRecordFinder : public forms::Form {
 public:
  explicit frmRecordFinder(FinderTable table);

  // The key of the row chosen; 0 until one is.
  int32_t Chosen = 0;

  forms::Label& Label1 = Ctl<forms::Label>("Label1");
  forms::TextBox& Text1 = Ctl<forms::TextBox>("Text1");
  forms::ListView& ListView1 = Ctl<forms::ListView>("ListView1");
  forms::CommandButton& Command1 = Ctl<forms::CommandButton>("Command1");  // &OK
  forms::CommandButton& Command2 = Ctl<forms::CommandButton>("Command2");  // Cancelar

 protected:
  void Form_Load() override;

 private:
  static forms::FormDesign Design();
  // Shows the rows that match the search text, the first of them selected.
  void ShowMatchingRows();

  void Text1_Change();
  void Text1_KeyDown(int& KeyCode, int Shift);
  void ListView1_DblClick();
  void ListView1_KeyDown(int& KeyCode, int Shift);
  void ListView1_BeforeLabelEdit(int& Cancel);
  void Command1_Click();
  void Command2_Click();

  FinderTable table_;
};

}  // namespace recordfinder
