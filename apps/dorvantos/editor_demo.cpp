// dorvantos demo: one complete entry kept through the component's own windows without
// a display. A scripted person works the header editor and the line editor as a person
// at the keyboard would (a new entry, a debit line, the balancing credit line, finalize,
// close), each step printed; then the journal as it stands in the database.

#include <fmt/format.h>

#include <cstdio>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "commands.h"
#include "common/PasswordCodec.h"
#include "common/modData.h"
#include "host_database.h"
#include "platform/ado/Recordset.h"
#include "platform/automation/CreateObject.h"
#include "platform/forms/Forms.h"
#include "platform/forms/KeyboardUser.h"
#include "platform/forms/ScriptedDesktop.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace app {
namespace {

// Boxes are answered with their default button, and shown on the way.
class DemoDesktop : public forms::ScriptedDesktop {
 public:
  int MsgBox(const forms::MessageBox& box) override {
    const int answer = ScriptedDesktop::MsgBox(box);
    fmt::print("      caixa: \"{}\"\n", box.text);
    return answer;
  }
};

// Remembers the entries the component reports back.
class DemoCallBack : public vb::Object {
 public:
  vb::Variant Invoke(const std::string& name, std::vector<vb::Variant>& args) override {
    if (name != "RemoteKey") throw vb::Error(vb::kErrMemberNotSupported);
    if (!args.empty()) keys.push_back(vb::CLng(args[0]));
    return {};
  }
  std::vector<int32_t> keys;
};

class StepFailed : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

void Require(bool done, const std::string& what) {
  if (!done) throw StepFailed(what);
}

forms::Form& ShownForm(const std::string& name) {
  for (forms::Form* form : forms::LoadedForms())
    if (form->Name() == name && form->Showing()) return *form;
  throw StepFailed("a janela " + name + " não está aberta");
}

bool IsShowing(const std::string& name) {
  for (forms::Form* form : forms::LoadedForms())
    if (form->Name() == name && form->Showing()) return true;
  return false;
}

int step = 0;
void Step(const std::string& text) { fmt::print("{:>2}. {}\n", ++step, text); }

// One line typed into the line editor on screen, as the journal scenario does.
void TypeLine(const std::string& account, const std::string& subAccountRest,
              const std::string& description, const std::string& debit) {
  forms::Form& details = ShownForm("frmMainDetails");
  forms::KeyboardUser person(details);
  Require(person.TypeInto("FXConta_Codigo", account), "escrever a conta");
  person.Press(forms::vbKeyReturn);
  Require(person.TypeInto("FXSubconta_codigo", subAccountRest), "escrever a subconta");
  person.Press(forms::vbKeyReturn);
  Require(person.TypeInto("FXDescrit", description), "escrever a descrição");
  if (!debit.empty()) Require(person.TypeInto("FXDebito", debit), "escrever o débito");
  const std::string subAccount = details.Ctl<forms::TextBox>("FXSubconta").Text();
  const std::string debitShown = details.Ctl<forms::TextBox>("FXDebito").Text();
  const std::string creditShown = details.Ctl<forms::TextBox>("FXCredito").Text();
  fmt::print("      {} {} \"{}\" débito {} crédito {}\n", account + subAccountRest, subAccount,
             description, debitShown, creditShown);
  Require(person.Click("Command1"), "confirmar a linha");
}

std::string Cell(const ado::RecordsetPtr& rs, const char* field, int32_t kind) {
  return common::ListField(rs, field, kind);
}

void PrintJournal() {
  ado::ConnectionPtr db = OpenSettingsDatabase();
  fmt::print("\nDiário:\n");
  fmt::print("{:>4}  {:<10}  {:<22}  {:<12}  {:<10}  {:>12}\n", "Nº", "Data", "Tipo de Diário",
             "Documento", "Estado", "Total");
  ado::RecordsetPtr entries = db->Execute(
      "SELECT d.dorvanto_id, d.data, t.descrit AS tipo, d.dorvanto_no, d.finalizado, d.valor "
      "FROM tbPOC_Dorvantos d LEFT JOIN tbPOC_Diario_Tipos t ON t.tipo_diario_id = "
      "d.tipo_diario_id ORDER BY d.dorvanto_id");
  std::vector<int32_t> ids;
  for (; !entries->Eof(); entries->MoveNext()) {
    ids.push_back(vb::CLng(entries->Fields("dorvanto_id").Value()));
    const vb::Variant& finalized = entries->Fields("finalizado").Value();
    const bool closed = !finalized.IsNull() && vb::CLng(finalized) != 0;
    fmt::print("{:>4}  {:<10}  {:<22}  {:<12}  {:<10}  {:>12}\n", ids.back(),
               Cell(entries, "data", common::kListDate), Cell(entries, "tipo", common::kListText),
               Cell(entries, "dorvanto_no", common::kListText), closed ? "Finalizado" : "Aberto",
               Cell(entries, "valor", common::kListNumber));
  }
  entries->Close();
  for (int32_t id : ids) {
    fmt::print("\nLançamento {}:\n", id);
    fmt::print("{:>6}  {:<12}  {:<40}  {:<24}  {:>12}  {:>12}\n", "Reg.", "Subconta",
               "Subconta (Descrição)", "Descrição", "Débito", "Crédito");
    ado::RecordsetPtr lines = db->Execute(fmt::format(
        "SELECT reg_no, codigo_completo, sub_conta_descrit, descrit, debito, credito FROM "
        "tbPOC_Dorvantos_Details WHERE dorvanto_id = {} ORDER BY diario_id",
        id));
    for (; !lines->Eof(); lines->MoveNext()) {
      fmt::print("{:>6}  {:<12}  {:<40}  {:<24}  {:>12}  {:>12}\n",
                 Cell(lines, "reg_no", common::kListText), Cell(lines, "codigo_completo", common::kListText),
                 Cell(lines, "sub_conta_descrit", common::kListText),
                 Cell(lines, "descrit", common::kListText),
                 Cell(lines, "debito", common::kListNumber),
                 Cell(lines, "credito", common::kListNumber));
    }
    lines->Close();
  }
}

void Walk(const std::string& user, const std::string& password) {
  Step(fmt::format("Login como {}", user));
  vb::ObjectPtr component = automation::CreateObject("POC_Dorvantos.General");
  Require(vb::CBool(component->Call("Login", {vb::Variant(user),
                                              vb::Variant(common::EncodePassword(password))})),
          "o utilizador " + user + " não foi aceite pela base de dados");

  Step("Novo lançamento");
  auto callBack = std::make_shared<DemoCallBack>();
  component->Call("NovoRegisto", {vb::Variant("tbPOC_Dorvantos"), vb::Variant::Missing(),
                                  vb::Variant::Missing(), vb::Variant(vb::ObjectPtr(callBack))});
  forms::Form& header = ShownForm("frmMain");
  forms::KeyboardUser person(header);
  fmt::print("      \"{}\", utilizador {}\n", header.Caption(),
             header.Ctl<forms::TextBox>("FXCreated_By").Text());

  auto& journalType = header.Ctl<forms::ListControl>("FXTipo_Diario_ID");
  Require(journalType.ListCount() > 0, "não há tipos de diário");
  Require(person.Choose(journalType, 0), "escolher o tipo de diário");
  Step(fmt::format("Tipo de Diário: {}", journalType.List(journalType.ListIndex())));

  Step("F2: nova linha a débito");
  Require(person.Focus("FXObs"), "ir para as observações");
  person.Press(forms::vbKeyF2);
  TypeLine("11", "001", "Venda a dinheiro", "100");

  Step("Linha a crédito que equilibra o lançamento");
  TypeLine("12", "001", "Depósito na CGD", "");
  Require(!IsShowing("frmMainDetails"), "o lançamento não ficou equilibrado");
  fmt::print("      Total de Débitos {}  Total de Créditos {}\n",
             header.Ctl<forms::TextBox>("FXTotal_Debitos").Text(),
             header.Ctl<forms::TextBox>("FXTotal_Creditos").Text());

  Step("Finalizar");
  Require(person.ClickButton(header.Ctl<forms::Toolbar>("Toolbar1"), "finalizar"), "finalizar");

  Step("Fechar a janela");
  Require(person.CloseWindow(), "fechar a janela do lançamento");
  Require(!callBack->keys.empty(), "o componente não devolveu o lançamento");
  fmt::print("      RemoteKey({})\n", callBack->keys.back());
}

}  // namespace

int RunDemo(const Args& args) {
  std::string user = "demo", password = "demo";
  for (size_t i = 0; i < args.size(); i += 2) {
    const bool known = args[i] == "--user" || args[i] == "--password";
    if (!known || i + 1 >= args.size()) {
      std::fputs("usage: dorvantos demo [--user NAME] [--password TEXT]\n", stderr);
      return 2;
    }
    (args[i] == "--user" ? user : password) = args[i + 1];
  }
  auto desktop = std::make_shared<DemoDesktop>();
  forms::Desktop::Install(desktop);
  try {
    Walk(user, password);
    PrintJournal();
  } catch (const std::exception& e) {
    std::fprintf(stderr, "dorvantos demo: %s\n", e.what());
    return 1;
  }
  if (!desktop->leftOpen.empty()) {
    std::fprintf(stderr, "dorvantos demo: a window was left open: %s\n",
                 desktop->leftOpen.front().c_str());
    return 1;
  }
  return 0;
}

}  // namespace app
