// Finalizing and reopening an entry. Finalizing numbers the lines that have no
// registration number yet from the shared counters of tbPOC_Contadores, freezes the
// account and sub-account texts the lines show into the lines themselves, stores the
// entry's amount and marks it final, all in one transaction. Reopening only clears the
// mark: numbers, years, frozen texts and the amount stay.
//
// Registration numbers are shared by every user of the database, so two people
// finalizing at the same moment must never draw the same number, and a finalization
// that commits must not leave a gap. The transaction therefore begins before the lines
// and the counter are first read, and the counter is read under an update lock held to
// the commit: every finalization waits for the one before it to commit or roll back.

#include <string>

#include "common/ErrorTrap.h"
#include "common/SqlServer.h"
#include "common/modCode.h"
#include "common/modFechos.h"
#include "component/LoginState.h"
#include "entry/frmMain.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Date.h"
#include "platform/vb/Error.h"

namespace entry {

namespace {

using common::SqlValue;

ado::RecordsetPtr Query(const std::string& sql) {
  auto rs = ado::Recordset::Create();
  rs->Open(sql, common::SqlServer());
  return rs;
}

void Execute(const std::string& sql) { common::SqlServer()->Execute(sql); }

std::string Key(int32_t id) { return std::to_string(id); }

std::string Whole(const vb::Variant& value) { return std::to_string(vb::CLng(value)); }

constexpr const char* kNoLines =
    "Não é possível finalizar este lançamento porque não existem registos.";

void BeginTransIfNone() {
  if (!common::IsTransactionOpen()) common::SqlServer()->BeginTrans();
}

}  // namespace

bool frmMain::DoFinalizar() {
  bool result = false;
  common::Trap(common::FormSite("frmMain", "DoFinalizar"), [&] {
    if (!Desbloqueado) {
      if (FXCreated_By.Text() != component::LoggedUser()) {
        ShowOwnerRefusal();
        return;
      }
      if (common::IsClosedDate(vb::Variant(FXData.Value()), common::SqlServer())) {
        ShowClosedPeriodRefusal();
        return;
      }
    }
    if (!DoGravar()) {
      forms::MsgBox("Não foi possível finalizar este lançamento.", forms::vbCritical, Caption());
      return;
    }
    Hourglass();
    // Disabled while the command runs, so a second click cannot start it again.
    FinalizeButton().SetEnabled(false);
    auto refused = [&] {
      FinalizeButton().SetEnabled(true);
      DefaultPointer();
    };

    if (FXTipo_Diario_ID.ListIndex() < 0) {
      forms::MsgBox("Tem de indicar o Diário para poder finalizar o lançamento.", forms::vbInformation,
                    Caption());
      if (Visible()) FXTipo_Diario_ID.SetFocus();
      refused();
      return;
    }

    auto entry = Query("SELECT * FROM tbPOC_Dorvantos WHERE dorvanto_id = " + Key(Dorvanto_ID));
    // An entry another window removed meanwhile has nothing left to finalize.
    if (!entry->Eof()) {
      const vb::Variant& finalizado = entry->Fields("finalizado").Value();
      const bool isFinal = finalizado.IsNull() || vb::CDbl(finalizado) != 0;
      if (!isFinal) {
        if (!FinalizeOpenEntry()) {
          entry->Close();
          refused();
          return;
        }
      } else {
        AskReopen();
      }
    }
    entry->Close();
    DoPaint();
    forms::DoEvents();
    ClearUnsaved();
    FinalizeButton().SetEnabled(true);
    DefaultPointer();
    result = true;
  }, [&] {
    DefaultPointer();
    if (common::IsTransactionOpen()) common::SqlServer()->RollbackTrans();
    // The entry is still open after a failure: the person must be able to try again.
    if (Loaded()) FinalizeButton().SetEnabled(true);
  });
  return result;
}

// Step by step: balance, lines, then the one transaction. Returns false on a refusal,
// with nothing written.
bool frmMain::FinalizeOpenEntry() {
  DoFillTotais();
  // The displayed texts decide, as they do for the line editor: sums within a cent of
  // each other that show the same are balanced.
  if (FXTotal_Creditos.Text() != FXTotal_Debitos.Text()) {
    forms::MsgBox("Não é possível finalizar este lançamento porque o total de débitos é diferente "
                  "do total de créditos.",
                  forms::vbInformation, Caption());
    return false;
  }
  if (!ListHasItems()) {
    forms::MsgBox(kNoLines, forms::vbInformation, Caption());
    return false;
  }

  const std::string id = Key(Dorvanto_ID);
  BeginTransIfNone();
  auto lines = Query("SELECT * FROM vwPOC_Dorvantos_Details WHERE dorvanto_id = " + id);
  if (lines->Eof()) {
    lines->Close();
    if (common::IsTransactionOpen()) common::SqlServer()->RollbackTrans();
    forms::MsgBox(kNoLines, forms::vbInformation, Caption());
    return false;
  }

  const std::string when = SqlValue(vb::Variant(FXData.Value()), common::kSqlDate);
  for (; !lines->Eof(); lines->MoveNext()) {
    auto field = [&](const char* name) -> const vb::Variant& { return lines->Fields(name).Value(); };
    const vb::Variant diarioId = field("diario_id");
    // A line keeps the number it got at an earlier finalization.
    if (field("reg_no").IsNull()) NumberLine(diarioId);
    BeginTransIfNone();
    Execute("UPDATE tbPOC_Dorvantos_Details SET codigo_completo = " +
            SqlValue(field("codigo_completo_list"), common::kSqlText) +
            ", conta = " + SqlValue(field("conta_list"), common::kSqlText) +
            ", conta_descrit = " + SqlValue(field("conta_descrit_list"), common::kSqlText) +
            ", sub_conta = " + SqlValue(field("sub_conta_list"), common::kSqlText) +
            ", sub_conta_descrit = " + SqlValue(field("sub_conta_descrit_list"), common::kSqlText) +
            ", data = " + when + " WHERE diario_id = " + Whole(diarioId));
  }
  lines->Close();

  BeginTransIfNone();
  Execute("UPDATE tbPOC_Dorvantos SET finalizado = 1, valor = " +
          SqlValue(vb::Variant(FXTotal_Creditos.Tag()), common::kSqlNumber) +
          " WHERE dorvanto_id = " + id);
  // A final entry and a locked system document keep the date they have.
  if (FXData.Enabled()) {
    const std::string day = SqlValue(vb::Variant(vb::DateOnly(FXData.Value())), common::kSqlDate);
    Execute("UPDATE tbPOC_Dorvantos SET data = " + day + " WHERE Dorvanto_ID = " + id);
    Execute("UPDATE tbPOC_Dorvantos_Details SET data = " + day + " WHERE Dorvanto_ID = " + id);
  }
  if (common::IsTransactionOpen()) common::SqlServer()->CommitTrans();

  DoFillDorvantos();
  Finalizado = true;
  forms::DoEvents();
  ClearUnsaved();
  return true;
}

// The counter 'reg_no' holds the next number to hand out. Read under an update lock
// held to the commit, so no other finalization reads it before this one is done. A
// database without the row starts at 1 with this line and stores 2.
void frmMain::NumberLine(const vb::Variant& diarioId) {
  BeginTransIfNone();
  std::string number;
  auto regNo = Query("SELECT * FROM tbPOC_Contadores WITH (UPDLOCK, HOLDLOCK) WHERE nome = 'reg_no'");
  if (regNo->Eof()) {
    Execute("INSERT INTO tbPOC_Contadores (nome, contador) VALUES ('reg_no',2)");
    number = "1";
  } else {
    number = Whole(regNo->Fields("contador").Value());
    Execute("UPDATE tbPOC_Contadores SET contador = contador + 1 WHERE nome = 'reg_no'");
  }
  regNo->Close();

  // The year lines are stamped with is the counter's, kept in step with the accounting
  // year elsewhere; only a database without it takes the server's year.
  std::string year;
  auto ano = Query("SELECT * FROM tbPOC_Contadores WHERE nome = 'ano'");
  if (ano->Eof()) {
    const vb::Variant today = common::GetServerDate();
    if (today.IsNull()) throw vb::Error(vb::kErrInvalidUseOfNull);
    year = std::to_string(vb::Year(today));
    Execute("INSERT INTO tbPOC_Contadores (nome, contador) VALUES ('ano'," + year + ")");
  } else {
    year = Whole(ano->Fields("contador").Value());
  }
  ano->Close();

  Execute("UPDATE tbPOC_Dorvantos_Details SET reg_no = " + number + ", ano = " + year +
          " WHERE diario_id = " + Whole(diarioId));
}

// Reopening clears only the mark; it runs outside any transaction.
void frmMain::AskReopen() {
  if (forms::MsgBox("Deseja reabrir este lançamento?", forms::vbQuestion | forms::vbYesNo, Caption()) !=
      forms::vbYes)
    return;
  Execute("UPDATE tbPOC_Dorvantos SET finalizado = 0 WHERE dorvanto_id = " + Key(Dorvanto_ID));
  Finalizado = false;
  forms::DoEvents();
  ClearUnsaved();
}

}  // namespace entry
