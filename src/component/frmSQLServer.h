#pragma once
// The dialog shown when the database server cannot be reached: it says so, and asks
// whether to try again ("&Ligar ao servidor SQL") or give up ("&Sair", also the close
// box). The data environment shows it modeless and waits while it is visible; then it
// reads TryAgain and unloads it. An unload while the dialog is still on screen only
// hides it, so the waiting loop ends before the form goes away.

#include "platform/forms/Forms.h"

namespace component {

class frmSQLServer : public forms::Form {
 public:
  frmSQLServer();

  // The answer, read after the dialog is hidden: true to try the connection again.
  bool TryAgain = false;

  forms::Image& Image1 = Ctl<forms::Image>("Image1");
  forms::ImageList& ImageList1 = Ctl<forms::ImageList>("ImageList1");
  forms::Label& Label1 = Ctl<forms::Label>("Label1");
  forms::Label& Label2_0 = Ctl<forms::Label>("Label2", 0);
  forms::Label& Label2_1 = Ctl<forms::Label>("Label2", 1);
  forms::CommandButton& Command1 = Ctl<forms::CommandButton>("Command1");
  forms::CommandButton& Command2 = Ctl<forms::CommandButton>("Command2");

 protected:
  void Form_Load() override;
  void Form_Activate() override;
  void Form_QueryUnload(int& Cancel, int UnloadMode) override;
  void Form_Unload(int& Cancel) override;

 private:
  static forms::FormDesign Design();
  void Command1_Click();
  void Command2_Click();
};

}  // namespace component
