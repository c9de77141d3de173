// DoGravar: the four checks in order, the account taken from the sub-account, then the
// INSERT of a new line or the UPDATE of an existing one.

#include <string>

#include "common/SqlServer.h"
#include "common/modCode.h"
#include "common/modControls.h"
#include "common/modFechos.h"
#include "lines/LineStatements.h"
#include "lines/frmMainDetails.h"
#include "platform/ado/Recordset.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace lines {

namespace {

void ShowSaveError(const std::string& description) {
  forms::MsgBox("Erro: Não foi possível gravar as alterações. " + description, forms::vbOKOnly);
}

bool IsNonZeroNumber(const std::string& raw) {
  const vb::Variant value(raw);
  return vb::IsNumeric(value) && vb::CDbl(value) != 0.0;
}

}  // namespace

bool frmMainDetails::DoGravar() {
  bool saved = false;
  common::Trap(Site("DoGravar"), [&] {
    try {
      if (!SaveChecksPass()) return;
      TakeAccountFromSubconta();
      saved = WriteLine();
    } catch (const vb::Error& e) {
      ShowSaveError(e.Description());
      throw;
    } catch (const std::exception& e) {
      ShowSaveError(e.what());
      throw;
    }
  });
  return saved;
}

void frmMainDetails::RefuseSave(const std::string& message, forms::Control* focus) {
  forms::MsgBox(message, forms::vbCritical | forms::vbOKOnly, Caption());
  if (focus) FocusIfShown(*focus);
}

// Exactly one amount, an account and a sub-account. An empty stored amount cannot be
// read as a number: that raises, and the save fails with its error message.
bool frmMainDetails::SaveChecksPass() {
  const float debito = vb::CSng(vb::Variant(FXDebito.Tag()));
  const float credito = vb::CSng(vb::Variant(FXCredito.Tag()));
  if (debito == 0 && credito == 0) {
    RefuseSave("Tem definir um valor para o campo débito ou crédito, não podem ser os dois "
               "iguais a zero.",
               nullptr);
    return false;
  }
  if (debito != 0 && credito != 0) {
    RefuseSave("Tem de definir um valor para um dos campos de débito ou crédito, não pode "
               "definir valor nos dois.",
               &FXDebito);
    return false;
  }
  if (FXConta.Text().empty()) {
    RefuseSave("Tem de indicar a conta para este lançamento.", &FXConta);
    return false;
  }
  if (FXSubconta.Text().empty()) {
    RefuseSave("Tem de indicar a subconta deste lançamento.", &FXSubconta);
    return false;
  }
  return true;
}

// A line is booked to its sub-account's own account, whatever the account fields
// showed: the two can never disagree in the table.
void frmMainDetails::TakeAccountFromSubconta() {
  if (!IsNonZeroNumber(FXSubconta.Tag())) return;
  ado::RecordsetPtr rs = ado::Recordset::Create();
  rs->Open("SELECT * FROM vwPOC_SubContas WHERE sub_conta_id = " + FXSubconta.Tag(),
           common::SqlServer());
  if (!rs->Eof()) {
    FXConta_Codigo.SetText(vb::CStr(rs->Fields("conta_codigo").Value()));
    FXConta.SetText(vb::CStr(rs->Fields("conta_descrit").Value()));
    FXConta.SetTag(vb::CStr(rs->Fields("conta_id").Value()));
  }
  rs->Close();
}

bool frmMainDetails::WriteLine() {
  using common::SqlValue;
  const auto number = [](const std::string& raw) { return SqlValue(vb::Variant(raw), common::kSqlNumber); };
  const auto text = [](const std::string& shown) { return SqlValue(vb::Variant(shown), common::kSqlText); };
  LineLiterals line{
      .dorvanto_id = SqlValue(vb::Variant(Dorvanto_ID), common::kSqlNumber),
      .conta_id = number(FXConta.Tag()),
      .sub_conta_id = number(FXSubconta.Tag()),
      .codigo = text(FXDescrit_ID.Text()),
      .descrit = text(FXDescrit.Text()),
      .ref = text(FXRef.Text()),
      .debito = number(FXDebito.Tag()),
      .credito = number(FXCredito.Tag()),
      .iva = FXIVA.Value() != forms::vbUnchecked,
      .iva_tx_id = common::ControlSqlValue(FXIVA_Tx_ID, common::kValuePlain),
      .iva_base_tributavel = number(FXIVA_Base_Tributavel.Tag()),
      .iva_apuramento = common::ControlSqlValue(FXIVA_Apuramento, common::kValuePlain),
  };
  if (!NovaLinha) {
    if (Diario_ID == 0) return false;
    common::SqlServer()->Execute(UpdateLineStatement(line, Diario_ID));
    return true;
  }
  InsertLine(line);
  return true;
}

// The row and its new key come together or not at all: were the key lost after the
// row was written, the editor would still take the line for new and a second OK would
// book it twice.
void frmMainDetails::InsertLine(const LineLiterals& line) {
  const ado::ConnectionPtr& db = common::SqlServer();
  const bool ownTransaction = !common::IsTransactionOpen();
  if (ownTransaction) db->BeginTrans();
  try {
    db->Execute(InsertLineStatement(line));
    ado::RecordsetPtr rs = ado::Recordset::Create();
    rs->Open("SELECT @@Identity as last", db);
    int32_t key = 0;
    if (!rs->Eof()) key = vb::CLng(rs->Fields("last").Value());
    rs->Close();
    if (ownTransaction) db->CommitTrans();
    if (key != 0) Diario_ID = key;
  } catch (...) {
    if (ownTransaction) {
      try {
        if (common::IsTransactionOpen()) db->RollbackTrans();
      } catch (const std::exception&) {
        // The connection is gone, and the unfinished transaction with it.
      }
    }
    throw;
  }
  NovaLinha = false;
}

}  // namespace lines
