#pragma once
// The desktop of a process nobody installed one in (a batch run, a tool): nobody can
// answer, so every box takes its default button and is written to standard error, where
// whoever reads the log sees what would have been asked.

#include "platform/forms/Desktop.h"

namespace forms {

class ConsoleDesktop : public Desktop {
 public:
  int MsgBox(const MessageBox& box) override;
  std::string InputBox(const InputRequest& request) override;
  void DoEvents() override {}
  // Nobody can act on a window here: a form waited on is closed as its close box
  // would close it, and hidden if it refuses, so the caller never waits forever.
  void WaitWhileVisible(Form& form) override;
};

}  // namespace forms
