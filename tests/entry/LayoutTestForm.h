#pragma once
// A window with the controls the header editor's layout table names, at the places
// the header editor has them, and the resize pass wired as the header editor wires it.

#include "entry/modLayout.h"
#include "platform/forms/Forms.h"

namespace entry::testing {

inline forms::FormDesign HeaderEditorDesign() {
  using forms::ControlType;
  auto text = [](const char* name, int32_t left, int32_t top, int32_t width) {
    return forms::ControlDesign{.name = name, .type = ControlType::TextBox, .left = left,
                                .top = top, .width = width, .height = 315};
  };
  auto label = [](const char* name, int32_t left, int32_t top, int32_t width) {
    return forms::ControlDesign{.name = name, .type = ControlType::Label, .left = left,
                                .top = top, .width = width, .height = 240};
  };
  return {
      .name = "frmMain",
      .caption = "Dorvantos",
      .width = 11520,
      .height = 8000,
      .controls = {
          {.name = "Toolbar2", .type = ControlType::Toolbar, .width = 4000, .height = 420},
          {.name = "Toolbar1", .type = ControlType::Toolbar, .left = 9000, .width = 2400,
           .height = 420},
          {.name = "Image1", .type = ControlType::Image, .left = 120, .top = 480, .width = 480,
           .height = 480},
          label("Label1", 720, 540, 4000),
          {.name = "Frame1", .type = ControlType::Frame, .left = 120, .top = 1080,
           .width = 11160, .height = 1800},
          // Column 1.
          text("FXData", 240, 1560, 1680),
          text("FXCreated_By", 240, 1980, 1680),
          label("FXTipo_Label", 240, 2160, 1000),
          text("FXTipo", 240, 2400, 7080),
          // Column 2.
          label("FXTipo_Diario_ID_Label", 3840, 1320, 1500),
          text("FXTipo_Diario_ID", 3840, 1560, 3480),
          label("FXTipo_ID_Label", 3840, 2010, 900),
          text("FXTipo_ID", 4800, 1980, 2520),
          // Column 3.
          label("FXDorvanto_No_Label", 7440, 1320, 1500),
          text("FXDorvanto_No", 7440, 1560, 3600),
          label("FXReferencia_Label", 7440, 2010, 1200),
          text("FXReferencia", 8700, 1980, 2340),
          label("FXRelated_ID_Label", 7440, 2430, 1200),
          text("FXRelated_ID", 8700, 2400, 2340),
          text("FXObs", 120, 2940, 11160),
          {.name = "Frame2", .type = ControlType::Frame, .left = 120, .top = 3600,
           .width = 11160, .height = 3840},
          {.name = "ListView1_Frame", .type = ControlType::Frame, .left = 240, .top = 3720,
           .width = 10920, .height = 3120},
          {.name = "ListView1", .type = ControlType::ListView, .left = 300, .top = 3780,
           .width = 10800, .height = 3000,
           .items = {{.key = "n", .caption = "Nº", .width = 600},
                     {.key = "sub", .caption = "Subconta", .width = 1200},
                     {.key = "subdesc", .caption = "Subconta (Descrição)", .width = 2400},
                     {.key = "conta", .caption = "Conta", .width = 1800},
                     {.key = "desc", .caption = "Descrição", .width = 2400},
                     {.key = "deb", .caption = "Débito", .width = 1200},
                     {.key = "cred", .caption = "Crédito", .width = 1200}}},
          label("FXTotal_Debitos_Label", 6600, 7020, 900),
          text("FXTotal_Debitos", 7560, 6960, 1500),
          label("FXTotal_Creditos_Label", 9120, 7020, 600),
          text("FXTotal_Creditos", 9720, 6960, 1440),
          label("FXContador_label", 120, 7560, 1000),
          text("FXContador", 1200, 7500, 1200),
      }};
}

class HeaderEditorLayoutForm : public forms::Form {
 public:
  HeaderEditorLayoutForm() : Form(HeaderEditorDesign()), layout(*this, frmMainLayout()) {}

  FormLayout layout;
  forms::ListView& ListView1 = Ctl<forms::ListView>("ListView1");
  int resizePasses = 0;

 protected:
  void Form_Load() override { layout.RememberDesignSize(); }
  void Form_Resize() override {
    ++resizePasses;
    layout.ResizePass(
        [this](int32_t widthChange) { layout.WidenLinesListColumns(ListView1, widthChange); });
  }
};

}  // namespace entry::testing
