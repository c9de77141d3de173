#pragma once
// frmMain, the header editor: one journal entry at a time, its header fields above,
// its lines below (ListView1) with the debit and credit totals, and the journal-type
// day counter at the bottom.
//
// The entry's states, as DoPaint shows them:
//
//     ordinary, open  <--DoFinalizar / reopen-->  ordinary, final
//     system document, locked  --password-->  system document, unlocked (then as above)
//
// The unsaved mark of the header is no variable: it is the Enabled state of the Save
// button (key "gravar" of Toolbar1). Field edits enable it; loading, saving and
// removing the entry disable it.
//
// Other windows and the component's classes know this form only as an automation
// object and reach it by member name: DoInsert, DoOpen, DoFillDorvantos,
// DoInsertDorvanto, RemoteKey, the properties MainClass, CallBackClass, Dorvanto_ID and
// Diario_ID, and any control (FXTotal_Debitos, FXTotal_Creditos) through Get.
//
// The form lives in a std::shared_ptr: the line editors it opens hold it as their
// MainClass.

#include <cstdint>
#include <functional>
#include <string>

#include "entry/modLayout.h"
#include "platform/ado/Recordset.h"
#include "platform/forms/Forms.h"
#include "platform/vb/Object.h"

namespace entry {

// Where this window's settings live: the remembered date and journal type.
inline constexpr const char* kPocSettingsKey = "HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\POC";

// The caption of the Finalize button (key "finalizar") for an entry to finalize and
// for one to reopen; the blanks keep the toolbar's buttons one width.
inline const std::string kFinalizarCaption = "&Finalizar" + std::string(14, ' ');
inline const std::string kReabrirCaption = "&Reabrir" + std::string(15, ' ');

// The windows the header editor opens, each created fresh for every use.
struct HeaderEditorWindows {
  std::function<vb::ObjectPtr()> LineEditor;    // a frmMainDetails
  std::function<vb::ObjectPtr()> HeaderEditor;  // the next frmMain, after a restart
};

class frmMain : public forms::Form {
 public:
  explicit frmMain(HeaderEditorWindows windows);

  // Public state, set by the classes that open the window.
  // The class object owns this window; holding it back weakly keeps the pair from
  // keeping each other alive once the host lets go.
  std::weak_ptr<vb::Object> MainClass;
  vb::ObjectPtr CallBackClass;
  int32_t Dorvanto_ID = 0;
  int32_t Diario_ID = 0;

  // The entry.
  void DoInsert();
  void DoOpen(int32_t dorvantoId, int32_t diarioId = 0);
  bool DoGravar();
  void DoRemove(int32_t p_ID);
  void DoRestart();
  void DoFillTotais();
  void DoFillContador();
  void DoInsertDorvanto();
  void RemoteKey(int32_t ID);

  // Finalizing an open entry, or offering to reopen a final one. True when the entry
  // was finalized, was final (whatever the answer to reopening) or is gone.
  bool DoFinalizar();
  // Attaches a series number to a final system document; also the label's click.
  void FXRelated_ID_DblClick();

  // The lines list and the look of the window.
  void DoFillDorvantos(int32_t ID = 0);
  void DoPaint();

  // The refusals shared by removing and finalizing: system-modal, critical, titled
  // "Sistema de Segurança".
  void ShowClosedPeriodRefusal();
  void ShowOwnerRefusal();

  // Controls.
  forms::Toolbar& Toolbar1 = Ctl<forms::Toolbar>("Toolbar1");
  forms::Toolbar& Toolbar2 = Ctl<forms::Toolbar>("Toolbar2");
  forms::Image& Image1 = Ctl<forms::Image>("Image1");
  forms::Label& Label1 = Ctl<forms::Label>("Label1");
  forms::Frame& Frame1 = Ctl<forms::Frame>("Frame1");
  forms::DTPicker& FXData = Ctl<forms::DTPicker>("FXData");
  forms::TextBox& FXCreated_By = Ctl<forms::TextBox>("FXCreated_By");
  forms::ComboBox& FXTipo = Ctl<forms::ComboBox>("FXTipo");
  forms::Label& FXTipo_Label = Ctl<forms::Label>("FXTipo_Label");
  forms::ComboBox& FXTipo_Diario_ID = Ctl<forms::ComboBox>("FXTipo_Diario_ID");
  forms::TextBox& FXTipo_ID = Ctl<forms::TextBox>("FXTipo_ID");
  forms::TextBox& FXDorvanto_No = Ctl<forms::TextBox>("FXDorvanto_No");
  forms::TextBox& FXReferencia = Ctl<forms::TextBox>("FXReferencia");
  forms::TextBox& FXRelated_ID = Ctl<forms::TextBox>("FXRelated_ID");
  forms::Label& FXRelated_ID_Label = Ctl<forms::Label>("FXRelated_ID_Label");
  forms::TextBox& FXObs = Ctl<forms::TextBox>("FXObs");
  forms::Frame& Frame2 = Ctl<forms::Frame>("Frame2");
  forms::Label& Label_Extracto = Ctl<forms::Label>("Label_Extracto");
  forms::ListView& ListView1 = Ctl<forms::ListView>("ListView1");
  forms::TextBox& FXTotal_Debitos = Ctl<forms::TextBox>("FXTotal_Debitos");
  forms::TextBox& FXTotal_Creditos = Ctl<forms::TextBox>("FXTotal_Creditos");
  forms::TextBox& FXContador = Ctl<forms::TextBox>("FXContador");
  forms::Menu& mnFicheiro = Ctl<forms::Menu>("mnFicheiro");
  forms::Menu& mnAbrir = Ctl<forms::Menu>("mnAbrir");
  forms::Menu& mnNovo = Ctl<forms::Menu>("mnNovo");
  forms::Menu& mnRemover = Ctl<forms::Menu>("mnRemover");
  forms::Menu& mnImportar = Ctl<forms::Menu>("mnImportar");
  forms::Menu& mnPredefinidos = Ctl<forms::Menu>("mnPredefinidos");

