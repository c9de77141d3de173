// The account and the sub-account of a line: typed codes looked up when the field is
// left, keys shown by DoFillConta and DoFillSubConta, and the two finders.
//
// A typed code that is no number is refused with a message; a number that matches
// nothing clears the fields silently. The sub-account code field starts from the
// account's code, so the person types only the rest of the full code.

#include <string>

#include "accounts/AccountFinder.h"
#include "common/SqlServer.h"
#include "common/modCode.h"
#include "component/LoginState.h"
#include "lines/WaitCursor.h"
#include "lines/frmMainDetails.h"
#include "platform/ado/Recordset.h"
#include "platform/automation/CreateObject.h"
#include "platform/vb/Conversions.h"

namespace lines {

namespace {

ado::RecordsetPtr Read(const std::string& sql) {
  ado::RecordsetPtr rs = ado::Recordset::Create();
  rs->Open(sql, common::SqlServer());
  return rs;
}

std::string TextOrEmpty(const vb::Variant& value) { return value.IsNull() ? std::string() : vb::CStr(value); }

// A flag raised for the length of a scope.
class Busy {
 public:
  explicit Busy(bool& flag) : flag_(flag) { flag_ = true; }
  ~Busy() { flag_ = false; }
  Busy(const Busy&) = delete;
  Busy& operator=(const Busy&) = delete;

