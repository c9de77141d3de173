// A stand-in for the component, registered under its ProgIDs in a test's own settings
// store. Its members show what a driver must carry while the real windows are still
// being written: message and input boxes, a modal window with a pop-up menu, reports to
// Ravelport.General, the host's call-back, and a host's recordset read by member name.
//
//   Login("box", ...)    asks Yes/No/Cancel and logs in on Yes
//   Login("input", ...)  asks for a text and logs in when it is "segredo"
//   NovoRegisto          shows frmFake modally; OK asks "Gravar <text>?", Yes unloads it,
//                        and unloading calls Caller.RemoteKey(42)
//   Registo(tRs, Pkey)   finds dorvanto_id = Pkey in tRs and shows frmFake modeless with
//                        the record's referencia as its caption

#include <memory>
#include <string>
#include <vector>

#include "platform/ado/RecordsetObject.h"
#include "platform/automation/CreateObject.h"
#include "platform/automation/Dispatch.h"
#include "platform/automation/InprocServer.h"
#include "platform/forms/Forms.h"
#include "platform/vb/Conversions.h"

namespace {

using forms::ControlType;

automation::ObjectCounter& Live() {
  static automation::ObjectCounter counter;
  return counter;
}

class frmFake : public forms::Form {
 public:
  frmFake() : Form(Design()) {
    Handle(cmdOK.Click, &frmFake::cmdOK_Click);
    Handle(Text1.MouseUp, &frmFake::Text1_MouseUp);
    Handle(mnLimpar.Click, &frmFake::mnLimpar_Click);
    Handle(mnRelatar.Click, &frmFake::mnRelatar_Click);
  }

  forms::TextBox& Text1 = Ctl<forms::TextBox>("Text1");
  forms::CommandButton& cmdOK = Ctl<forms::CommandButton>("cmdOK");
  forms::Menu& mnPopup = Ctl<forms::Menu>("mnPopup");
  forms::Menu& mnLimpar = Ctl<forms::Menu>("mnLimpar");
  forms::Menu& mnRelatar = Ctl<forms::Menu>("mnRelatar");
  vb::ObjectPtr Caller;

 protected:
  void Form_Unload(int&) override {
    if (!Caller) return;
    std::vector<vb::Variant> key{vb::Variant(int32_t{42})};
    Caller->Invoke("RemoteKey", key);
  }

 private:
  static forms::FormDesign Design() {
    return {.name = "frmFake",
            .caption = "Lançamento",
            .width = 4800,
            .height = 2400,
            .controls = {
                {.name = "Text1", .type = ControlType::TextBox, .left = 120, .top = 120,
                 .width = 3000, .height = 315},
                {.name = "cmdOK", .type = ControlType::CommandButton, .left = 3240, .top = 120,
                 .width = 1200, .height = 375, .caption = "&OK",
                 .properties = {{"Default", true}}},
                {.name = "mnPopup", .type = ControlType::Menu, .caption = "Texto"},
                {.name = "mnLimpar", .type = ControlType::Menu, .caption = "&Limpar",
                 .container = "mnPopup"},
                {.name = "mnRelatar", .type = ControlType::Menu, .caption = "&Relatar",
                 .container = "mnPopup"},
            }};
  }

  void cmdOK_Click() {
    if (forms::MsgBox("Gravar " + Text1.Text() + "?", forms::vbYesNo | forms::vbQuestion,
                      Caption()) == forms::vbYes)
      Unload();
  }
  void Text1_MouseUp(int Button, int, float X, float Y) {
    if (Button == forms::vbRightButton) PopupMenu(mnPopup, X, Y);
  }
  void mnLimpar_Click() { Text1.SetText(""); }
  void mnRelatar_Click() {
    automation::CreateObject("Ravelport.General")
        ->Call("Report", {vb::Variant("POC Dorvantos"), vb::Variant("Dorvantos"),
                          vb::Variant("frmFake"), vb::Variant("mnRelatar_Click"),
                          vb::Variant(Text1.Text())});
  }
};

class FakeClass : public automation::Dispatch<FakeClass> {
 public:
  static const automation::MemberTable<FakeClass>& Members() {
    using automation::Args;
    static const auto table =
        automation::MemberTable<FakeClass>()
            .Method("Login", {0, 2},
                    [](FakeClass&, Args& a) {
                      std::string user = automation::TextArg(a[0]);
                      if (user == "box")
                        return vb::Variant(forms::MsgBox("Entrar como " + user + "?",
                                                         forms::vbYesNoCancel | forms::vbQuestion,
                                                         "Sistema de Segurança") == forms::vbYes);
                      if (user == "input")
                        return vb::Variant(forms::InputBox("Palavra-passe", "Sistema de Segurança",
                                                           "abc") == "segredo");
                      return vb::Variant(true);
                    })
            .Method("NovoRegisto", {1, 4},
                    [](FakeClass& self, Args& a) {
                      self.form_ = std::make_shared<frmFake>();
                      self.form_->Caller = automation::ObjectArg(a[3]);
                      self.form_->Show(forms::vbModal);
                      return vb::Variant();
                    })
            .Method("Registo", {1, 5}, [](FakeClass& self, Args& a) {
              // Late-bound, as a component reads a host's recordset...
              const vb::ObjectPtr& records = a[0].AsObject();
              records->Call("MoveFirst");
              records->Call("Find", {vb::Variant("dorvanto_id=" + vb::CStr(a[1]))});
              std::string caption = "nenhum";
              if (!vb::CBool(records->Get("EOF")))
                caption = vb::CStr(
                    records->Call("Fields", {vb::Variant("referencia")}).AsObject()->Get("Value"));
              // ...and the same recordset taken back whole.
              ado::RecordsetPtr whole = ado::RecordsetObject::From(a[0]);
              caption += " " + std::to_string(whole->RecordCount());
              self.form_ = std::make_shared<frmFake>();
              self.form_->Caller = automation::ObjectArg(a[4]);
              self.form_->SetCaption(caption);
              self.form_->Show();
              return vb::Variant();
            });
    return table;
  }

 private:
  std::shared_ptr<frmFake> form_;
  automation::ObjectCounter::ObjectLock alive_{Live()};
};

automation::ClassFactory<FakeClass> factory;
const char kAnchor = 0;

const automation::ServerModule& Module() {
  static const automation::ServerModule module{
      {"POC_Dorvantos", "{6A0F3B51-2C44-4E0B-9D1E-7F5A3C2B1E01}", "1.0"},
      {
          {{"General", "POC_Dorvantos.General", "{6A0F3B51-2C44-4E0B-9D1E-7F5A3C2B1E02}"},
           &factory},
          {{"GeneralDetails", "POC_Dorvantos.GeneralDetails",
            "{6A0F3B51-2C44-4E0B-9D1E-7F5A3C2B1E03}"},
           &factory},
      }};
  return module;
}

}  // namespace

extern "C" {
automation::HRESULT DllRegisterServer(void) noexcept {
  return automation::RegisterServer(Module(), &kAnchor);
}
automation::HRESULT DllUnregisterServer(void) noexcept {
  return automation::UnregisterServer(Module());
}
automation::HRESULT DllGetClassObject(const char* clsid,
                                      automation::IClassFactory** out) noexcept {
  return automation::GetClassObject(Module(), clsid, out);
}
automation::HRESULT DllCanUnloadNow(void) noexcept { return Live().CanUnloadNow(); }
}
