// The finder's life: opening, the person's pick, confirming or leaving, and the
// window's own events.

#include <algorithm>

#include "accounts/frmFindConta.h"
#include "common/ErrorTrap.h"
#include "platform/vb/Conversions.h"

namespace accounts {

namespace {

// Where the window goes on the screen and how much of it the window leaves free.
constexpr int32_t kScreenLeft = 1500;
constexpr int32_t kScreenTop = 1500;
constexpr int32_t kWidthLeftFree = 8400;
constexpr int32_t kHeightLeftFree = 3000;

}  // namespace

void frmFindConta::DoOpen() {
  common::Trap(common::FindContaSite("DoOpen"), [&] {
    Show();
    Fill_Tree();
  });
}

void frmFindConta::DoSair() {
  common::Trap(common::FindContaSite("DoSair"), [&] {
    Hide();
    Confirmado = true;
    if (vb::ObjectPtr opener = MainForm()) {
      // Late-bound: any window offering DoFillConta(ID) can open the finder. The key
      // goes by reference, so the opener may write back into it.
      std::vector<vb::Variant> args{vb::Variant(ContaSelecionada)};
      opener->Invoke("DoFillConta", args);
      ContaSelecionada = vb::CLng(args.at(0));
    }
    Unload();
  });
}

void frmFindConta::Form_Load() {
  // A fresh window is a fresh pick.
  ContaSelecionada = 0;
  Confirmado = false;
  layout_.RememberDesignSize();
  // A screen too small for the margins gives a window of no size, which the resize
  // pass then brings up to the smallest a window may be.
  const forms::Desktop& screen = forms::Desktop::Current();
  Move(kScreenLeft, kScreenTop, std::max(0, screen.ScreenWidth() - kWidthLeftFree),
       std::max(0, screen.ScreenHeight() - kHeightLeftFree));
}

void frmFindConta::Form_Resize() { layout_.ResizePass(); }

void frmFindConta::Form_Unload(int& /*Cancel*/) {
  common::Trap(common::FindContaSite("Form_Unload"), [&] {
    if (Confirmado) return;
    vb::ObjectPtr opener = MainForm();
    if (!opener) return;
    // Leaving the finder without a pick leaves the line that asked for it.
    if (auto* window = dynamic_cast<forms::Form*>(opener.get()))
      window->Unload();
    else
      opener->Call("Unload");
  });
}

void frmFindConta::Command1_Click() {
  common::Trap(common::FindContaSite("Command1_Click"), [&] { Unload(); });
}

void frmFindConta::Command2_Click() {
  common::Trap(common::FindContaSite("Command2_Click"), [&] { DoSair(); });
}

void frmFindConta::TreeView1_NodeClick(forms::Node& node) {
  ContaSelecionada = vb::CLng(node.Tag());
}

void frmFindConta::TreeView1_DblClick() {
  common::Trap(common::FindContaSite("TreeView1_DblClick"), [&] { DoSair(); });
}

void frmFindConta::TreeView1_BeforeLabelEdit(int& Cancel) {
  // The tree shows the chart; its texts are not for editing here.
  Cancel = 1;
}

}  // namespace accounts
