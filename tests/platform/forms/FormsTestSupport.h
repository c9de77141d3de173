#pragma once
// A small window for the tests: a text box, a second text box, a check box, a combo,
// OK and Cancel buttons, and a log of the events raised, in order.

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "platform/forms/Forms.h"
#include "platform/forms/ScriptedDesktop.h"

namespace forms::testing {

inline FormDesign SampleDesign() {
  return {.name = "frmSample",
          .caption = "Amostra",
          .width = 6000,
          .height = 4000,
          .controls = {
              {.name = "Text1", .type = ControlType::TextBox, .left = 100, .top = 100,
               .width = 2000, .height = 300},
              {.name = "Text2", .type = ControlType::TextBox, .left = 100, .top = 500,
               .width = 2000, .height = 300, .caption = "design"},
              {.name = "Check1", .type = ControlType::CheckBox, .left = 100, .top = 900,
               .width = 2000, .height = 300, .caption = "IVA"},
              {.name = "Combo1", .type = ControlType::ComboBox, .left = 100, .top = 1300,
               .width = 2000, .height = 300, .properties = {{"Style", 2}}},
              {.name = "Label2", .type = ControlType::Label, .caption = "zero", .index = 0},
              {.name = "Label2", .type = ControlType::Label, .caption = "um", .index = 1},
              {.name = "Command1", .type = ControlType::CommandButton, .caption = "&OK"},
              {.name = "Command2", .type = ControlType::CommandButton, .caption = "&Cancelar"},
          }};
}

class SampleForm : public Form {
 public:
  explicit SampleForm(FormDesign design = SampleDesign()) : Form(std::move(design)) {
    Text1.Validate = [this](int& Cancel) {
      Log("Text1.Validate");
      Cancel = refuseText1;
    };
    Text1.LostFocus = [this] { Log("Text1.LostFocus"); };
    Text1.GotFocus = [this] { Log("Text1.GotFocus"); };
    Text1.KeyDown = [this](int& KeyCode, int Shift) {
      Log("Text1.KeyDown " + std::to_string(KeyCode));
      if (KeyCode == swallowKeyCode) KeyCode = 0;
    };
    Text1.KeyPress = [this](int& KeyAscii) {
      Log("Text1.KeyPress " + std::to_string(KeyAscii));
      if (KeyAscii == swallowKeyAscii) KeyAscii = 0;
    };
    Text1.Change = [this] { Log("Text1.Change " + Text1.Text()); };
    Text1.KeyUp = [this](int& KeyCode, int) { Log("Text1.KeyUp " + std::to_string(KeyCode)); };
    Text2.GotFocus = [this] { Log("Text2.GotFocus"); };
    Check1.Click = [this] { Log("Check1.Click " + std::to_string(Check1.Value())); };
    Combo1.Click = [this] { Log("Combo1.Click " + std::to_string(Combo1.ListIndex())); };
    Handle(Command1.Click, &SampleForm::Command1_Click);
    Command2.Click = [this] { Log("Command2.Click"); };
  }

  TextBox& Text1 = Ctl<TextBox>("Text1");
  TextBox& Text2 = Ctl<TextBox>("Text2");
  CheckBox& Check1 = Ctl<CheckBox>("Check1");
  ComboBox& Combo1 = Ctl<ComboBox>("Combo1");
  CommandButton& Command1 = Ctl<CommandButton>("Command1");
  CommandButton& Command2 = Ctl<CommandButton>("Command2");

  std::vector<std::string> log;
  int loads = 0;
  int refuseText1 = 0;
  int swallowKeyCode = -1;
  int swallowKeyAscii = -1;
  int cancelUnload = 0;
  int lastUnloadMode = -1;
  bool hideOnOK = false;
  bool unloadOnOK = false;

  void Log(std::string line) { log.push_back(std::move(line)); }

 protected:
  void Form_Load() override {
    ++loads;
    Log("Form_Load");
  }
  void Form_Activate() override { Log("Form_Activate"); }
  void Form_QueryUnload(int& Cancel, int UnloadMode) override {
    lastUnloadMode = UnloadMode;
    Log("Form_QueryUnload " + std::to_string(UnloadMode));
  }
  void Form_Unload(int& Cancel) override {
    Log("Form_Unload");
    Cancel = cancelUnload;
  }
  void Form_Resize() override { Log("Form_Resize"); }

 private:
  void Command1_Click() {
    Log("Command1.Click");
    if (hideOnOK) Hide();
    if (unloadOnOK) Unload();
  }
};

// Installs a scripted desktop for the duration of a test.
class FormsTest : public ::testing::Test {
 protected:
  void SetUp() override { Desktop::Install(desktop); }
  void TearDown() override { Desktop::Install(nullptr); }

  std::shared_ptr<ScriptedDesktop> desktop = std::make_shared<ScriptedDesktop>();
};

}  // namespace forms::testing
