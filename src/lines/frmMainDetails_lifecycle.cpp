// One line's life in the editor: a new line that proposes the balancing amount, an
// existing line opened (read-only when its entry is final), OK with the call-backs
// that keep new lines coming until the entry balances, Cancel, and removal.

#include <string>

#include "common/SqlServer.h"
#include "common/modControls.h"
#include "lines/frmMainDetails.h"
#include "platform/ado/Recordset.h"
#include "platform/vb/Conversions.h"

namespace lines {

namespace {

ado::RecordsetPtr Read(const std::string& sql) {
  ado::RecordsetPtr rs = ado::Recordset::Create();
  rs->Open(sql, common::SqlServer());
  return rs;
}

// x in whole cents, halves to the even neighbour.
double Cents(double x) { return vb::CLng(vb::Variant(x * 100)) / 100.0; }

struct Proposal {
  double debito = 0;
  double credito = 0;
};

// The amount that balances the entry: on the side its lines are short of.
Proposal BalancingAmount(int32_t dorvantoId) {
  ado::RecordsetPtr rs = Read(
      "SELECT sum(debito) as debitos, sum(credito) as creditos FROM tbPOC_Dorvantos_Details "
      "WHERE dorvanto_id = " + std::to_string(dorvantoId));
  Proposal proposal;
  if (rs->Eof() || rs->Fields("debitos").Value().IsNull()) return proposal;
  const vb::Variant& creditos = rs->Fields("creditos").Value();
  const double D = vb::CDbl(rs->Fields("debitos").Value());
  const double C = creditos.IsNull() ? 0.0 : vb::CDbl(creditos);
  rs->Close();
  if (D - C > 0)
    proposal.credito = Cents(D - C);
  else
    proposal.debito = Cents(C - D);
  return proposal;
}

}  // namespace

void frmMainDetails::DoInsert(int32_t& p_Dorvanto_ID) {
  common::Trap(Site("DoInsert"), [&] {
    NovaLinha = true;
    if (p_Dorvanto_ID == 0) {
      Unload();
      return;
    }
    Dorvanto_ID = p_Dorvanto_ID;
    ado::RecordsetPtr rs =
        Read("SELECT * FROM tbPOC_Dorvantos WHERE dorvanto_id = " + std::to_string(Dorvanto_ID));
    if (rs->Eof()) {
      rs->Close();
      Unload();
      return;
    }
    common::SetControlValue(FXData, rs->Fields("data").Value(), common::kValuePlain);
    common::SetControlValue(FXDorvanto_No, rs->Fields("dorvanto_no").Value(), common::kValuePlain);
    rs->Close();

    const Proposal proposal = BalancingAmount(Dorvanto_ID);
    common::SetControlValue(FXDebito, vb::Variant(proposal.debito), common::kValuePlain);
    common::SetControlValue(FXCredito, vb::Variant(proposal.credito), common::kValuePlain);
    common::FormatControlText(FXDebito, common::kValueEuro);
    common::FormatControlText(FXCredito, common::kValueEuro);
    Show();
  });
}

void frmMainDetails::DoOpen(int32_t& p_Diario_ID) {
  common::Trap(Site("DoOpen"), [&] {
    Diario_ID = p_Diario_ID;
    ado::RecordsetPtr rs = Read(
        "SELECT tbPOC_Dorvantos_Details.*, tbPOC_Dorvantos.data, tbPOC_Dorvantos.dorvanto_no "
        "FROM tbPOC_Dorvantos_Details LEFT JOIN tbPOC_Dorvantos ON "
        "tbPOC_Dorvantos_Details.dorvanto_id = tbPOC_Dorvantos.dorvanto_id "
        "WHERE tbPOC_Dorvantos_Details.diario_id = " + std::to_string(Diario_ID));
    if (!rs->Eof()) {
      auto field = [&](const char* name) { return rs->Fields(name).Value(); };
      Dorvanto_ID = vb::CLng(field("dorvanto_id"));
      common::SetControlValue(FXData, field("data"), common::kValuePlain);
      common::SetControlValue(FXDorvanto_No, field("dorvanto_no"), common::kValuePlain);
      int32_t conta = field("conta_id").IsNull() ? 0 : vb::CLng(field("conta_id"));
      DoFillConta(conta);
      int32_t subconta = field("sub_conta_id").IsNull() ? 0 : vb::CLng(field("sub_conta_id"));
      DoFillSubConta(subconta);
      const std::pair<forms::Control*, const char*> loaded[] = {
          {&FXDescrit_ID, "codigo"},      {&FXDescrit, "descrit"},
          {&FXRef, "ref"},                {&FXDebito, "debito"},
          {&FXCredito, "credito"},        {&FXIVA, "iva"},
          {&FXIVA_Tx_ID, "iva_tx_id"},    {&FXIVA_Base_Tributavel, "iva_base_tributavel"},
          {&FXIVA_Apuramento, "iva_apuramento"}};
      for (const auto& [control, column] : loaded)
        common::SetControlValue(*control, field(column), common::kValuePlain);
    }
    rs->Close();

    rs = Read("SELECT * FROM tbPOC_Dorvantos WHERE dorvanto_id = " + std::to_string(Dorvanto_ID));
    if (!rs->Eof()) {
      // A final mark that is null counts as final: never edit what may be closed.
      const vb::Variant& finalizado = rs->Fields("finalizado").Value();
      Finalizado = finalizado.IsNull() || vb::CDbl(finalizado) != 0;
    }
    rs->Close();

    common::FormatControlText(FXDebito, common::kValueEuro);
    common::FormatControlText(FXCredito, common::kValueEuro);
    common::FormatControlText(FXIVA_Base_Tributavel, common::kValueEuro);
    DoPaint();
    Show();
  });
}

void frmMainDetails::Command1_Click() {
  // The header editor, told of the line, may open the next line editor in this one's
  // place and drop the last reference to it: stay alive until the handler is done.
  const vb::ObjectPtr self = shared_from_this();
  common::Trap(Site("Command1_Click"), [&] {
    // OK is hidden for a line of a final entry; the keys that save must not reach
    // around it and write to a closed entry.
    if (!Command1.Visible()) return;
    if (!DoGravar()) return;
    Hide();
    if (Diario_ID != 0 && !MainClass.expired()) NotifyHeaderEditor();
    Unload();
  });
}

// The header editor refreshes its list and, while the entry does not balance, opens
// the next line. Whatever goes wrong there is its own business: the line is saved and
// this editor closes all the same.
void frmMainDetails::NotifyHeaderEditor() {
  try {
    const vb::ObjectPtr header = MainClass.lock();
    if (!header) return;
    std::vector<vb::Variant> args{vb::Variant(Diario_ID)};
    header->Invoke("DoFillDorvantos", args);
    auto total = [&](const char* name) {
      return vb::CStr(header->Get(name).AsObject()->Get("Text"));
    };
    if (total("FXTotal_Creditos") != total("FXTotal_Debitos")) header->Call("DoInsertDorvanto");
  } catch (const std::exception&) {
  }
}

void frmMainDetails::Command2_Click() {
  common::Trap(Site("Command2_Click"), [&] {
    Diario_ID = 0;
    Dorvanto_ID = 0;
    NovaLinha = false;
    Unload();
  });
}

bool frmMainDetails::DoRemove(int32_t& p_ID) {
  bool removed = false;
  common::Trap(Site("DoRemove"), [&] {
    ado::RecordsetPtr rs =
        Read("SELECT * FROM tbPOC_Dorvantos_Details WHERE diario_id = " + std::to_string(p_ID));
    const bool found = !rs->Eof();
    rs->Close();
    if (!found) return;
    if (forms::MsgBox("Deseja mesmo remover esta linha do lançamento?",
                      forms::vbYesNo | forms::vbQuestion, "Remover Lançamento") != forms::vbYes)
      return;
    common::SqlServer()->Execute("DELETE FROM tbPOC_Dorvantos_Details WHERE Diario_ID = " +
                                 std::to_string(p_ID));
    removed = true;
    Unload();
  });
  return removed;
}

}  // namespace lines
