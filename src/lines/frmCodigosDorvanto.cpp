#include "lines/frmCodigosDorvanto.h"

#include <string>

#include "common/ErrorTrap.h"
#include "common/SqlServer.h"
#include "common/modData.h"
#include "common/modFechos.h"
#include "platform/ado/Recordset.h"
#include "platform/vb/Conversions.h"

namespace lines {

frmCodigosDorvanto::frmCodigosDorvanto() : Form(Design()) {
  Handle(Command1.Click, &frmCodigosDorvanto::Command1_Click);
  Handle(Command2.Click, &frmCodigosDorvanto::Command2_Click);
  Handle(ListView1.ColumnClick, &frmCodigosDorvanto::ListView1_ColumnClick);
  Handle(ListView1.BeforeLabelEdit, &frmCodigosDorvanto::ListView1_BeforeLabelEdit);
  Handle(ListView1.DblClick, &frmCodigosDorvanto::ListView1_DblClick);
  Handle(ListView1.KeyDown, &frmCodigosDorvanto::ListView1_KeyDown);
  Property(
      "MainForm", [this] { return vb::Variant(MainForm.lock()); },
      [this](const vb::Variant& value) { MainForm = value.IsObject() ? value.AsObject() : vb::ObjectPtr(); });
  Property("Cancelar", [this] { return vb::Variant(Cancelar); });
}

forms::FormDesign frmCodigosDorvanto::Design() {
  using forms::ControlType;
  return {.name = "frmCodigosDorvanto",
          .caption = "Códigos de Lançamento",
          .width = 6960,
          .height = 5400,
          .controls = {
              // The buttons keep a margin above the window's bottom border.
              {.name = "ListView1", .type = ControlType::ListView, .left = 120, .top = 120,
               .width = 6600, .height = 4200, .properties = {{"TabIndex", 0}},
               .items = {{.key = "codigo", .caption = "Código", .width = 1200},
                         {.key = "descrit", .caption = "Descrição", .width = 5100}}},
              {.name = "Command2", .type = ControlType::CommandButton, .left = 4200, .top = 4440,
               .width = 1215, .height = 375, .caption = "&OK", .properties = {{"TabIndex", 1}}},
              {.name = "Command1", .type = ControlType::CommandButton, .left = 5520, .top = 4440,
               .width = 1215, .height = 375, .caption = "Cancelar",
               .properties = {{"TabIndex", 2}}},
          }};
}

void frmCodigosDorvanto::Trapped(const char* procedure, const std::function<void()>& body) {
  common::Trap(common::FormSite("frmCodigosDorvanto", procedure), body, [] {
    if (common::IsTransactionOpen()) common::SqlServer()->RollbackTrans();
  });
}

void frmCodigosDorvanto::Form_Load() {
  Trapped("Form_Load", [&] {
    Cancelar = false;
    forms::ListItemList& items = ListView1.ListItems();
    items.Clear();
    ado::RecordsetPtr rs = ado::Recordset::Create();
    rs->Open("SELECT * FROM tbPOC_Dorvantos_Codigos ORDER BY codigo", common::SqlServer());
    for (; !rs->Eof(); rs->MoveNext()) {
      forms::ListItem& item =
          items.Add("#" + vb::CStr(rs->Fields("descrit_id").Value()),
                    common::ListField(rs, "codigo", common::kListText));
      item.SetSubItems(1, common::ListField(rs, "descrit", common::kListText));
    }
    rs->Close();
    if (items.Count() > 0) items(1).SetSelected(true);
  });
}

// While on screen the picker only hides, so its opener can still read it.
void frmCodigosDorvanto::Form_Unload(int& Cancel) {
  Trapped("Form_Unload", [&] {
    if (!Visible()) return;
    Cancel = 1;
    Hide();
  });
}

void frmCodigosDorvanto::Command1_Click() {
  Trapped("Command1_Click", [&] {
    Cancelar = true;
    Unload();
  });
}

void frmCodigosDorvanto::Command2_Click() {
  Trapped("Command2_Click", [&] { Unload(); });
}

// Sorts by the column whose header was clicked, ascending: the list numbers its sort
// keys from 0 (the item text) while headers count from 1.
void frmCodigosDorvanto::ListView1_ColumnClick(forms::ColumnHeader& ColumnHeader) {
  Trapped("ListView1_ColumnClick", [&] {
    ListView1.SetSortOrder(0);
    ListView1.SetSortKey(ColumnHeader.Index() - 1);
    ListView1.SetSorted(true);
  });
}

void frmCodigosDorvanto::ListView1_BeforeLabelEdit(int& Cancel) { Cancel = 1; }

void frmCodigosDorvanto::ListView1_DblClick() { Command2_Click(); }

void frmCodigosDorvanto::ListView1_KeyDown(int& KeyCode, int Shift) {
  if (KeyCode == forms::vbKeyReturn) Command2_Click();
}

}  // namespace lines
