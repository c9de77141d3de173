// The finder's design, and the members other windows reach by name.

#include "accounts/frmFindConta.h"

#include "common/ErrorTrap.h"

namespace accounts {

namespace {

// Twips. The tree fills the window above a bottom row, where the progress bar with
// its label stands on the left while the tree is built and the two buttons keep to
// the right corner. The window is as wide as the progress label's caption needs beside
// the buttons.
constexpr int32_t kFormWidth = 7440;
constexpr int32_t kFormHeight = 7440;
constexpr int32_t kMargin = 120;
constexpr int32_t kInnerWidth = kFormWidth - 3 * kMargin;  // inside the window's borders
constexpr int32_t kFrameTop = 420;
constexpr int32_t kFrameHeight = 5640;
constexpr int32_t kBottomRow = kFrameTop + kFrameHeight + kMargin;
constexpr int32_t kButtonWidth = 1335;
constexpr int32_t kButtonHeight = 405;
constexpr int32_t kCancelarLeft = kMargin + kInnerWidth - kButtonWidth;
constexpr int32_t kSelecionarLeft = kCancelarLeft - kMargin - kButtonWidth;
constexpr int32_t kProgressWidth = kSelecionarLeft - 2 * kMargin;
// The label a full line of text high, the bar under it.
constexpr int32_t kProgressLabelHeight = 255;
constexpr int32_t kProgressBarTop = kBottomRow + kProgressLabelHeight + 15;

}  // namespace

frmFindConta::frmFindConta()
    : Form(Design()),
      layout_(*this, entry::frmFindContaLayout(),
              [](const std::string& procedure) { return common::FindContaSite(procedure); }) {
  Handle(Command1.Click, &frmFindConta::Command1_Click);
  Handle(Command2.Click, &frmFindConta::Command2_Click);
  Handle(TreeView1.NodeClick, &frmFindConta::TreeView1_NodeClick);
  Handle(TreeView1.DblClick, &frmFindConta::TreeView1_DblClick);
  Handle(TreeView1.BeforeLabelEdit, &frmFindConta::TreeView1_BeforeLabelEdit);
  DeclareMembers();
}

void frmFindConta::DeclareMembers() {
  // The line editor knows the finder only as an object: it sets MainForm and calls
  // DoOpen by name.
  Property(
      "MainForm", [this] { return vb::Variant(MainForm()); },
      [this](const vb::Variant& value) { SetMainForm(value.AsObject()); });
  Method("DoOpen", [this](std::vector<vb::Variant>&) {
    DoOpen();
    return vb::Variant();
  });
  Method("DoSair", [this](std::vector<vb::Variant>&) {
    DoSair();
    return vb::Variant();
  });
}

forms::FormDesign frmFindConta::Design() {
  using forms::ControlType;
  return {
      .name = "frmFindConta",
      .caption = "Plano de Contas (Estrutura Contabilística)",
      .width = kFormWidth,
      .height = kFormHeight,
      .controls = {
          // The pictures of the nodes, by index: 1 a class of the chart (a top-level
          // code), 2 an account that groups others, 3 an account that takes postings.
          {.name = "ImageList1", .type = ControlType::ImageList,
           .items = {{.key = "classe", .caption = "folder-documents"},
                     {.key = "grupo", .caption = "folder"},
                     {.key = "conta", .caption = "text-x-generic"}}},
          {.name = "Label1", .type = ControlType::Label, .left = kMargin, .top = kMargin,
           .width = kInnerWidth, .height = 255,
           .caption = "Selecione um conta da Estrutura Contabilistica:"},
          {.name = "Frame2", .type = ControlType::Frame, .left = kMargin, .top = kFrameTop,
           .width = kInnerWidth, .height = kFrameHeight},
          {.name = "TreeView1_Border", .type = ControlType::Frame, .left = kMargin,
           .top = 240, .width = kInnerWidth - 2 * kMargin, .height = kFrameHeight - 360,
           .container = "Frame2"},
          {.name = "TreeView1", .type = ControlType::TreeView, .left = 30, .top = 30,
           .width = kInnerWidth - 2 * kMargin - 60, .height = kFrameHeight - 420,
           .container = "TreeView1_Border"},
          // Shown only while the tree is being built.
          {.name = "ProgressBar1_Label", .type = ControlType::Label, .left = kMargin,
           .top = kBottomRow, .width = kProgressWidth, .height = kProgressLabelHeight,
           .caption = "Construindo a Estrutura Contabilística ...",
           .properties = {{"Visible", false}}},
          {.name = "ProgressBar1", .type = ControlType::ProgressBar, .left = kMargin,
           .top = kProgressBarTop, .width = kProgressWidth, .height = 195,
           .properties = {{"Visible", false}}},
          {.name = "Command2", .type = ControlType::CommandButton, .left = kSelecionarLeft,
           .top = kBottomRow, .width = kButtonWidth, .height = kButtonHeight,
           .caption = "&Selecionar"},
          {.name = "Command1", .type = ControlType::CommandButton, .left = kCancelarLeft,
           .top = kBottomRow, .width = kButtonWidth, .height = kButtonHeight,
           .caption = "&Cancelar"},
      }};
}

}  // namespace accounts
