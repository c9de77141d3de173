// The header editor as a window: loading and placing it, bringing it to the front,
// closing it with its questions and the call-back to the host, the resize pass, the
// two toolbars, and the lines list with its keys and context menu.

#include <string>

#include "common/ErrorTrap.h"
#include "common/modControlFill.h"
#include "entry/frmMain.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace entry {

namespace {

common::TrapSite Site(const char* procedure) { return common::FormSite("frmMain", procedure); }

// The margin the window keeps from every edge of the screen, in twips.
constexpr int32_t kScreenMargin = 1000;

}  // namespace

// ---- the window ------------------------------------------------------------------------

void frmMain::Form_Load() {
  common::Trap(Site("Form_Load"), [&] {
    Hourglass();
    layout_.RememberDesignSize();
    // Nearly the whole screen; the size change spreads over the controls from the
    // design layout.
    const forms::Desktop& screen = forms::Desktop::Current();
    Move(kScreenMargin, kScreenMargin, screen.ScreenWidth() - 2 * kScreenMargin,
         screen.ScreenHeight() - 2 * kScreenMargin);
    common::ControlFill(FXTipo_Diario_ID, "SELECT * FROM tbPOC_Diario_Tipos ORDER BY descrit",
                        "descrit", "tipo_diario_id");
    common::ControlFill(FXTipo,
                        "SELECT * FROM tbContactos_ContasCorrentes_Tipos WHERE tipo_diario_id is "
                        "not null ORDER BY descrit",
                        "descrit", "tipo_id");
    DoPaint();
    // Filling the lists is no edit of the header.
    ClearUnsaved();
    DefaultPointer();
  }, [&] { DefaultPointer(); });
}

// Above every window, the host's included, without staying on top of them.
void frmMain::Form_Activate() {
  const uint32_t keepPlaceAndSize = forms::SWP_NOMOVE | forms::SWP_NOSIZE;
  forms::SetWindowPos(*this, forms::HWND_TOPMOST, 0, 0, 0, 0, keepPlaceAndSize);
  forms::SetWindowPos(*this, forms::HWND_NOTOPMOST, 0, 0, 0, 0, keepPlaceAndSize);
}

// An open entry stays on screen until it is finalized; removing and restarting hide
// the window first, so they close it. Unsaved changes are offered for saving. The host
// hears of the entry in every case, also when the close was cancelled.
void frmMain::Form_Unload(int& Cancel) {
  common::Trap(Site("Form_Unload"), [&] {
    if (Visible() && FXData.Enabled()) {
      forms::MsgBox("Não pode fechar este lançamento sem finalizar.",
                    forms::vbInformation | forms::vbOKOnly, Caption());
      Cancel = 1;
    }
    if (SaveButton().Enabled()) {
      switch (forms::MsgBox("Pretende gravar as alterações e sair?", forms::vbYesNoCancel, "Sair")) {
        case forms::vbCancel: Cancel = 1; break;
        case forms::vbYes:
          if (!DoGravar()) Cancel = 1;
          break;
        default: break;  // No: the changes are dropped
      }
    }
    TellCaller();
  });
}

void frmMain::TellCaller() {
  if (!CallBackClass) return;
  // A caller without RemoteKey, or one that fails in it, must not keep the window.
  try {
    std::vector<vb::Variant> args{vb::Variant(Dorvanto_ID)};
    CallBackClass->Invoke("RemoteKey", args);
  } catch (...) {
  }
}

void frmMain::Form_Resize() {
  layout_.ResizePass(
      [this](int32_t widthChange) { layout_.WidenLinesListColumns(ListView1, widthChange); });
}

// ---- the toolbars ------------------------------------------------------------------------

void frmMain::Toolbar1_ButtonClick(forms::ToolbarButton& Button) {
  common::Trap(Site("Toolbar1_ButtonClick"), [&] {
    Hourglass();
    const std::string key = Button.Key();
    if (key == "fechar") {
      Unload();
    } else if (key == "gravar") {
      DoGravar();
    } else if (key == "finalizar") {
      Call("DoFinalizar");
    } else if (key == "apagar") {
      DoRemove(Dorvanto_ID);
    }
    DefaultPointer();
  }, [&] { DefaultPointer(); });
}

