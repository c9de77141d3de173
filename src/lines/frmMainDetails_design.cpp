// The line editor's design: one row per control, top to bottom as the keyboard walks
// them. Read-only fields are locked, grey and out of the tab order; the amounts are
// bold and right-aligned; the VAT controls sit together in one frame, placed from its
// corner.

#include "lines/frmMainDetails.h"

namespace lines {

namespace {

using forms::ControlDesign;
using forms::ControlType;

constexpr int32_t kRowHeight = 315;
constexpr int32_t kFieldLeft = 1440;
constexpr int32_t kWideLeft = 3120;
// Inside the VAT frame: the captions on one line, "Base Tributável:" the longest.
constexpr int32_t kVatLabelWidth = 1620;
constexpr int32_t kVatFieldLeft = 1800;

ControlDesign LabelAt(const char* name, const char* text, int32_t left, int32_t top,
                      int32_t width = 1260) {
  return {.name = name, .type = ControlType::Label, .left = left, .top = top + 30,
          .width = width, .height = 255, .caption = text};
}

// A field the person types into.
ControlDesign Field(const char* name, int32_t left, int32_t top, int32_t width, int tabIndex,
                    bool rightAligned) {
  ControlDesign field{.name = name, .type = ControlType::TextBox, .left = left, .top = top,
                      .width = width, .height = kRowHeight,
                      .properties = {{"TabIndex", tabIndex}}};
  if (rightAligned) field.properties.push_back({"Alignment", forms::vbRightJustify});
  return field;
}

// A field that only shows what the line refers to.
ControlDesign ShownField(const char* name, int32_t left, int32_t top, int32_t width,
                         bool rightAligned = false) {
  ControlDesign field{.name = name, .type = ControlType::TextBox, .left = left, .top = top,
                      .width = width, .height = kRowHeight,
                      .properties = {{"Locked", true},
                                     {"TabStop", false},
                                     {"BackColor", forms::vbButtonFace}}};
  if (rightAligned) field.properties.push_back({"Alignment", forms::vbRightJustify});
  return field;
}

ControlDesign FinderButton(const char* name, int32_t top) {
  return {.name = name, .type = ControlType::Toolbar, .left = kWideLeft - 480, .top = top - 30,
          .width = 390, .height = 375, .items = {{.key = "procurar", .caption = "Procurar"}}};
}

}  // namespace

forms::FormDesign frmMainDetails::Design() {
  ControlDesign debit = Field("FXDebito", kFieldLeft, 2760, 1800, 5, true);
  debit.properties.push_back({"FontBold", true});
  ControlDesign credit = Field("FXCredito", 4560, 2760, 1800, 6, true);
  credit.properties.push_back({"FontBold", true});
  ControlDesign base = ShownField("FXIVA_Base_Tributavel", kVatFieldLeft, 1140, 1800, true);
  base.container = "Frame1";

  return {
      .name = "frmMainDetails",
      .caption = "Lançamento do Diário",
      .width = 7920,
      .height = 6000,
      .controls = {
          {.name = "Label1", .type = ControlType::Label, .left = 120, .top = 120, .width = 4800,
           .height = 315, .caption = "Lançamento do Diário", .properties = {{"FontBold", true}}},
          LabelAt("FXDorvanto_No_Label", "Lançam. Nº:", 120, 600),
          ShownField("FXDorvanto_No", kFieldLeft, 600, 1800),
          LabelAt("FXData_Label", "Data:", 3600, 600, 600),
          ShownField("FXData", 4560, 600, 2280),

          LabelAt("FXConta_Codigo_Label", "Conta:", 120, 1080),
          Field("FXConta_Codigo", kFieldLeft, 1080, 1080, 0, true),
          FinderButton("FXConta_Find", 1080),
          ShownField("FXConta", kWideLeft, 1080, 4560),

          LabelAt("FXSubconta_codigo_Label", "Sub-conta:", 120, 1500),
          Field("FXSubconta_codigo", kFieldLeft, 1500, 1080, 1, true),
          FinderButton("FXSubconta_Find", 1500),
          ShownField("FXSubconta", kWideLeft, 1500, 4560),

          LabelAt("FXDescrit_ID_Label", "Descrição:", 120, 1920),
          Field("FXDescrit_ID", kFieldLeft, 1920, 1080, 2, true),
          FinderButton("Toolbar1", 1920),
          Field("FXDescrit", kWideLeft, 1920, 4560, 3, false),

          LabelAt("FXRef_Label", "Referência:", 120, 2340),
          Field("FXRef", kFieldLeft, 2340, 1800, 4, true),

          LabelAt("FXDebito_Label", "Débito:", 120, 2760),
          debit,
          LabelAt("FXCredito_Label", "Crédito:", 3600, 2760, 900),
          credit,

          {.name = "Frame1", .type = ControlType::Frame, .left = 120, .top = 3300, .width = 7560,
           .height = 1620},
          {.name = "FXIVA", .type = ControlType::CheckBox, .left = 120, .top = 240, .width = 3600,
           .height = 255, .caption = "Lançamento para mapa de IVA", .container = "Frame1",
           .properties = {{"TabIndex", 7}}},
          {.name = "FXIVA_Apuramento", .type = ControlType::CheckBox, .left = 4320, .top = 240,
           .width = 2400, .height = 255, .caption = "Apuramento", .container = "Frame1",
           .properties = {{"TabIndex", 9}}},
          {.name = "FXIVA_Tx_ID_Label", .type = ControlType::Label, .left = 120, .top = 720,
           .width = kVatLabelWidth, .height = 255, .caption = "Taxa de IVA:", .container = "Frame1"},
          {.name = "FXIVA_Tx_ID", .type = ControlType::ComboBox, .left = kVatFieldLeft, .top = 690,
           .width = 4200, .height = kRowHeight, .container = "Frame1",
           .properties = {{"Style", forms::vbComboDropDownList},
                          {"BackColor", forms::vbButtonFace},
                          {"TabIndex", 8}}},
          {.name = "FXIVA_Base_Tributavel_Label", .type = ControlType::Label, .left = 120,
           .top = 1170, .width = kVatLabelWidth, .height = 255, .caption = "Base Tributável:",
           .container = "Frame1"},
          base,

          {.name = "Command1", .type = ControlType::CommandButton, .left = 5160, .top = 5100,
           .width = 1215, .height = 375, .caption = "&OK", .properties = {{"TabIndex", 10}}},
          {.name = "Command2", .type = ControlType::CommandButton, .left = 6480, .top = 5100,
           .width = 1215, .height = 375, .caption = "&Cancelar", .properties = {{"TabIndex", 11}}},
      }};
}

}  // namespace lines
