// The header editor's construction: its handlers bound to the controls' events, and
// the members other windows and the component's classes reach by name.

#include <utility>

#include "entry/frmMain.h"
#include "platform/automation/Dispatch.h"
#include "platform/vb/Conversions.h"

namespace entry {

namespace {

// An optional by-reference Long of a late-bound call.
int32_t LongArgument(const std::vector<vb::Variant>& args, size_t index) {
  return index < args.size() ? automation::LongArg(args[index]) : 0;
}

}  // namespace

frmMain::frmMain(HeaderEditorWindows windows)
    : Form(Design()), windows_(std::move(windows)), layout_(*this, frmMainLayout()) {
  BindHandlers();
  PublishMembers();
}

void frmMain::BindHandlers() {
  Handle(Toolbar1.ButtonClick, &frmMain::Toolbar1_ButtonClick);
  Handle(Toolbar2.ButtonClick, &frmMain::Toolbar2_ButtonClick);
  Handle(ListView1.DblClick, &frmMain::ListView1_DblClick);
  Handle(ListView1.ItemClick, &frmMain::ListView1_ItemClick);
  Handle(ListView1.KeyDown, &frmMain::ListView1_KeyDown);
  Handle(ListView1.MouseUp, &frmMain::ListView1_MouseUp);
  Handle(ListView1.BeforeLabelEdit, &frmMain::ListView1_BeforeLabelEdit);
  Handle(mnAbrir.Click, &frmMain::mnAbrir_Click);
  Handle(mnNovo.Click, &frmMain::mnNovo_Click);
  Handle(mnRemover.Click, &frmMain::mnRemover_Click);

  // Every edit of the header, by a person or by code, leaves it unsaved until the
  // next load or save clears the mark.
  FXData.Change = [this] { MarkUnsaved(); };
  FXData.Click = [this] { MarkUnsaved(); };
  FXData.Validate = [this](int&) { MarkUnsaved(); };
  FXDorvanto_No.Change = [this] { MarkUnsaved(); };
  FXObs.Change = [this] { MarkUnsaved(); };
  FXReferencia.Change = [this] { MarkUnsaved(); };
  FXRelated_ID.Change = [this] { MarkUnsaved(); };
  FXTipo.Click = [this] { MarkUnsaved(); };
  FXTipo_Diario_ID.Click = [this] { MarkUnsaved(); };

  // F2 and F3 work in every header field; the key still reaches the field.
  FXCreated_By.KeyDown = [this](int& KeyCode, int) { HeaderField_KeyDown("FXCreated_By_KeyDown", KeyCode); };
  FXData.KeyDown = [this](int& KeyCode, int) { HeaderField_KeyDown("FXData_KeyDown", KeyCode); };
  FXObs.KeyDown = [this](int& KeyCode, int) { HeaderField_KeyDown("FXObs_KeyDown", KeyCode); };
  FXReferencia.KeyDown = [this](int& KeyCode, int) { HeaderField_KeyDown("FXReferencia_KeyDown", KeyCode); };
  FXTipo_ID.KeyDown = [this](int& KeyCode, int) { HeaderField_KeyDown("FXTipo_ID_KeyDown", KeyCode); };
  FXTotal_Creditos.KeyDown = [this](int& KeyCode, int) {
    HeaderField_KeyDown("FXTotal_Creditos_KeyDown", KeyCode);
  };
  FXTotal_Debitos.KeyDown = [this](int& KeyCode, int) {
    HeaderField_KeyDown("FXTotal_Debitos_KeyDown", KeyCode);
  };
  Handle(FXDorvanto_No.KeyDown, &frmMain::FXDorvanto_No_KeyDown);
  Handle(FXDorvanto_No.LostFocus, &frmMain::FXDorvanto_No_LostFocus);
  Handle(FXTipo_Diario_ID.KeyDown, &frmMain::FXTipo_Diario_ID_KeyDown);
  Handle(FXRelated_ID.DblClick, &frmMain::FXRelated_ID_DblClick);
  Handle(FXRelated_ID_Label.Click, &frmMain::FXRelated_ID_Label_Click);
  Handle(Image1.DblClick, &frmMain::Image1_DblClick);
}

void frmMain::PublishMembers() {
  Method("DoInsert", [this](std::vector<vb::Variant>&) {
    DoInsert();
    return vb::Variant();
  });
  Method("DoOpen", [this](std::vector<vb::Variant>& args) {
    DoOpen(LongArgument(args, 0), LongArgument(args, 1));
    return vb::Variant();
  });
  Method("DoFillDorvantos", [this](std::vector<vb::Variant>& args) {
    DoFillDorvantos(LongArgument(args, 0));
    return vb::Variant();
  });
  Method("DoInsertDorvanto", [this](std::vector<vb::Variant>&) {
    DoInsertDorvanto();
    return vb::Variant();
  });
  Method("DoFinalizar", [this](std::vector<vb::Variant>&) { return vb::Variant(DoFinalizar()); });
  Method("RemoteKey", [this](std::vector<vb::Variant>& args) {
    RemoteKey(LongArgument(args, 0));
    return vb::Variant();
  });

  Property(
      "MainClass", [this] { return vb::Variant(MainClass.lock()); },
      [this](const vb::Variant& value) { MainClass = automation::ObjectArg(value); });
  Property(
      "CallBackClass", [this] { return vb::Variant(CallBackClass); },
      [this](const vb::Variant& value) { CallBackClass = automation::ObjectArg(value); });
  Property(
      "Dorvanto_ID", [this] { return vb::Variant(Dorvanto_ID); },
      [this](const vb::Variant& value) { Dorvanto_ID = vb::CLng(value); });
  Property(
      "Diario_ID", [this] { return vb::Variant(Diario_ID); },
      [this](const vb::Variant& value) { Diario_ID = vb::CLng(value); });
}

}  // namespace entry