 protected:
  void Form_Load() override;
  void Form_Activate() override;
  void Form_Unload(int& Cancel) override;
  void Form_Resize() override;

  // The entry's state beside its key (see the diagram above).
  bool Finalizado = false;
  bool Sistema = false;
  bool Desbloqueado = false;
  // The line editor opened last, and the window a restart handed over to.
  vb::ObjectPtr DetailsForm;
  vb::ObjectPtr RestartForm;
  // An item of the list was clicked since the context menu last closed.
  bool ItemSelecionado = false;

  // The unsaved mark.
  forms::ToolbarButton& SaveButton() { return Toolbar1.Buttons()("gravar"); }
  void MarkUnsaved() { SaveButton().SetEnabled(true); }
  void ClearUnsaved() { SaveButton().SetEnabled(false); }

  // The hourglass while a command runs. The default pointer is put back only on a
  // window still loaded: touching an unloaded form would load it again.
  void Hourglass() { SetMousePointer(forms::vbHourglass); }
  void DefaultPointer();

  // The line commands of the list, the lines toolbar and the context menu.
  void NewLine();
  void OpenLine();
  void RemoveLine();

 private:
  static forms::FormDesign Design();
  void BindHandlers();
  void PublishMembers();

  // Lifecycle helpers.
  void ShowHeader(const ado::RecordsetPtr& header);
  void ShowLineFields(int32_t dorvantoId);
  void WriteHeader();
  void RememberDefaults();
  void ApplyRememberedDefaults();

  // Lines list helpers.
  void FillLinesFromScratch();
  bool RefreshListedLines();
  void SelectSavedLine(int32_t ID);
  void ApplyLockedLook();
  void ApplyUnlockedLook();
  void ApplyFinalLook();
  void ApplyOpenLook();
  void PaintLinesArea(bool editable);
  void PaintHeaderFields(bool editable);

  // Finalizing helpers.
  forms::ToolbarButton& FinalizeButton() { return Toolbar1.Buttons()("finalizar"); }
  bool FinalizeOpenEntry();
  void NumberLine(const vb::Variant& diarioId);
  void AskReopen();

  // Header field helpers.
  void CheckDocumentNumber();
  void HeaderFieldKey(int KeyCode);

  // Shell helpers.
  vb::ObjectPtr NewDetailsForm();
  int32_t SelectedLineKey();
  bool ListHasItems() { return ListView1.ListItems().Count() > 0; }
  void ShowContextMenu(float x, float y);
  void TellCaller();

  // Event handlers.
  void Toolbar1_ButtonClick(forms::ToolbarButton& Button);
  void Toolbar2_ButtonClick(forms::ToolbarButton& Button);
  void ListView1_DblClick();
  void ListView1_ItemClick(forms::ListItem& Item);
  void ListView1_KeyDown(int& KeyCode, int Shift);
  void ListView1_MouseUp(int Button, int Shift, float X, float Y);
  void ListView1_BeforeLabelEdit(int& Cancel);
  void mnAbrir_Click();
  void mnNovo_Click();
  void mnRemover_Click();
  void HeaderField_KeyDown(const char* procedure, int KeyCode);
  void FXDorvanto_No_KeyDown(int& KeyCode, int Shift);
  void FXDorvanto_No_LostFocus();
  void FXTipo_Diario_ID_KeyDown(int& KeyCode, int Shift);
  void FXRelated_ID_Label_Click();
  void Image1_DblClick();

  HeaderEditorWindows windows_;
  FormLayout layout_;
};

}  // namespace entry
