// The line editor's frame: its events bound to their handlers, the members other
// windows call by name, loading, resizing and the locking rules of DoPaint.

#include "lines/frmMainDetails.h"

#include "common/modControlFill.h"
#include "platform/vb/Conversions.h"

namespace lines {

namespace {

// A key handed over by reference: written back so the caller sees what the callee did.
template <class Fn>
vb::Variant WithLongArgument(std::vector<vb::Variant>& args, Fn fn) {
  int32_t key = args.empty() ? 0 : vb::CLng(args[0]);
  auto result = fn(key);
  if (!args.empty()) args[0] = vb::Variant(key);
  return result;
}

void Paint(forms::Control& control, bool editable) {
  control.SetBackColor(editable ? forms::vbWindowBackground : forms::vbButtonFace);
}

}  // namespace

frmMainDetails::frmMainDetails() : Form(Design()), layout_(*this, entry::frmMainDetailsLayout()) {
  BindEvents();
  PublishMembers();
}

common::TrapSite frmMainDetails::Site(const std::string& procedure) const {
  return common::FormSite("frmMainDetails", procedure);
}

void frmMainDetails::FocusIfShown(forms::Control& control) {
  if (Visible()) control.SetFocus();
}

void frmMainDetails::BindEvents() {
  Handle(Command1.Click, &frmMainDetails::Command1_Click);
  Handle(Command2.Click, &frmMainDetails::Command2_Click);

  Handle(FXConta_Codigo.Validate, &frmMainDetails::FXConta_Codigo_Validate);
  Handle(FXSubconta_codigo.Validate, &frmMainDetails::FXSubconta_codigo_Validate);
  Handle(FXSubconta_codigo.GotFocus, &frmMainDetails::FXSubconta_codigo_GotFocus);
  Handle(FXConta_Codigo.KeyDown, &frmMainDetails::FXConta_Codigo_KeyDown);
  Handle(FXSubconta_codigo.KeyDown, &frmMainDetails::FXSubconta_codigo_KeyDown);
  Handle(FXConta.KeyDown, &frmMainDetails::FXConta_KeyDown);
  Handle(FXSubconta.KeyDown, &frmMainDetails::FXSubconta_KeyDown);
  Handle(FXConta_Find.ButtonClick, &frmMainDetails::FXConta_Find_ButtonClick);
  Handle(FXSubconta_Find.ButtonClick, &frmMainDetails::FXSubconta_Find_ButtonClick);

  Handle(FXDebito.GotFocus, &frmMainDetails::FXDebito_GotFocus);
  Handle(FXCredito.GotFocus, &frmMainDetails::FXCredito_GotFocus);
  Handle(FXIVA_Base_Tributavel.GotFocus, &frmMainDetails::FXIVA_Base_Tributavel_GotFocus);
  Handle(FXDebito.LostFocus, &frmMainDetails::FXDebito_LostFocus);
  Handle(FXCredito.LostFocus, &frmMainDetails::FXCredito_LostFocus);
  Handle(FXIVA_Base_Tributavel.LostFocus, &frmMainDetails::FXIVA_Base_Tributavel_LostFocus);
  Handle(FXDebito.Validate, &frmMainDetails::FXDebito_Validate);
  Handle(FXCredito.Validate, &frmMainDetails::FXCredito_Validate);
  Handle(FXDebito.KeyPress, &frmMainDetails::FXDebito_KeyPress);
  Handle(FXDebito.KeyDown, &frmMainDetails::FXDebito_KeyDown);
  Handle(FXCredito.KeyDown, &frmMainDetails::FXCredito_KeyDown);
  Handle(FXDorvanto_No.KeyDown, &frmMainDetails::SaveOnEnter_KeyDown);
  Handle(FXIVA.KeyDown, &frmMainDetails::SaveOnEnter_KeyDown);
  Handle(FXIVA_Tx_ID.KeyDown, &frmMainDetails::SaveOnEnter_KeyDown);
  Handle(FXIVA_Base_Tributavel.KeyDown, &frmMainDetails::SaveOnEnter_KeyDown);
  Handle(FXIVA.Click, &frmMainDetails::FXIVA_Click);

  Handle(FXDescrit_ID.GotFocus, &frmMainDetails::FXDescrit_ID_GotFocus);
  Handle(FXDescrit.GotFocus, &frmMainDetails::FXDescrit_GotFocus);
  Handle(FXDescrit.LostFocus, &frmMainDetails::FXDescrit_LostFocus);
  Handle(FXDescrit_ID.LostFocus, &frmMainDetails::FXDescrit_ID_LostFocus);
  Handle(FXDescrit_ID.KeyDown, &frmMainDetails::FXDescrit_ID_KeyDown);
  Handle(FXDescrit.KeyDown, &frmMainDetails::FXDescrit_KeyDown);
  Handle(FXRef.KeyDown, &frmMainDetails::FXRef_KeyDown);
  Handle(Toolbar1.ButtonClick, &frmMainDetails::Toolbar1_ButtonClick);
}

void frmMainDetails::PublishMembers() {
  Property(
      "MainClass", [this] { return vb::Variant(MainClass.lock()); },
      [this](const vb::Variant& value) {
        MainClass = value.IsObject() ? value.AsObject() : vb::ObjectPtr();
      });
  Property(
      "Diario_ID", [this] { return vb::Variant(Diario_ID); },
      [this](const vb::Variant& value) { Diario_ID = vb::CLng(value); });
  Property(
      "Dorvanto_ID", [this] { return vb::Variant(Dorvanto_ID); },
      [this](const vb::Variant& value) { Dorvanto_ID = vb::CLng(value); });

  Method("DoInsert", [this](std::vector<vb::Variant>& args) {
    return WithLongArgument(args, [this](int32_t& key) { DoInsert(key); return vb::Variant(); });
  });
  Method("DoOpen", [this](std::vector<vb::Variant>& args) {
    return WithLongArgument(args, [this](int32_t& key) { DoOpen(key); return vb::Variant(); });
  });
  Method("DoRemove", [this](std::vector<vb::Variant>& args) {
    return WithLongArgument(args, [this](int32_t& key) { return vb::Variant(DoRemove(key)); });
  });
  Method("DoFillConta", [this](std::vector<vb::Variant>& args) {
    return WithLongArgument(args, [this](int32_t& key) { DoFillConta(key); return vb::Variant(); });
  });
  Method("DoFillSubConta", [this](std::vector<vb::Variant>& args) {
    return WithLongArgument(args,
                            [this](int32_t& key) { DoFillSubConta(key); return vb::Variant(); });
  });
  Method("DoGravar", [this](std::vector<vb::Variant>&) { return vb::Variant(DoGravar()); });
  Method("DoPaint", [this](std::vector<vb::Variant>&) { DoPaint(); return vb::Variant(); });
  Method("DoProcurarConta",
         [this](std::vector<vb::Variant>&) { DoProcurarConta(); return vb::Variant(); });
  Method("DoProcurarSubconta",
         [this](std::vector<vb::Variant>&) { DoProcurarSubconta(); return vb::Variant(); });
  Method("DoProcurarCodigos",
         [this](std::vector<vb::Variant>&) { DoProcurarCodigos(); return vb::Variant(); });
}

void frmMainDetails::Form_Load() {
  common::Trap(Site("Form_Load"), [&] {
    layout_.RememberDesignSize();
    common::ControlFill(FXIVA_Tx_ID, "SELECT * FROM vwTaxas_Iva ORDER BY tx", "descrit2", "iva_id");
    DoPaint();
  });
}

void frmMainDetails::Form_Resize() { layout_.ResizePass(); }

void frmMainDetails::Form_Unload(int& Cancel) {
  common::Trap(Site("Form_Unload"), [&] {
    // An account finder still open would call DoFillConta on a closed editor and load
    // it again; it goes with the editor that opened it.
    if (std::shared_ptr<forms::Form> finder = std::move(accountFinder_); finder && finder->Loaded())
      finder->Unload();
  });
}

void frmMainDetails::DoPaint() {
  common::Trap(Site("DoPaint"), [&] {
    forms::Control* vatControls[] = {&FXIVA_Tx_ID_Label, &FXIVA_Base_Tributavel_Label,
                                     &FXIVA_Tx_ID, &FXIVA_Base_Tributavel, &FXIVA_Apuramento};
    if (Finalizado) {
      forms::TextBox* typed[] = {&FXConta_Codigo, &FXSubconta_codigo, &FXDescrit_ID, &FXDescrit,
                                 &FXRef, &FXDebito, &FXCredito};
      for (forms::TextBox* field : typed) {
        field->SetLocked(true);
        Paint(*field, false);
      }
      for (forms::Toolbar* finder : {&FXConta_Find, &FXSubconta_Find, &Toolbar1})
        finder->Buttons()(1).SetEnabled(false);
      FXIVA.SetEnabled(false);
      for (forms::Control* control : vatControls) control->SetEnabled(false);
      Paint(FXIVA_Tx_ID, false);
      Paint(FXIVA_Base_Tributavel, false);
      Command1.SetVisible(false);
      Command2.SetCaption("&Fechar");
      return;
    }
    const bool vat = FXIVA.Value() != forms::vbUnchecked;
    for (forms::Control* control : vatControls) control->SetEnabled(vat);
    Paint(FXIVA_Tx_ID, vat);
    Paint(FXIVA_Base_Tributavel, vat);
  });
}

}  // namespace lines