// "importar" and "predefinidos" only take part in the look of the window.
void frmMain::Toolbar2_ButtonClick(forms::ToolbarButton& Button) {
  common::Trap(Site("Toolbar2_ButtonClick"), [&] {
    const std::string& key = Button.Key();
    if (key == "novo") {
      NewLine();
    } else if (key == "abrir") {
      if (ListHasItems()) OpenLine();
    } else if (key == "remover") {
      if (ListHasItems()) RemoveLine();
    }
  });
}

// ---- the line commands ----------------------------------------------------------------------

// Every command gets a fresh line editor; DetailsForm remembers only the last.
vb::ObjectPtr frmMain::NewDetailsForm() {
  DetailsForm = windows_.LineEditor();
  DetailsForm->Let("MainClass", vb::Variant(shared_from_this()));
  return DetailsForm;
}

int32_t frmMain::SelectedLineKey() {
  forms::ListItem* item = ListView1.SelectedItem();
  if (!item) throw vb::Error(vb::kErrObjectNotSet);
  return vb::CLng(vb::Variant(item->Key().substr(1)));
}

void frmMain::NewLine() { NewDetailsForm()->Call("DoInsert", {vb::Variant(Dorvanto_ID)}); }

void frmMain::OpenLine() {
  const int32_t line = SelectedLineKey();
  NewDetailsForm()->Call("DoOpen", {vb::Variant(line)});
}

// The item goes at once; the totals wait for the next fill.
void frmMain::RemoveLine() {
  forms::ListItem* item = ListView1.SelectedItem();
  const int32_t line = SelectedLineKey();
  const std::string key = item->Key();
  if (vb::CBool(NewDetailsForm()->Call("DoRemove", {vb::Variant(line)})))
    ListView1.ListItems().Remove(key);
}

// ---- the lines list -----------------------------------------------------------------------

void frmMain::ListView1_DblClick() {
  common::Trap(Site("ListView1_DblClick"), [&] {
    if (!ListHasItems()) return;
    Hourglass();
    OpenLine();
    DefaultPointer();
  }, [&] { DefaultPointer(); });
}

void frmMain::ListView1_ItemClick(forms::ListItem& /*Item*/) { ItemSelecionado = true; }

void frmMain::ListView1_KeyDown(int& KeyCode, int /*Shift*/) {
  common::Trap(Site("ListView1_KeyDown"), [&] {
    if (KeyCode == forms::vbKeyF2)
      NewLine();
    else if (KeyCode == forms::vbKeyF3)
      DoRestart();
  });
}

void frmMain::ListView1_MouseUp(int Button, int /*Shift*/, float X, float Y) {
  common::Trap(Site("ListView1_MouseUp"), [&] {
    if (Button == forms::vbRightButton) ShowContextMenu(X, Y);
    ItemSelecionado = false;
  });
}

// The lines are edited in the line editor, never in the list.
void frmMain::ListView1_BeforeLabelEdit(int& Cancel) {
  common::Trap(Site("ListView1_BeforeLabelEdit"), [&] { Cancel = 1; });
}

// Opening and removing need a line that was just clicked; a final or locked entry
// takes no new lines and loses none.
void frmMain::ShowContextMenu(float x, float y) {
  mnNovo.SetEnabled(true);
  if (FXData.Enabled()) {
    mnAbrir.SetEnabled(ItemSelecionado);
    mnRemover.SetEnabled(ItemSelecionado);
  } else {
    mnNovo.SetEnabled(false);
    mnRemover.SetEnabled(false);
  }
  PopupMenu(mnFicheiro, x, y);
  ItemSelecionado = false;
}

void frmMain::mnAbrir_Click() {
  common::Trap(Site("mnAbrir_Click"), [&] {
    if (!ListHasItems()) return;
    Hourglass();
    OpenLine();
    DefaultPointer();
  }, [&] { DefaultPointer(); });
}

void frmMain::mnNovo_Click() {
  common::Trap(Site("mnNovo_Click"), [&] { NewLine(); });
}

void frmMain::mnRemover_Click() {
  common::Trap(Site("mnRemover_Click"), [&] {
    if (ListHasItems()) RemoveLine();
  });
}

}  // namespace entry
