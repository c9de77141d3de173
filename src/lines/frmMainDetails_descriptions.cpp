// The line's description: a code typed (or part of one) brings the matching predefined
// description, the picker offers them all, and both fields stay free text. The
// reference is the last plain field before the amounts.

#include <memory>
#include <string>

#include "common/SqlServer.h"
#include "common/modCode.h"
#include "common/modControls.h"
#include "lines/WaitCursor.h"
#include "lines/frmCodigosDorvanto.h"
#include "lines/frmMainDetails.h"
#include "platform/ado/Recordset.h"

namespace lines {

namespace {

ado::RecordsetPtr Read(const std::string& sql) {
  ado::RecordsetPtr rs = ado::Recordset::Create();
  rs->Open(sql, common::SqlServer());
  return rs;
}

bool IsNextKey(int KeyCode) { return KeyCode == forms::vbKeyReturn || KeyCode == forms::vbKeyRight; }

}  // namespace

void frmMainDetails::FXDescrit_ID_GotFocus() {
  common::Trap(Site("FXDescrit_ID_GotFocus"), [&] { common::BeginEdit(FXDescrit_ID, common::kValueText); });
}

void frmMainDetails::FXDescrit_GotFocus() {
  common::Trap(Site("FXDescrit_GotFocus"), [&] { common::BeginEdit(FXDescrit, common::kValueText); });
}

void frmMainDetails::FXDescrit_LostFocus() {
  common::Trap(Site("FXDescrit_LostFocus"), [&] { common::EndEdit(FXDescrit, common::kValueText); });
}

// Every code that contains the typed text matches; the first row the database returns
// gives the description. No match empties the code and leaves the description.
void frmMainDetails::FXDescrit_ID_LostFocus() {
  common::Trap(Site("FXDescrit_ID_LostFocus"), [&] {
    if (!Command1.Visible()) return;
    WaitCursor wait(*this);
    ado::RecordsetPtr rs = Read("SELECT * FROM tbPOC_Dorvantos_Codigos WHERE codigo like '%" +
                                common::Trtf(FXDescrit_ID.Text()) + "%'");
    if (rs->Eof())
      FXDescrit_ID.SetText("");
    else
      common::SetControlValue(FXDescrit, rs->Fields("descrit").Value(), common::kValuePlain);
    rs->Close();
  });
}

void frmMainDetails::FXDescrit_ID_KeyDown(int& KeyCode, int Shift) {
  common::Trap(Site("FXDescrit_ID_KeyDown"), [&] {
    if (IsNextKey(KeyCode)) {
      FocusIfShown(FXDescrit);
    } else if (KeyCode == forms::vbKeyLeft) {
      FocusIfShown(FXSubconta_codigo);
    } else if (KeyCode == forms::vbKeyAdd) {
      KeyCode = 0;  // the plus opens the picker; it is not part of the code
      DoProcurarCodigos();
    }
  });
}

void frmMainDetails::FXDescrit_KeyDown(int& KeyCode, int Shift) {
  common::Trap(Site("FXDescrit_KeyDown"), [&] {
    if (IsNextKey(KeyCode))
      FocusIfShown(FXRef);
    else if (KeyCode == forms::vbKeyLeft)
      FocusIfShown(FXDescrit_ID);
  });
}

void frmMainDetails::FXRef_KeyDown(int& KeyCode, int Shift) {
  common::Trap(Site("FXRef_KeyDown"), [&] {
    if (IsNextKey(KeyCode))
      FocusIfShown(FXDebito);
    else if (KeyCode == forms::vbKeyLeft)
      FocusIfShown(FXDescrit);
  });
}

void frmMainDetails::Toolbar1_ButtonClick(forms::ToolbarButton&) { DoProcurarCodigos(); }

// The picker is modal: when it returns, its state says whether and what was chosen.
void frmMainDetails::DoProcurarCodigos() {
  common::Trap(Site("DoProcurarCodigos"), [&] {
    WaitCursor wait(*this);
    auto picker = std::make_shared<frmCodigosDorvanto>();
    // Unloaded on every way out, so no hidden picker outlives this call.
    struct UnloadAtEnd {
      forms::Form& form;
      ~UnloadAtEnd() {
        if (form.Loaded()) form.Unload();
      }
    } unloadAtEnd{*picker};
    picker->MainForm = shared_from_this();
    picker->Show(forms::vbModal, this);
    const forms::ListItem* chosen =
        picker->Cancelar ? nullptr : picker->ListView1.SelectedItem();
    if (chosen) {
      const std::string key = common::SqlValue(vb::Variant(chosen->Key().substr(1)), common::kSqlNumber);
      ado::RecordsetPtr rs = Read("SELECT * FROM tbPOC_Dorvantos_Codigos WHERE descrit_id = " + key);
      if (rs->Eof()) {
        FXDescrit_ID.SetText("");
        FXDescrit.SetText("");
      } else {
        common::SetControlValue(FXDescrit_ID, rs->Fields("codigo").Value(), common::kValuePlain);
        common::SetControlValue(FXDescrit, rs->Fields("descrit").Value(), common::kValuePlain);
      }
      rs->Close();
    }
  });
}

}  // namespace lines
