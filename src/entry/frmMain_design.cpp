// The design of the header editor: the heading, the window toolbar at the top right,
// the header fields in three columns inside Frame1, the notes, and inside Frame2 the
// lines toolbar, the lines list and the totals, with the journal-type counter below.
// Positions in twips; a control inside a frame counts its Left and Top from the
// frame's corner. The resize pass (modLayout) moves them from here.

#include <string>

#include "entry/frmMain.h"

namespace entry {

namespace {

using forms::ControlDesign;
using forms::ControlType;
using forms::ItemDesign;

constexpr int32_t kFormWidth = 12000;
constexpr int32_t kFormHeight = 8760;

constexpr int32_t kFieldHeight = 315;
constexpr int32_t kLabelHeight = 240;
// The three columns of the header inside Frame1; FXTipo spans the first two.
constexpr int32_t kColumn1 = 120, kColumn1Width = 3360;
constexpr int32_t kColumn2 = 3720, kColumn2Width = 3360;
constexpr int32_t kColumn3 = 7320, kColumn3Width = 4200;
// Each header row is a caption above its field, counted from Frame1's top.
constexpr int32_t kRow1 = 180, kRow2 = 840, kRow3 = 1500;
constexpr int32_t kFieldBelowCaption = 240;

std::string Padded(const char* caption, int blanks) { return caption + std::string(blanks, ' '); }

ControlDesign LabelAt(const char* name, const char* caption, int32_t left, int32_t top,
                      int32_t width, const char* container = "") {
  return {.name = name, .type = ControlType::Label, .left = left, .top = top, .width = width,
          .height = kLabelHeight, .caption = caption, .container = container};
}

ControlDesign FieldAt(const char* name, ControlType type, int32_t left, int32_t top, int32_t width,
                    const char* container = "",
                    std::vector<std::pair<std::string, vb::Variant>> properties = {}) {
  return {.name = name, .type = type, .left = left, .top = top, .width = width,
          .height = kFieldHeight, .container = container, .properties = std::move(properties)};
}

// Boxes that only show what the component computed: never typed into, no tab stop.
std::vector<std::pair<std::string, vb::Variant>> DisplayOnly(int alignment = forms::vbLeftJustify) {
  return {{"Locked", true}, {"TabStop", false}, {"BackColor", forms::vbButtonFace},
          {"Alignment", alignment}};
}

ControlDesign MenuItem(const char* name, const char* caption, const char* container = "mnFicheiro") {
  return {.name = name, .type = ControlType::Menu, .caption = caption, .container = container};
}

}  // namespace

forms::FormDesign frmMain::Design() {
  const char* header = "Frame1";
  const char* lines = "Frame2";
  const int32_t list = forms::lvwColumnLeft;
  const int32_t right = forms::lvwColumnRight;
  const int32_t centre = forms::lvwColumnCenter;
  return {
      .name = "frmMain",
      .caption = "Lançamento no Diário",
      .width = kFormWidth,
      .height = kFormHeight,
      .controls = {
          {.name = "ImageList1", .type = ControlType::ImageList,
           .items = {{.key = "linha", .caption = "text-x-generic"}}},
          {.name = "Image1", .type = ControlType::Image, .left = 120, .top = 120, .width = 480,
           .height = 480, .caption = "accessories-text-editor"},
          {.name = "Label1", .type = ControlType::Label, .left = 720, .top = 210, .width = 1800,
           .height = 360, .caption = "Lançamento", .properties = {{"FontBold", true}}},
          // Wide enough for all four captions beside their pictures, padding included:
          // a narrower bar hides "Apagar Registo" behind the overflow arrow.
          {.name = "Toolbar1", .type = ControlType::Toolbar, .left = 2640, .top = 120,
           .width = 9000, .height = 420,
           .items = {{.key = "fechar", .caption = Padded("&Fechar Janela", 5)},
                     {.key = "gravar", .caption = Padded("&Gravar", 16)},
                     {.key = "finalizar", .caption = kFinalizarCaption},
                     {.key = "apagar", .caption = Padded("&Apagar Registo", 2)}}},

          // The header, column by column as the tab order runs.
          {.name = "Frame1", .type = ControlType::Frame, .left = 120, .top = 660,
           .width = 11640, .height = 2220},
          LabelAt("FXData_Label", "Data:", kColumn1, kRow1, 1680, header),
          FieldAt("FXData", ControlType::DTPicker, kColumn1, kRow1 + kFieldBelowCaption, 1680, header),
          LabelAt("FXTipo_Diario_ID_Label", "Tipo de Diário:", kColumn2, kRow1, 1800, header),
          FieldAt("FXTipo_Diario_ID", ControlType::ComboBox, kColumn2, kRow1 + kFieldBelowCaption,
                kColumn2Width, header, {{"Style", forms::vbComboDropDownList}}),
          LabelAt("FXDorvanto_No_Label", "Doc. Interno:", kColumn3, kRow1, 1800, header),
          FieldAt("FXDorvanto_No", ControlType::TextBox, kColumn3, kRow1 + kFieldBelowCaption,
                kColumn3Width, header, {{"MaxLength", 50}}),
          // The creator is shown, never edited: removing and finalizing compare it with
          // the person logged in.
          LabelAt("FXCreated_By_Label", "Utilizador:", kColumn1, kRow2, 1680, header),
          FieldAt("FXCreated_By", ControlType::TextBox, kColumn1, kRow2 + kFieldBelowCaption, 1680,
                header, DisplayOnly()),
          LabelAt("FXTipo_ID_Label", "Cod. Sistema:", kColumn2, kRow2, 1800, header),
          FieldAt("FXTipo_ID", ControlType::TextBox, kColumn2, kRow2 + kFieldBelowCaption,
                kColumn2Width, header, DisplayOnly()),
          LabelAt("FXReferencia_Label", "Referência:", kColumn3, kRow2, 1800, header),
          FieldAt("FXReferencia", ControlType::TextBox, kColumn3, kRow2 + kFieldBelowCaption,
                kColumn3Width, header, {{"MaxLength", 100}}),
          LabelAt("FXTipo_Label", "Integração:", kColumn1, kRow3, 1680, header),
          FieldAt("FXTipo", ControlType::ComboBox, kColumn1, kRow3 + kFieldBelowCaption,
                kColumn1Width + (kColumn2 - kColumn1 - kColumn1Width) + kColumn2Width, header,
                {{"Style", forms::vbComboDropDownList}}),
          LabelAt("FXRelated_ID_Label", "Nº Série:", kColumn3, kRow3, 1800, header),
          FieldAt("FXRelated_ID", ControlType::TextBox, kColumn3, kRow3 + kFieldBelowCaption,
                kColumn3Width, header),
          LabelAt("FXObs_Label", "Obs:", 120, 2940, 1200),
          FieldAt("FXObs", ControlType::TextBox, 120, 3180, 11640, "", {{"MaxLength", 2000}}),

          // The lines.
          {.name = "Frame2", .type = ControlType::Frame, .left = 120, .top = 3600,
           .width = 11640, .height = 4140},
          {.name = "Toolbar2", .type = ControlType::Toolbar, .left = 120, .top = 120,
           .width = 11280, .height = 420, .container = lines,
           .items = {{.key = "novo", .caption = Padded("&Novo (F2)", 3)},
                     {.key = "abrir", .caption = Padded("&Abrir", 11)},
                     {.key = "remover", .caption = Padded("&Remover", 4)},
                     {.key = "importar", .caption = Padded("&Importar", 5)},
                     {.key = "predefinidos", .caption = "&Predefinidos"}}},
          LabelAt("Label_Extracto", "Extracto de Lançamento:", 120, 600, 3000, lines),
          {.name = "ListView1_Frame", .type = ControlType::Frame, .left = 120, .top = 840,
           .width = 11400, .height = 2760, .container = lines},
          // The columns add up to 10500 twips, short of the list's inside with its
          // vertical scroll bar; the three that share a wider window's growth keep
          // them so (modLayout), so no column ever needs a horizontal scroll bar.
          {.name = "ListView1", .type = ControlType::ListView, .left = 60, .top = 60,
           .width = 11280, .height = 2640, .container = "ListView1_Frame",
           .items = {{.key = "reg_no", .caption = "Nº Reg.", .width = 800, .alignment = list},
                     {.key = "subconta", .caption = "Subconta", .width = 1100, .alignment = list},
                     {.key = "subconta_descrit", .caption = "Subconta (Descrição)", .width = 1200,
                      .alignment = list},
                     {.key = "conta", .caption = "Conta", .width = 1000, .alignment = list},
                     {.key = "descrit", .caption = "Descrição", .width = 1200, .alignment = list},
                     {.key = "ref", .caption = "Ref.", .width = 700, .alignment = list},
                     {.key = "iva_tx", .caption = "IVA Tx", .width = 800, .alignment = centre},
                     {.key = "iva_base", .caption = "IVA Base", .width = 1100, .alignment = right},
                     {.key = "debito", .caption = "Débito", .width = 1300, .alignment = right},
                     {.key = "credito", .caption = "Crédito", .width = 1300, .alignment = right}}},
          LabelAt("FXTotal_Debitos_Label", "Total de Débitos:", 4680, 3750, 1800, lines),
          FieldAt("FXTotal_Debitos", ControlType::TextBox, 6480, 3690, 1680, lines,
                DisplayOnly(forms::vbRightJustify)),
          LabelAt("FXTotal_Creditos_Label", "Total de Créditos:", 8220, 3750, 1800, lines),
          FieldAt("FXTotal_Creditos", ControlType::TextBox, 10020, 3690, 1500, lines,
                DisplayOnly(forms::vbRightJustify)),
          LabelAt("FXContador_label", "Contador do Diário:", 120, 7890, 2280),
          FieldAt("FXContador", ControlType::TextBox, 2400, 7830, 1800, "",
                DisplayOnly(forms::vbRightJustify)),

          // The context menu of the list: no menu bar of its own.
          {.name = "mnFicheiro", .type = ControlType::Menu, .caption = "Ficheiro",
           .properties = {{"Visible", false}}},
          MenuItem("mnAbrir", "&Abrir"),
          MenuItem("mnNovo", "&Novo (F2)"),
          MenuItem("mnBar1", "-"),
          MenuItem("mnRemover", "&Remover"),
          MenuItem("mnBar2", "-"),
          MenuItem("mnImportar", "&Importar"),
          MenuItem("mnPredefinidos", "&Predefinidos"),
      }};
}

}  // namespace entry
