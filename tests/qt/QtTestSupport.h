#pragma once
// A form with a control of each kind the tests drive, and a fixture that installs the
// Qt desktop at a known scale (144 dpi: 10 twips to the pixel).

#include <gtest/gtest.h>

#include <QApplication>
#include <QTest>
#include <memory>
#include <string>
#include <vector>

#include "platform/forms/Forms.h"
#include "qt/ControlView.h"
#include "qt/FormWindow.h"
#include "qt/QtDesktop.h"
#include "qt/Renderer.h"

namespace dvqt::testing {

inline forms::FormDesign SampleDesign() {
  using forms::ControlType;
  return {.name = "frmSample", .caption = "Amostra", .left = 1500, .top = 1500, .width = 7200, .height = 6000,
          .controls = {
              {.name = "Label1", .type = ControlType::Label, .left = 120, .top = 120, .width = 1200,
               .height = 300, .caption = "&Nome:"},
              {.name = "Text1", .type = ControlType::TextBox, .left = 1440, .top = 720, .width = 2880, .height = 360},
              {.name = "Text2", .type = ControlType::TextBox, .left = 1440, .top = 1200, .width = 2880, .height = 360},
              {.name = "Frame1", .type = ControlType::Frame, .left = 4500, .top = 600, .width = 2400,
               .height = 1500, .caption = "Opções"},
              {.name = "Check1", .type = ControlType::CheckBox, .left = 200, .top = 400, .width = 2000,
               .height = 300, .caption = "&Ativo", .container = "Frame1"},
              {.name = "Combo1", .type = ControlType::ComboBox, .left = 1440, .top = 1700, .width = 2880,
               .height = 360, .properties = {{"Style", 2}}},
              {.name = "Command1", .type = ControlType::CommandButton, .left = 5700, .top = 4800, .width = 1200,
               .height = 400, .caption = "&OK", .properties = {{"Default", true}}},
              {.name = "Toolbar1", .type = ControlType::Toolbar, .left = 0, .top = 0, .width = 4000, .height = 400,
               .items = {{"gravar", "&Gravar"}, {"apagar", "&Apagar"}}},
              {.name = "ListView1", .type = ControlType::ListView, .left = 120, .top = 2200, .width = 4200,
               .height = 1500,
               .items = {{"", "Conta", 1500, forms::lvwColumnLeft}, {"", "Débito", 1200, forms::lvwColumnRight}}},
              {.name = "TreeView1", .type = ControlType::TreeView, .left = 4500, .top = 2200, .width = 2400,
               .height = 1500},
              {.name = "DTPicker1", .type = ControlType::DTPicker, .left = 120, .top = 3900, .width = 2000, .height = 360},
          }};
}

class SampleForm : public forms::Form {
 public:
  SampleForm() : Form(SampleDesign()) {
    Text1.KeyDown = [this](int& KeyCode, int Shift) {
      log.push_back("KeyDown " + std::to_string(KeyCode) + " " + std::to_string(Shift));
      if (KeyCode == swallow) KeyCode = 0;
    };
    Text1.KeyPress = [this](int& KeyAscii) { log.push_back("KeyPress " + std::to_string(KeyAscii)); };
    Text1.KeyUp = [this](int& KeyCode, int) { log.push_back("KeyUp " + std::to_string(KeyCode)); };
    Text1.Change = [this] { log.push_back("Change " + Text1.Text()); };
    Text1.Validate = [this](int& Cancel) {
      log.push_back("Validate");
      Cancel = refuse ? 1 : 0;
    };
    Check1.Click = [this] { log.push_back("Check1 " + std::to_string(Check1.Value())); };
    Command1.Click = [this] {
      log.push_back("Command1");
      if (unloadOnClick) Unload();
    };
    Toolbar1.ButtonClick = [this](forms::ToolbarButton& button) { log.push_back("button " + button.Key()); };
  }
  void Form_QueryUnload(int& Cancel, int UnloadMode) override {
    log.push_back("QueryUnload " + std::to_string(UnloadMode));
    Cancel = keepOpen ? 1 : 0;
  }

  forms::Label& Label1 = Ctl<forms::Label>("Label1");
  forms::TextBox& Text1 = Ctl<forms::TextBox>("Text1");
  forms::TextBox& Text2 = Ctl<forms::TextBox>("Text2");
  forms::Frame& Frame1 = Ctl<forms::Frame>("Frame1");
  forms::CheckBox& Check1 = Ctl<forms::CheckBox>("Check1");
  forms::ComboBox& Combo1 = Ctl<forms::ComboBox>("Combo1");
  forms::CommandButton& Command1 = Ctl<forms::CommandButton>("Command1");
  forms::Toolbar& Toolbar1 = Ctl<forms::Toolbar>("Toolbar1");
  forms::ListView& ListView1 = Ctl<forms::ListView>("ListView1");
  forms::TreeView& TreeView1 = Ctl<forms::TreeView>("TreeView1");
  forms::DTPicker& DTPicker1 = Ctl<forms::DTPicker>("DTPicker1");

  std::vector<std::string> log;
  int swallow = -1;
  bool refuse = false;
  bool unloadOnClick = false;
  bool keepOpen = false;
};

class QtDesktopTest : public ::testing::Test {
 protected:
  void SetUp() override {
    desktop = std::make_shared<QtDesktop>(TwipsScale(144, 144));
    forms::Desktop::Install(desktop);
  }
  void TearDown() override {
    form.keepOpen = false;
    form.Unload();
    Settle();
    forms::Desktop::Install(nullptr);
    desktop.reset();
  }

  FormWindow* Window(const forms::Form& which) const { return desktop->renderer().WindowOf(which); }
  template <class W = QWidget>
  W* WidgetOf(forms::Control& control) const {
    FormWindow* window = Window(control.Parent());
    ControlView* view = window ? window->ViewOf(&control) : nullptr;
    return view ? dynamic_cast<W*>(view->widget()) : nullptr;
  }
  // Shows the form and makes its window the active one, as a person's would be.
  void ShowActive(forms::Form& which) {
    which.Show();
    FormWindow* window = Window(which);
    ASSERT_NE(window, nullptr);
    window->activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(window));
    Settle();
  }
  static void Settle() {
    for (int i = 0; i < 3; ++i) QCoreApplication::processEvents();
  }

  std::shared_ptr<QtDesktop> desktop;
  SampleForm form;
};

}  // namespace dvqt::testing
