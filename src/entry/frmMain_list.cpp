// The lines list of the header editor and the look of the window for the entry's
// state. An item's key is "#" and its line's diario_id; items are found by key through
// the list's index, never by walking it.

#include <string>

#include "common/ErrorTrap.h"
#include "common/SqlServer.h"
#include "common/modData.h"
#include "entry/frmMain.h"
#include "platform/vb/Conversions.h"

namespace entry {

namespace {

constexpr int kLineIcon = 1;

// The ten columns: the item's text, then sub-items 1 to 9. Amounts of zero show as a
// blank, so only the side a line books shows a number.
struct LineColumn {
  const char* field;
  int32_t kind;
  bool blankWhenZero;
};
constexpr LineColumn kLineColumns[] = {
    {"reg_no", common::kListText, false},
    {"codigo_completo_list", common::kListText, false},
    {"sub_conta_descrit_list", common::kListText, false},
    {"conta_descrit_list", common::kListText, false},
    {"descrit", common::kListText, false},
    {"ref", common::kListText, false},
    {"iva_tx", common::kListPercent, false},
    {"iva_base_tributavel", common::kListEuro, false},
    {"debito", common::kListEuro, true},
    {"credito", common::kListEuro, true},
};

std::string LineKey(int32_t diarioId) { return "#" + std::to_string(diarioId); }

ado::RecordsetPtr QueryLines(int32_t dorvantoId) {
  auto rs = ado::Recordset::Create();
  rs->Open("SELECT * FROM vwPOC_Dorvantos_Details WHERE dorvanto_id = " +
               std::to_string(dorvantoId) + " ORDER BY diario_id",
           common::SqlServer());
  return rs;
}

int32_t RowLineId(const ado::RecordsetPtr& rs) { return vb::CLng(rs->Fields("diario_id").Value()); }

std::string CellText(const ado::RecordsetPtr& rs, const LineColumn& column) {
  if (column.blankWhenZero) {
    const vb::Variant& value = rs->Fields(column.field).Value();
    if (value.IsNull() || vb::CDbl(value) == 0) return " ";
  }
  return common::ListField(rs, column.field, column.kind);
}

void WriteLine(forms::ListItem& item, const ado::RecordsetPtr& rs) {
  item.SetText(CellText(rs, kLineColumns[0]));
  for (int32_t sub = 1; sub < static_cast<int32_t>(std::size(kLineColumns)); ++sub)
    item.SetSubItems(sub, CellText(rs, kLineColumns[sub]));
}

}  // namespace

// ID 0 fills the list from scratch, selecting Diario_ID. Any other ID is a line the
// line editor just saved: the listed lines are rewritten in place, and the line is
// selected and scrolled to.
void frmMain::DoFillDorvantos(int32_t ID) {
  common::Trap(common::FormSite("frmMain", "DoFillDorvantos"), [&] {
    Hourglass();
    if (ID == 0) {
      FillLinesFromScratch();
    } else {
      // A line saved for the first time, or one another window added meanwhile, has no
      // item yet: the list is rebuilt rather than left short of it.
      if (!ListView1.ListItems().Find(LineKey(ID)) || !RefreshListedLines()) FillLinesFromScratch();
      SelectSavedLine(ID);
    }
    DoFillTotais();
    DefaultPointer();
  }, [&] { DefaultPointer(); });
}

void frmMain::FillLinesFromScratch() {
  auto& items = ListView1.ListItems();
  items.Clear();
  auto rs = QueryLines(Dorvanto_ID);
  for (; !rs->Eof(); rs->MoveNext()) {
    const int32_t id = RowLineId(rs);
    forms::ListItem& item = items.Add(LineKey(id), "", kLineIcon);
    WriteLine(item, rs);
    if (Diario_ID != 0 && Diario_ID == id) {
      item.SetSelected(true);
      item.EnsureVisible();
    }
  }
  rs->Close();
}

// Rewrites the texts of the listed lines without adding, removing or reordering
// items; false, with the rewriting stopped, at a line that has no item.
bool frmMain::RefreshListedLines() {
  auto& items = ListView1.ListItems();
  auto rs = QueryLines(Dorvanto_ID);
  for (; !rs->Eof(); rs->MoveNext()) {
    forms::ListItem* item = items.Find(LineKey(RowLineId(rs)));
    if (!item) {
      rs->Close();
      return false;
    }
    WriteLine(*item, rs);
  }
  rs->Close();
  return true;
}

// The items before the saved line are deselected, the saved line selected and shown;
// those after it keep their state.
void frmMain::SelectSavedLine(int32_t ID) {
  auto& items = ListView1.ListItems();
  forms::ListItem* saved = items.Find(LineKey(ID));
  const int32_t before = saved ? saved->Index() - 1 : items.Count();
  for (int32_t index = 1; index <= before; ++index) items(index).SetSelected(false);
  if (!saved) return;
  saved->EnsureVisible();
  saved->SetSelected(true);
}

// ---- the look of the window ------------------------------------------------------------

// A locked system document shows the locked look alone. An unlocked one first gets
// the unlocked look, which frees its header fields and commands, then the final or
// open look like any entry. An ordinary entry's header fields keep their state.
void frmMain::DoPaint() {
  common::Trap(common::FormSite("frmMain", "PaintList"), [&] {
    if (Sistema && !Desbloqueado) {
      ApplyLockedLook();
      return;
    }
    if (Sistema) ApplyUnlockedLook();
    if (Finalizado)
      ApplyFinalLook();
    else
      ApplyOpenLook();
  });
}

void frmMain::ApplyLockedLook() {
  PaintLinesArea(false);
  Toolbar2.Buttons()("importar").SetEnabled(false);
  Toolbar2.Buttons()("predefinidos").SetEnabled(false);
  Toolbar1.Buttons()("finalizar").SetCaption(kReabrirCaption);
  Toolbar1.Buttons()("finalizar").SetEnabled(false);
  Toolbar1.Buttons()("apagar").SetEnabled(false);
  FXData.SetEnabled(false);
  PaintHeaderFields(false);
}

void frmMain::ApplyUnlockedLook() {
  PaintLinesArea(true);
  Toolbar2.Buttons()("importar").SetEnabled(true);
  Toolbar2.Buttons()("predefinidos").SetEnabled(true);
  Toolbar1.Buttons()("finalizar").SetCaption(kReabrirCaption);
  Toolbar1.Buttons()("finalizar").SetEnabled(true);
  Toolbar1.Buttons()("apagar").SetEnabled(true);
  FXData.SetEnabled(true);
  PaintHeaderFields(true);
}

void frmMain::ApplyFinalLook() {
  PaintLinesArea(false);
  Toolbar2.Buttons()("importar").SetEnabled(false);
  Toolbar2.Buttons()("predefinidos").SetEnabled(false);
  Toolbar1.Buttons()("finalizar").SetCaption(kReabrirCaption);
  FXData.SetEnabled(false);
  if (Visible()) FXObs.SetFocus();
}

void frmMain::ApplyOpenLook() {
  PaintLinesArea(true);
  Toolbar2.Buttons()("importar").SetEnabled(false);
  Toolbar2.Buttons()("predefinidos").SetEnabled(false);
  Toolbar1.Buttons()("finalizar").SetCaption(kFinalizarCaption);
  FXData.SetEnabled(true);
}

// The list, the totals and the line commands that add, open and remove lines.
void frmMain::PaintLinesArea(bool editable) {
  const int32_t colour = editable ? forms::vbWindowBackground : forms::vbButtonFace;
  ListView1.SetBackColor(colour);
  FXTotal_Creditos.SetBackColor(colour);
  FXTotal_Debitos.SetBackColor(colour);
  for (const char* key : {"novo", "abrir", "remover"}) Toolbar2.Buttons()(key).SetEnabled(editable);
}

// The header fields a system document locks. The notes stay reachable, read-only, so
// a locked document can still be read in full.
void frmMain::PaintHeaderFields(bool editable) {
  const int32_t colour = editable ? forms::vbWindowBackground : forms::vbButtonFace;
  FXObs.SetEnabled(true);
  FXObs.SetLocked(!editable);
  FXTipo_Diario_ID.SetEnabled(editable);
  for (forms::Control* field : {static_cast<forms::Control*>(&FXTipo),
                                static_cast<forms::Control*>(&FXRelated_ID),
                                static_cast<forms::Control*>(&FXReferencia),
                                static_cast<forms::Control*>(&FXDorvanto_No)}) {
    field->SetEnabled(editable);
    field->SetBackColor(colour);
  }
}

}  // namespace entry
