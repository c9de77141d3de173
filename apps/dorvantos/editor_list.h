#pragma once
// The host's main window: the entries of the journal in a list (date, journal type,
// document number, reference, state, total) read through the host's own connection,
// a button for a new entry and an entry opened by double click or Enter in the
// component's header editor. The component calls RemoteKey on the call-back object
// whenever an editor closes; the list is then read again and that entry selected.

#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "platform/ado/Connection.h"
#include "platform/forms/Forms.h"
#include "platform/vb/Object.h"

namespace app {

// The key of an entry's row in the list.
std::string EntryKey(int32_t dorvantoId);

class frmDiario : public forms::Form {
 public:
  // `database` is the host's connection; `component` a logged-in POC_Dorvantos.General.
  frmDiario(ado::ConnectionPtr database, vb::ObjectPtr component);

  forms::Label& Label1 = Ctl<forms::Label>("Label1");
  forms::ListView& ListView1 = Ctl<forms::ListView>("ListView1");
  forms::CommandButton& Command1 = Ctl<forms::CommandButton>("Command1");  // Novo lançamento
  forms::CommandButton& Command2 = Ctl<forms::CommandButton>("Command2");  // Abrir

  // Reads the entries again; selects `dorvantoId` when it is listed, else keeps the
  // entry selected before when it still is.
  void Refresh(std::optional<int32_t> dorvantoId = std::nullopt);
  // The object handed to the component as the caller: its RemoteKey refreshes this
  // list. It holds the window weakly, so a late call after the window is gone is
  // harmless.
  vb::ObjectPtr CallBack();
  // The entry of the selected row, if any.
  std::optional<int32_t> SelectedEntry() const;

 protected:
  void Form_Load() override;
  void Form_Resize() override;

 private:
  static forms::FormDesign Design();
  void Command1_Click();
  void Command2_Click();
  void ListView1_DblClick();
  void ListView1_KeyDown(int& KeyCode, int Shift);
  void OpenSelected();
  // Shows what went wrong in a box; the window stays usable.
  void Report(const std::exception& error);

  ado::ConnectionPtr database_;
  vb::ObjectPtr component_;
  vb::ObjectPtr callBack_;
  int32_t designWidth_ = 0, designHeight_ = 0;
};

}  // namespace app
