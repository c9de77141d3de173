// The header fields beyond loading and saving: F2 and F3 in every field, Delete in the
// journal-type list, the warning for an internal document number already used in the
// year, the series number of a final system document, and the password that unlocks
// a system document for this window.

#include <string>

#include "common/ErrorTrap.h"
#include "common/SqlServer.h"
#include "common/modCode.h"
#include "entry/SystemDocumentPassword.h"
#include "entry/frmMain.h"
#include "platform/vb/Conversions.h"

namespace entry {

namespace {

common::TrapSite Site(const char* procedure) { return common::FormSite("frmMain", procedure); }

}  // namespace

// ---- function keys ------------------------------------------------------------------------

// Only the key code counts (not Shift, Ctrl or Alt), and the field still gets the key.
// F2 opens the line editor whatever the entry's state; the line editor decides.
void frmMain::HeaderFieldKey(int KeyCode) {
  if (KeyCode == forms::vbKeyF2)
    NewLine();
  else if (KeyCode == forms::vbKeyF3)
    DoRestart();
}

void frmMain::HeaderField_KeyDown(const char* procedure, int KeyCode) {
  common::Trap(Site(procedure), [&] { HeaderFieldKey(KeyCode); });
}

void frmMain::FXDorvanto_No_KeyDown(int& KeyCode, int /*Shift*/) {
  common::Trap(Site("FXDorvanto_No_KeyDown"), [&] {
    if (KeyCode != forms::vbKeyF2 && KeyCode != forms::vbKeyF3) return;
    // The field keeps the focus, so the check of leaving it would not run before the
    // new line or the next entry.
    CheckDocumentNumber();
    HeaderFieldKey(KeyCode);
  });
}

void frmMain::FXTipo_Diario_ID_KeyDown(int& KeyCode, int /*Shift*/) {
  common::Trap(Site("FXTipo_Diario_ID_KeyDown"), [&] {
    // A drop-down list cannot be emptied by typing; Delete takes the journal type off.
    if (KeyCode == forms::vbKeyDelete)
      FXTipo_Diario_ID.SetListIndex(-1);
    else
      HeaderFieldKey(KeyCode);
  });
}

// ---- the internal document number ------------------------------------------------------------

void frmMain::FXDorvanto_No_LostFocus() {
  common::Trap(Site("FXDorvanto_No_LostFocus"), [&] { CheckDocumentNumber(); });
}

// Numbers are unique within a year, the year of the date in the form. The check only
// warns: the number stays and is saved. An empty number is the literal null, which
// equals nothing, so it never warns.
void frmMain::CheckDocumentNumber() {
  auto rs = ado::Recordset::Create();
  rs->Open("SELECT COUNT(*) as no FROM tbPOC_Dorvantos WHERE year(data) = " +
               std::to_string(vb::Year(vb::Variant(FXData.Value()))) + " AND dorvanto_no = " +
               common::SqlValue(vb::Variant(FXDorvanto_No.Text()), common::kSqlText) +
               " AND Dorvanto_ID <> " + std::to_string(Dorvanto_ID),
           common::SqlServer());
  const bool used = !rs->Eof() && !rs->Fields("no").Value().IsNull() && vb::CDbl(rs->Fields("no").Value()) != 0;
  rs->Close();
  if (used)
    forms::MsgBox("O número de documento interno que introduziu já existe na base de dados.",
                  forms::vbInformation, Caption());
}

// ---- the series number ----------------------------------------------------------------------

void frmMain::FXRelated_ID_Label_Click() { FXRelated_ID_DblClick(); }

// Only a final system document without one takes a series number. It goes to every
// line at once; the field shows it when the entry is next loaded.
void frmMain::FXRelated_ID_DblClick() {
  common::Trap(Site("FXRelated_ID_DblClick"), [&] {
    if (!Sistema) {
      forms::MsgBox("Este registo não pode ser alterado, o lançamento não é de sistema.",
                    forms::vbInformation);
      return;
    }
    if (!Finalizado) {
      forms::MsgBox("Este registo não pode ser alterado, o lançamento não está bloqueado.",
                    forms::vbInformation);
      return;
    }
    if (!FXRelated_ID.Text().empty()) {
      forms::MsgBox("Este registo não pode ser alterado, o lançamento já tem um Nº de Série "
                    "relacionado.",
                    forms::vbInformation);
      return;
    }
    if (forms::MsgBox("Deseja introduzir um Nº Serie para este registo?", forms::vbQuestion | forms::vbYesNo) !=
        forms::vbYes)
      return;
    const std::string answer = forms::InputBox("introduza o nº de sério relacionado:", "ID de Registo", "");
    if (answer.empty()) return;
    if (vb::IsNumeric(vb::Variant(answer))) {
      common::SqlServer()->Execute("UPDATE tbPOC_Dorvantos_Details SET related_id = " +
                                   common::SqlValue(vb::Variant(answer), common::kSqlNumber) +
                                   " WHERE dorvanto_id = " + std::to_string(Dorvanto_ID));
      return;
    }
    forms::MsgBox("O valor introduzido não é valido", forms::vbInformation);
  });
}

// ---- unlocking a system document ---------------------------------------------------------------

// The unlock lasts as long as the window and changes nothing in the database. It lifts
// the owner and closing-period checks of removing and finalizing; the save still
// checks the closing period.
void frmMain::Image1_DblClick() {
  common::Trap(Site("Image1_DblClick"), [&] {
    if (Desbloqueado) {
      forms::MsgBox("O registo já está desbloqueado.", forms::vbInformation);
      return;
    }
    const std::string typed = forms::InputBox("Digite a password:", "Alteração de Documento de Sistema", "");
    if (!typed.empty() && IsSystemDocumentPassword(typed)) {
      Desbloqueado = true;
      DoPaint();
      return;
    }
    forms::MsgBox("A password está errada.", forms::vbCritical);
  });
}

}  // namespace entry
