#pragma once
// The account finder: the whole chart of accounts as a tree built from the account
// codes, from which the person picks the account of a journal line.
//
// The opener creates a finder, sets its MainForm to itself and calls DoOpen; the
// finder is modeless, so DoOpen returns with the window still open. The pick comes
// back later as a late-bound call of DoFillConta on MainForm, with the account's
// conta_id by reference (0 when no node was clicked):
//
//     opened --node clicks--> a pick (ContaSelecionada) --Selecionar / double click-->
//         hidden, DoFillConta(ContaSelecionada), unloaded; the opener stays
//     opened --Cancelar / close box--> unloaded without a call-back, and the opener
//         is unloaded too: leaving the finder without a pick leaves the line as well
//
// Every error of this window is reported under the project label "Cordavel".

#include <cstdint>
#include <memory>
#include <string>

#include "entry/modLayout.h"
#include "platform/ado/Recordset.h"
#include "platform/forms/Forms.h"
#include "platform/vb/Object.h"

namespace accounts {

class frmFindConta : public forms::Form {
 public:
  frmFindConta();

  // The window that opened the finder; it offers DoFillConta(ID As Long, by reference).
  // The finder does not keep it alive: the opener owns its finder, and a finder owning
  // its opener back would keep both alive for ever. An opener gone reads as Nothing.
  vb::ObjectPtr MainForm() const { return mainForm_.lock(); }
  void SetMainForm(const vb::ObjectPtr& form) { mainForm_ = form; }

  // Shows the window, then builds the tree.
  void DoOpen();
  // Confirms the pick: hides the window, hands ContaSelecionada to MainForm's
  // DoFillConta and unloads the window.
  void DoSair();

  forms::Label& Label1 = Ctl<forms::Label>("Label1");
  forms::Frame& Frame2 = Ctl<forms::Frame>("Frame2");
  forms::Frame& TreeView1_Border = Ctl<forms::Frame>("TreeView1_Border");
  forms::TreeView& TreeView1 = Ctl<forms::TreeView>("TreeView1");
  forms::ImageList& ImageList1 = Ctl<forms::ImageList>("ImageList1");
  forms::Label& ProgressBar1_Label = Ctl<forms::Label>("ProgressBar1_Label");
  forms::ProgressBar& ProgressBar1 = Ctl<forms::ProgressBar>("ProgressBar1");
  forms::CommandButton& Command2 = Ctl<forms::CommandButton>("Command2");
  forms::CommandButton& Command1 = Ctl<forms::CommandButton>("Command1");

 protected:
  void Form_Load() override;
  void Form_Resize() override;
  void Form_Unload(int& Cancel) override;

 private:
  static forms::FormDesign Design();
  void DeclareMembers();

  // The tree (frmFindConta_tree.cpp).
  void Fill_Tree();
  void ShowBuildProgress(bool building);
  void AddAccountNode(const ado::RecordsetPtr& rs);
  forms::Node& PlaceUnderParent(const std::string& codigo, const std::string& text);
  void StepProgress();
  bool StillOpen(uint64_t generation) const;

  // The person's actions.
  void Command1_Click();
  void Command2_Click();
  void TreeView1_NodeClick(forms::Node& node);
  void TreeView1_DblClick();
  void TreeView1_BeforeLabelEdit(int& Cancel);

  std::weak_ptr<vb::Object> mainForm_;
  // conta_id of the last clicked node; 0 until a node is clicked.
  int32_t ContaSelecionada = 0;
  // The person confirmed a pick; an unload without one takes the opener along.
  bool Confirmado = false;
  // Keeps LarguraAnterior and AlturaAnterior and runs the resize pass.
  entry::FormLayout layout_;
};

}  // namespace accounts
