// The entry's lifecycle in the header editor: a new entry, loading one, saving and
// removing the header, the restart after finalizing, the totals and the journal-type
// counter. No statement here runs in a transaction: each commits on its own, so a
// failure half-way leaves the earlier statements done.

#include <string>

#include "common/ErrorTrap.h"
#include "common/SqlServer.h"
#include "common/modCode.h"
#include "common/modControls.h"
#include "common/modFechos.h"
#include "common/modRegistry.h"
#include "component/LoginState.h"
#include "entry/frmMain.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"
#include "platform/vb/Format.h"

namespace entry {

namespace {

using common::ControlSqlValue;
using common::SetControlValue;
using common::SqlValue;

common::TrapSite Site(const char* procedure) { return common::FormSite("frmMain", procedure); }

ado::RecordsetPtr Query(const std::string& sql) {
  auto rs = ado::Recordset::Create();
  rs->Open(sql, common::SqlServer());
  return rs;
}

void Execute(const std::string& sql) { common::SqlServer()->Execute(sql); }

std::string Key(int32_t id) { return std::to_string(id); }

// 0/1 flags: a null finalizado counts as final, a null sistema as an ordinary entry.
bool FlagSet(const vb::Variant& value, bool whenNull) {
  return value.IsNull() ? whenNull : vb::CDbl(value) != 0;
}

// The second paragraph of both security refusals, after a line feed, carriage return,
// line feed, carriage return.
const std::string kNoPermission =
    "\n\r\n\rNão tem permissões para alterar registos dentro do periodo de fecho, contacte o "
    "administrador do sistema para que este lhe estabeleça as permissões necessárias.";
constexpr const char* kSecurityTitle = "Sistema de Segurança";
constexpr const char* kSaveFailed = "Não foi possível gravar as alterações.";

// Selects the entry of a drop-down list whose item data is the value; none when no
// entry has it, so a value of another entry is never left selected.
void SelectItemData(forms::ComboBox& list, const vb::Variant& value) {
  list.SetListIndex(-1);
  SetControlValue(list, value, common::kValuePlain);
}

}  // namespace

void frmMain::DefaultPointer() {
  if (Loaded()) SetMousePointer(forms::vbDefault);
}

void frmMain::ShowClosedPeriodRefusal() {
  forms::MsgBox("Não é possivel realizar o comando! Este registo está bloqueado." + kNoPermission,
                forms::vbCritical | forms::vbSystemModal, kSecurityTitle);
}

void frmMain::ShowOwnerRefusal() {
  forms::MsgBox("Não é possivel realizar o comando! Este registo está bloqueado porque pertence "
                "ao user '" + FXCreated_By.Text() + "'." + kNoPermission,
                forms::vbCritical | forms::vbSystemModal, kSecurityTitle);
}

// ---- a new entry -----------------------------------------------------------------

void frmMain::DoInsert() {
  common::Trap(Site("DoInsert"), [&] {
    Hourglass();
    // The row exists from now on, whatever the person does next: only DoRemove
    // deletes it.
    Execute("INSERT INTO tbPOC_Dorvantos (data, dorvanto_no, tipo_diario_id, created_by, obs, "
            "valor, finalizado) VALUES (GETDATE(), null, null, " +
            SqlValue(component::LoggedUser(), common::kSqlText) + ", null, 0, 0)");
    int32_t key = 0;
    auto rs = Query("SELECT @@Identity as last");
    if (!rs->Eof() && !rs->Fields("last").Value().IsNull()) key = vb::CLng(rs->Fields("last").Value());
    rs->Close();
    if (key == 0) {
      Unload();
      return;
    }
    DoOpen(key);
    ApplyRememberedDefaults();
    DoFillContador();
    DefaultPointer();
  }, [&] { DefaultPointer(); });
}

// The date and journal type of the last save become the new entry's. They are set
// after DoOpen cleared the unsaved mark, so the entry shows as changed and the
// defaults reach the database with its first save.
void frmMain::ApplyRememberedDefaults() {
  const vb::Variant lastData = common::ObterValorString(kPocSettingsKey, "LastData");
  if (vb::IsDate(lastData)) FXData.SetValue(vb::CDate(lastData));
  const vb::Variant lastDiario = common::ObterValorString(kPocSettingsKey, "LastDiario_ID");
  if (vb::IsNumeric(lastDiario)) SelectItemData(FXTipo_Diario_ID, lastDiario);
}

// ---- loading an entry --------------------------------------------------------------

void frmMain::DoOpen(int32_t dorvantoId, int32_t diarioId) {
  common::Trap(Site("DoOpen"), [&] {
    Hourglass();
    Dorvanto_ID = dorvantoId;
    Diario_ID = diarioId;
    Desbloqueado = false;
    auto header = Query("SELECT * FROM tbPOC_Dorvantos WHERE dorvanto_id = " + Key(dorvantoId));
    if (!header->Eof()) ShowHeader(header);
    header->Close();
    ShowLineFields(dorvantoId);
    // Filling the fields raised their change events; nothing is unsaved yet.
    ClearUnsaved();
    DoPaint();
    DoFillDorvantos();
    Show();
    DefaultPointer();
  }, [&] { DefaultPointer(); });
}

void frmMain::ShowHeader(const ado::RecordsetPtr& header) {
  auto field = [&](const char* name) -> const vb::Variant& { return header->Fields(name).Value(); };
  SetControlValue(FXData, field("data"), common::kValuePlain);
  SelectItemData(FXTipo_Diario_ID, field("tipo_diario_id"));
  SetControlValue(FXCreated_By, field("created_by"), common::kValuePlain);
  SetControlValue(FXObs, field("obs"), common::kValuePlain);
  SetControlValue(FXDorvanto_No, field("dorvanto_no"), common::kValuePlain);
  SetControlValue(FXReferencia, field("referencia"), common::kValuePlain);
  Sistema = FlagSet(field("sistema"), false);

  // The system code, with its name; a window reused for another entry must not keep
  // showing the code of the entry before.
  FXTipo_ID.SetText("");
  const vb::Variant tipoId = field("tipo_id");
  if (!tipoId.IsNull()) {
    auto tipo = Query("SELECT * FROM tbContactos_ContasCorrentes_Tipos WHERE tipo_id = " +
                      Key(vb::CLng(tipoId)));
    if (!tipo->Eof() && !tipo->Fields("descrit").Value().IsNull())
      FXTipo_ID.SetText(vb::CStr(tipoId) + " - " + vb::CStr(tipo->Fields("descrit").Value()));
    tipo->Close();
  }
  Finalizado = FlagSet(field("finalizado"), true);
}

// The integration type and series number are the same on every line of an entry, so
// any one line tells them. They are cleared first: the header save writes them to
// every line, and a window reused for another entry must not carry the last entry's
// values onto this one's lines.
void frmMain::ShowLineFields(int32_t dorvantoId) {
  SelectItemData(FXTipo, vb::Variant::Null());
  SetControlValue(FXRelated_ID, vb::Variant::Null(), common::kValuePlain);
  auto line = Query("SELECT TOP 1 * FROM tbPOC_Dorvantos_Details WHERE dorvanto_id = " + Key(dorvantoId));
  if (!line->Eof()) {
    SelectItemData(FXTipo, line->Fields("tipo_id").Value());
    SetControlValue(FXRelated_ID, line->Fields("related_id").Value(), common::kValuePlain);
  }
  line->Close();
}

// ---- saving the header ---------------------------------------------------------------

bool frmMain::DoGravar() {
  bool result = false;
  common::Trap(Site("DoGravar"), [&] {
    try {
      if (common::IsClosedDate(vb::Variant(FXData.Value()), common::SqlServer())) {
        ShowClosedPeriodRefusal();
        DefaultPointer();
        return;
      }
      ClearUnsaved();
      Hourglass();
      if (Dorvanto_ID != 0) {
        WriteHeader();
        ClearUnsaved();
        result = true;
        Execute("UPDATE tbPOC_Dorvantos_Details SET related_id = " +
                SqlValue(vb::Variant(FXRelated_ID.Text()), common::kSqlNumber) +
                ", tipo_id = " + ControlSqlValue(FXTipo, common::kValuePlain) +
                " WHERE Dorvanto_ID = " + Key(Dorvanto_ID));
        RememberDefaults();
      } else {
        forms::MsgBox(kSaveFailed, forms::vbCritical, Caption());
      }
      DoFillContador();
      DefaultPointer();
    } catch (const vb::Error& e) {
      forms::MsgBox(std::string("Erro: ") + kSaveFailed + " " + e.Description());
      throw;
    } catch (const std::exception& e) {
      forms::MsgBox(std::string("Erro: ") + kSaveFailed + " " + e.what());
      throw;
    }
  }, [&] { DefaultPointer(); });
  return result;
}

// The date is written only while the date field is editable: a final entry and a
// locked system document keep theirs, and so do their lines.
void frmMain::WriteHeader() {
  const std::string id = Key(Dorvanto_ID);
  const std::string rest =
      ", referencia = " + SqlValue(vb::Variant(FXReferencia.Text()), common::kSqlText) +
      ", tipo_diario_id = " + ControlSqlValue(FXTipo_Diario_ID, common::kValuePlain) +
      ", obs = " + SqlValue(vb::Variant(FXObs.Text()), common::kSqlText) +
      ", dorvanto_no = " + SqlValue(vb::Variant(FXDorvanto_No.Text()), common::kSqlText) +
      " WHERE Dorvanto_ID = " + id;
  if (FXData.Enabled()) {
    const std::string day = SqlValue(vb::Variant(vb::DateOnly(FXData.Value())), common::kSqlDate);
    Execute("UPDATE tbPOC_Dorvantos SET data = " + day + rest);
    Execute("UPDATE tbPOC_Dorvantos_Details SET data = " + day + " WHERE Dorvanto_ID = " + id);
  } else {
    Execute("UPDATE tbPOC_Dorvantos SET tipo_diario_id = " +
            ControlSqlValue(FXTipo_Diario_ID, common::kValuePlain) +
            ", referencia = " + SqlValue(vb::Variant(FXReferencia.Text()), common::kSqlText) +
            ", obs = " + SqlValue(vb::Variant(FXObs.Text()), common::kSqlText) +
            ", dorvanto_no = " + SqlValue(vb::Variant(FXDorvanto_No.Text()), common::kSqlText) +
            " WHERE Dorvanto_ID = " + id);
  }
}

// The next new entry starts with this one's day and journal type.
void frmMain::RememberDefaults() {
  if (FXTipo_Diario_ID.ListIndex() >= 0)
    common::DefinirValorString(kPocSettingsKey, "LastDiario_ID",
                               Key(FXTipo_Diario_ID.ItemData(FXTipo_Diario_ID.ListIndex())));
  common::DefinirValorString(kPocSettingsKey, "LastData",
                             vb::Format(vb::Variant(FXData.Value()), "dd-mm-yyyy"));
}

// ---- removing the entry ----------------------------------------------------------------

void frmMain::DoRemove(int32_t /*p_ID: the entry removed is always this window's*/) {
  common::Trap(Site("DoRemove"), [&] {
    Hourglass();
    if (!Desbloqueado) {
      if (common::IsClosedDate(vb::Variant(FXData.Value()), common::SqlServer())) {
        ShowClosedPeriodRefusal();
        DefaultPointer();
        return;
      }
      if (FXCreated_By.Text() != component::LoggedUser()) {
        ShowOwnerRefusal();
        DefaultPointer();
        return;
      }
    }
    const std::string id = Key(Dorvanto_ID);
    auto rs = Query("SELECT * FROM tbPOC_Dorvantos WHERE dorvanto_id = " + id);
    const bool gone = rs->Eof();
    rs->Close();
    if (gone) {
      // Another window removed it already: there is nothing left to show.
      Hide();
      Unload();
      return;
    }
    if (forms::MsgBox("Deseja mesmo remover este lançamento ?", forms::vbQuestion | forms::vbYesNo,
                      "Remover lançamento") == forms::vbYes) {
      // Lines first: nothing deletes them with their entry.
      Execute("DELETE FROM tbPOC_Dorvantos_Details WHERE Dorvanto_ID = " + id);
      Execute("DELETE FROM tbPOC_Dorvantos WHERE Dorvanto_ID = " + id);
      ClearUnsaved();
      Hide();
      Unload();
      return;
    }
    DefaultPointer();
  }, [&] { DefaultPointer(); });
}

// ---- save, finalize and go on with a new entry ------------------------------------------

void frmMain::DoRestart() {
  common::Trap(Site("DoRestart"), [&] {
    DoGravar();
    if (!vb::CBool(Call("DoFinalizar"))) return;
    Hide();
    RestartForm = windows_.HeaderEditor();
    RestartForm->Let("MainClass", vb::Variant(MainClass.lock()));
    RestartForm->Let("CallBackClass", vb::Variant(CallBackClass));
    RestartForm->Call("DoInsert");
    forms::DoEvents();
    Unload();
  }, [&] {
    DefaultPointer();
    if (common::IsTransactionOpen()) common::SqlServer()->RollbackTrans();
  });
}

// ---- totals and the journal-type counter ---------------------------------------------------

void frmMain::DoFillTotais() {
  common::Trap(Site("DoFillTotais"), [&] {
    Hourglass();
    vb::Variant debitos(int32_t{0});
    vb::Variant creditos(int32_t{0});
    if (Dorvanto_ID != 0) {
      auto rs = Query("SELECT sum(debito) as debitos, sum(credito) as creditos FROM "
                      "tbPOC_Dorvantos_Details WHERE dorvanto_id = " + Key(Dorvanto_ID));
      if (!rs->Eof()) {
        // An entry without lines sums to null: it shows zero.
        if (!rs->Fields("debitos").Value().IsNull()) debitos = rs->Fields("debitos").Value();
        if (!rs->Fields("creditos").Value().IsNull()) creditos = rs->Fields("creditos").Value();
      }
      rs->Close();
    }
    // The Tag keeps the raw sum (finalizing stores it); the Text is what the line
    // editor compares to decide whether the entry balances.
    SetControlValue(FXTotal_Creditos, creditos, common::kValuePlain);
    SetControlValue(FXTotal_Debitos, debitos, common::kValuePlain);
    common::FormatControlText(FXTotal_Creditos, common::kValueEuro);
    common::FormatControlText(FXTotal_Debitos, common::kValueEuro);
    DoFillContador();
    DefaultPointer();
  }, [&] { DefaultPointer(); });
}

// Every entry of the selected journal type on the entry's day, final or not, this one
// included, counts with the valor it has in the database.
void frmMain::DoFillContador() {
  common::Trap(Site("DoFillContador"), [&] {
    const std::string day = vb::Format(vb::Variant(FXData.Value()), "yyyy-mm-dd");
    auto rs = Query("SELECT SUM(valor) as total FROM tbPOC_Dorvantos WHERE tipo_diario_id = " +
                    ControlSqlValue(FXTipo_Diario_ID, common::kValuePlain) +
                    " AND data >= CONVERT(DATETIME, '" + day + " 0:00:00',102) AND data <= "
                    "CONVERT(DATETIME, '" + day + " 23:59:59',102)");
    vb::Variant total(int32_t{0});
    if (!rs->Eof() && !rs->Fields("total").Value().IsNull()) total = rs->Fields("total").Value();
    rs->Close();
    SetControlValue(FXContador, total, common::kValuePlain);
    common::FormatControlText(FXContador, common::kValueEuro);
  });
}

// ---- lines and the caller -------------------------------------------------------------------

// The list's colour is the window's own test for an entry that takes new lines: DoPaint
// gives it the window background exactly when the entry is neither final nor a
// locked system document.
void frmMain::DoInsertDorvanto() {
  common::Trap(Site("DoInsertDorvanto"), [&] {
    if (ListView1.BackColor() != forms::vbWindowBackground) return;
    NewDetailsForm()->Call("DoInsert", {vb::Variant(Dorvanto_ID)});
  });
}

// Windows that treat this one as their caller tell it their key; it has nothing to do
// with it.
void frmMain::RemoteKey(int32_t /*ID*/) {}

}  // namespace entry
