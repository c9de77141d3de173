#include "component/frmSQLServer.h"

namespace component {

namespace {

// Twips. The texts sit right of the icon; the two buttons share the bottom row, the
// way out on the left and the retry on the right. The window is wide enough for the
// first explanation on one line and the second on two, each inside its label's height.
constexpr int32_t kFormWidth = 7800;
constexpr int32_t kFormHeight = 3090;
constexpr int32_t kMargin = 240;
constexpr int32_t kIconSize = 480;
constexpr int32_t kTextLeft = kMargin + kIconSize + kMargin;
constexpr int32_t kClientWidth = kFormWidth - 120;  // inside the window's borders
constexpr int32_t kTextWidth = kClientWidth - kTextLeft - kMargin;
constexpr int32_t kButtonTop = 2040;
constexpr int32_t kButtonHeight = 405;
constexpr int32_t kSairWidth = 1335;
constexpr int32_t kLigarWidth = 2175;

}  // namespace

frmSQLServer::frmSQLServer() : Form(Design()) {
  Handle(Command1.Click, &frmSQLServer::Command1_Click);
  Handle(Command2.Click, &frmSQLServer::Command2_Click);
  Property("TryAgain", [this] { return vb::Variant(TryAgain); });
}

forms::FormDesign frmSQLServer::Design() {
  using forms::ControlType;
  return {
      .name = "frmSQLServer",
      .caption = "Ligação ao Servidor de Dados (SQL)",
      .width = kFormWidth,
      .height = kFormHeight,
      .controls = {
          {.name = "ImageList1", .type = ControlType::ImageList,
           .items = {{.key = "aviso", .caption = "dialog-warning"}}},
          {.name = "Image1", .type = ControlType::Image, .left = kMargin, .top = kMargin,
           .width = kIconSize, .height = kIconSize},
          {.name = "Label1", .type = ControlType::Label, .left = kTextLeft, .top = kMargin,
           .width = kTextWidth, .height = 255,
           .caption = "Problemas na ligação ao servidor de dados.",
           .properties = {{"FontBold", true}}},
          {.name = "Label2", .type = ControlType::Label, .left = kTextLeft, .top = 615,
           .width = kTextWidth, .height = 435,
           .caption = "Possivelmente o servidor SQL está desligado ou inacessível.", .index = 0},
          {.name = "Label2", .type = ControlType::Label, .left = kTextLeft, .top = 1110,
           .width = kTextWidth, .height = 645,
           .caption = "Certifique-se de que o respectivo servidor está ligado, e depois tente "
                      "forçar a ligação carregando em 'Ligar ao servidor SQL'.",
           .index = 1},
          // Escape leaves, as the close box does.
          {.name = "Command2", .type = ControlType::CommandButton, .left = kMargin,
           .top = kButtonTop, .width = kSairWidth, .height = kButtonHeight, .caption = "&Sair",
           .properties = {{"Cancel", true}}},
          {.name = "Command1", .type = ControlType::CommandButton,
           .left = kClientWidth - kMargin - kLigarWidth, .top = kButtonTop,
           .width = kLigarWidth, .height = kButtonHeight, .caption = "&Ligar ao servidor SQL"},
      }};
}

void frmSQLServer::Form_Load() {
  Image1.SetPicture(ImageList1.Picture(1));
  TryAgain = false;
}

void frmSQLServer::Form_Activate() {
  // Above every other window: the person must answer before anything else can work.
  forms::SetWindowPos(*this, forms::HWND_TOPMOST, 0, 0, 0, 0, forms::SWP_NOMOVE | forms::SWP_NOSIZE);
}

void frmSQLServer::Command1_Click() {
  // One click is one more try; the button must not queue a second.
  Command1.SetEnabled(false);
  TryAgain = true;
  Unload();
}

void frmSQLServer::Command2_Click() {
  TryAgain = false;
  Unload();
}

void frmSQLServer::Form_QueryUnload(int& Cancel, int UnloadMode) {
  if (UnloadMode == forms::vbFormControlMenu) TryAgain = false;
}

void frmSQLServer::Form_Unload(int& Cancel) {
  // Whoever waits on the dialog reads TryAgain after it is hidden, then unloads it.
  if (Showing()) {
    Cancel = 1;
    Hide();
  }
}

}  // namespace component