 private:
  bool& flag_;
};

bool IsNextKey(int KeyCode) { return KeyCode == forms::vbKeyReturn || KeyCode == forms::vbKeyRight; }

}  // namespace

void frmMainDetails::ClearConta() {
  FXConta.SetTag("");
  FXConta.SetText("");
  FXConta_Codigo.SetText("");
}

void frmMainDetails::ClearSubConta() {
  FXSubconta.SetTag("");
  FXSubconta.SetText("");
  FXSubconta_codigo.SetText("");
}

void frmMainDetails::DoFillConta(int32_t& ID) {
  common::Trap(Site("DoFillConta"), [&] {
    if (ID == 0) return ClearConta();
    ado::RecordsetPtr rs = Read("SELECT * FROM tbPOC_Contas WHERE conta_id = " + std::to_string(ID));
    if (rs->Eof()) {
      rs->Close();
      return ClearConta();
    }
    FXConta.SetTag(std::to_string(ID));
    FXConta.SetText(TextOrEmpty(rs->Fields("descrit").Value()));
    FXConta_Codigo.SetText(TextOrEmpty(rs->Fields("codigo").Value()));
    rs->Close();
    // A person leaving the field goes where they chose; only a pick from the finder
    // or a key moves them on.
    if (!validatingConta_) FocusIfShown(FXSubconta_codigo);
  });
}

void frmMainDetails::DoFillSubConta(int32_t& ID) {
  common::Trap(Site("DoFillSubConta"), [&] {
    if (ID == 0) return ClearSubConta();
    ado::RecordsetPtr rs =
        Read("SELECT * FROM vwPOC_SubContas WHERE sub_conta_id = " + std::to_string(ID));
    if (rs->Eof()) {
      rs->Close();
      return ClearSubConta();
    }
    FXSubconta.SetTag(std::to_string(ID));
    FXSubconta.SetText(TextOrEmpty(rs->Fields("descrit").Value()));
    FXSubconta_codigo.SetText(TextOrEmpty(rs->Fields("codigo_completo").Value()));
    // A sub-account picked first brings its account along; an account already shown
    // stays until the save books the line to the sub-account's own account.
    if (FXConta_Codigo.Text().empty()) {
      FXConta_Codigo.SetText(vb::CStr(rs->Fields("conta_codigo").Value()));
      FXConta.SetText(vb::CStr(rs->Fields("conta_descrit").Value()));
      FXConta.SetTag(vb::CStr(rs->Fields("conta_id").Value()));
    }
    rs->Close();
    if (!validatingSubconta_) FocusIfShown(FXDescrit_ID);
  });
}

void frmMainDetails::FXConta_Codigo_Validate(int& Cancel) {
  Busy busy(validatingConta_);
  common::Trap(Site("FXConta_Codigo_Validate"), [&] {
    if (!Command1.Visible()) return;
    const std::string code = FXConta_Codigo.Text();
    int32_t found = 0;
    if (code.empty()) return DoFillConta(found);
    if (!vb::IsNumeric(vb::Variant(code))) {
      forms::MsgBox("Tem de indicar um valor numérico para o código da conta.",
                    forms::vbInformation | forms::vbOKOnly, Caption());
      Cancel = 1;
      return;
    }
    ado::RecordsetPtr rs = Read("SELECT * FROM tbPOC_Contas WHERE codigo = " +
                                common::SqlValue(vb::Variant(code), common::kSqlNumber));
    if (!rs->Eof()) found = vb::CLng(rs->Fields("conta_id").Value());
    rs->Close();
    DoFillConta(found);
  });
}

void frmMainDetails::FXSubconta_codigo_Validate(int& Cancel) {
  Busy busy(validatingSubconta_);
  common::Trap(Site("FXSubconta_codigo_Validate"), [&] {
    if (!Command1.Visible()) return;
    const std::string code = FXSubconta_codigo.Text();
    int32_t found = 0;
    if (code.empty()) return DoFillSubConta(found);
    if (!vb::IsNumeric(vb::Variant(code))) {
      forms::MsgBox("Tem de indicar um valor numérico para o código da subconta.",
                    forms::vbInformation | forms::vbOKOnly, Caption());
      Cancel = 1;
      return;
    }
    // It must look like a number but is matched as the text it is ("0011" is not "11").
    ado::RecordsetPtr rs = Read("SELECT * FROM vwPOC_SubContas WHERE codigo_completo = " +
                                common::SqlValue(vb::Variant(code), common::kSqlText));
    if (!rs->Eof()) found = vb::CLng(rs->Fields("sub_conta_id").Value());
    rs->Close();
    DoFillSubConta(found);
  });
}

void frmMainDetails::FXSubconta_codigo_GotFocus() {
  common::Trap(Site("FXSubconta_codigo_GotFocus"), [&] {
    if (!FXSubconta_codigo.Text().empty() || FXConta_Codigo.Text().empty()) return;
    FXSubconta_codigo.SetText(FXConta_Codigo.Text());
    FXSubconta_codigo.SetSelStart(vb::Len(FXSubconta_codigo.Text()));
  });
}

// The key handlers run the field's validation before moving on; a refused code keeps
// the focus where it is, with its message shown once.
void frmMainDetails::FXConta_Codigo_KeyDown(int& KeyCode, int Shift) {
  common::Trap(Site("FXConta_Codigo_KeyDown"), [&] {
    if (IsNextKey(KeyCode)) {
      int cancel = 0;
      FXConta_Codigo_Validate(cancel);
      if (cancel == 0) FocusIfShown(FXSubconta_codigo);
    } else if (KeyCode == forms::vbKeyAdd) {
      KeyCode = 0;  // the plus opens the finder; it is not part of the code
      DoProcurarConta();
    }
  });
}

void frmMainDetails::FXSubconta_codigo_KeyDown(int& KeyCode, int Shift) {
  common::Trap(Site("FXSubconta_codigo_KeyDown"), [&] {
    if (IsNextKey(KeyCode) || KeyCode == forms::vbKeyLeft) {
      int cancel = 0;
      FXSubconta_codigo_Validate(cancel);
      if (cancel == 0) FocusIfShown(KeyCode == forms::vbKeyLeft ? FXConta_Codigo : FXDescrit_ID);
    } else if (KeyCode == forms::vbKeyAdd) {
      KeyCode = 0;
      DoProcurarSubconta();
    }
  });
}

void frmMainDetails::FXConta_KeyDown(int& KeyCode, int Shift) {
  common::Trap(Site("FXConta_KeyDown"), [&] {
    if (KeyCode == forms::vbKeyReturn) FocusIfShown(FXSubconta);
  });
}

void frmMainDetails::FXSubconta_KeyDown(int& KeyCode, int Shift) {
  common::Trap(Site("FXSubconta_KeyDown"), [&] {
    if (KeyCode == forms::vbKeyReturn) FocusIfShown(FXDescrit_ID);
  });
}

void frmMainDetails::FXConta_Find_ButtonClick(forms::ToolbarButton&) { DoProcurarConta(); }

void frmMainDetails::FXSubconta_Find_ButtonClick(forms::ToolbarButton&) { DoProcurarSubconta(); }

// The account finder is modeless: it returns at once and hands the pick back later
// through DoFillConta.
void frmMainDetails::DoProcurarConta() {
  common::Trap(Site("DoProcurarConta"), [&] {
    WaitCursor wait(*this);
    // A finder still open from an earlier search is closed first; it must forget this
    // editor before it goes, or leaving it without a pick would close the editor too.
    if (std::shared_ptr<forms::Form> previous = std::move(accountFinder_); previous && previous->Loaded()) {
      previous->Let("MainForm", vb::Nothing());
      previous->Unload();
    }
    std::shared_ptr<forms::Form> finder = accounts::NewAccountFinder();
    finder->Let("MainForm", vb::Variant(shared_from_this()));
    accountFinder_ = finder;
    finder->Call("DoOpen");
  });
}

void frmMainDetails::DoProcurarSubconta() {
  common::Trap(Site("DoProcurarSubconta"), [&] {
    WaitCursor wait(*this);
    vb::ObjectPtr finder = automation::CreateObject(kRecordFinderProgId);
    std::vector<vb::Variant> login{vb::Variant(component::LoggedUser()),
                                   vb::Variant(component::LoggedPassword())};
    finder->Invoke("Connect", login);

    std::vector<vb::Variant> find{vb::Variant(kSubContasTable)};
    const std::string conta = FXConta.Tag();
    if (!conta.empty() && conta != "0") {
      find.insert(find.end(), {vb::Variant::Missing(), vb::Variant::Missing(), vb::Variant::Missing(),
                               vb::Variant("conta_id = " + conta), vb::Variant(false),
                               vb::Variant(true)});
    }
    int32_t chosen = vb::CLng(finder->Invoke("Find", find));
    if (chosen != 0) DoFillSubConta(chosen);
  });
}

}  // namespace lines
