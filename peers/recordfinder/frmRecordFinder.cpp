#include "frmRecordFinder.h"

#include <charconv>

namespace recordfinder {

frmRecordFinder::frmRecordFinder(FinderTable table) : Form(Design()), table_(std::move(table)) {
  Handle(Text1.Change, &frmRecordFinder::Text1_Change);
  Handle(Text1.KeyDown, &frmRecordFinder::Text1_KeyDown);
  Handle(ListView1.DblClick, &frmRecordFinder::ListView1_DblClick);
  Handle(ListView1.KeyDown, &frmRecordFinder::ListView1_KeyDown);
  Handle(ListView1.BeforeLabelEdit, &frmRecordFinder::ListView1_BeforeLabelEdit);
  Handle(Command1.Click, &frmRecordFinder::Command1_Click);
  Handle(Command2.Click, &frmRecordFinder::Command2_Click);
}

forms::FormDesign frmRecordFinder::Design() {
  using forms::ControlType;
  return {.name = "frmRecordFinder",
          .caption = "Procurar",
          .width = 8400,
          .height = 6000,
          .controls = {
              {.name = "Label1", .type = ControlType::Label, .left = 120, .top = 150,
               .width = 2400, .height = 255, .caption = "Código ou nome:"},
              {.name = "Text1", .type = ControlType::TextBox, .left = 2520, .top = 120,
               .width = 5640, .height = 315, .properties = {{"TabIndex", 0}}},
              // The columns fit inside the list beside its vertical scroll bar.
              {.name = "ListView1", .type = ControlType::ListView, .left = 120, .top = 600,
               .width = 8040, .height = 4320, .properties = {{"TabIndex", 1}},
               .items = {{.key = "codigo", .caption = "Código", .width = 1500},
                         {.key = "descrit", .caption = "Descrição", .width = 3900},
                         {.key = "conta", .caption = "Conta", .width = 2200}}},
              {.name = "Command1", .type = ControlType::CommandButton, .left = 5640, .top = 5100,
               .width = 1215, .height = 375, .caption = "&OK", .properties = {{"TabIndex", 2}}},
              {.name = "Command2", .type = ControlType::CommandButton, .left = 6960, .top = 5100,
               .width = 1215, .height = 375, .caption = "Cancelar",
               .properties = {{"TabIndex", 3}}},
          }};
}

void frmRecordFinder::Form_Load() {
  SetCaption("Procurar " + table_.title);
  Chosen = 0;
  ShowMatchingRows();
}

void frmRecordFinder::ShowMatchingRows() {
  forms::ListItemList& items = ListView1.ListItems();
  items.Clear();
  for (const FinderRow& row : table_.rows) {
    if (!RowMatches(row, Text1.Text())) continue;
    forms::ListItem& item = items.Add("#" + std::to_string(row.key), row.code);
    item.SetSubItems(1, row.name);
    item.SetSubItems(2, row.account);
  }
  if (items.Count() > 0) items(1).SetSelected(true);
}

void frmRecordFinder::Text1_Change() { ShowMatchingRows(); }

void frmRecordFinder::Text1_KeyDown(int& KeyCode, int Shift) {
  if (KeyCode == forms::vbKeyReturn) {
    Command1_Click();
  } else if (KeyCode == forms::vbKeyDown && ListView1.ListItems().Count() > 0) {
    KeyCode = 0;
    ListView1.SetFocus();
  }
}

void frmRecordFinder::ListView1_DblClick() { Command1_Click(); }

void frmRecordFinder::ListView1_KeyDown(int& KeyCode, int Shift) {
  if (KeyCode == forms::vbKeyReturn) Command1_Click();
}

void frmRecordFinder::ListView1_BeforeLabelEdit(int& Cancel) { Cancel = 1; }

// With nothing left to choose, OK keeps the window open for another search.
void frmRecordFinder::Command1_Click() {
  const forms::ListItem* selected = ListView1.SelectedItem();
  if (!selected) return;
  const std::string& key = selected->Key();
  int32_t value = 0;
  std::from_chars(key.data() + 1, key.data() + key.size(), value);
  Chosen = value;
  Unload();
}

void frmRecordFinder::Command2_Click() {
  Chosen = 0;
  Unload();
}

}  // namespace recordfinder
