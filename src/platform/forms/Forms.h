#pragma once
// The form model: windows without a toolkit. A window is a class derived from
// forms::Form. Its design (caption, size, one row per control) is a table of data;
// its behaviour is member functions: virtual hooks for the form's own events
// (Form_Load, Form_Resize, Form_Unload...) and handlers bound to the controls' events
// with Handle(). Controls are reached as typed references taken from the design by
// name. A renderer observes the model through FormListener and feeds a person's input
// in through KeyboardUser; tests do the same with the ScriptedDesktop installed.
//
//     class frmHello : public forms::Form {
//      public:
//       frmHello() : Form(Design()) {
//         Handle(Command1.Click, &frmHello::Command1_Click);
//         Handle(Text1.Validate, &frmHello::Text1_Validate);
//         Method("Greet", [this](std::vector<vb::Variant>&) { Command1_Click(); return vb::Variant(); });
//       }
//       forms::TextBox& Text1 = Ctl<forms::TextBox>("Text1");
//       forms::CommandButton& Command1 = Ctl<forms::CommandButton>("Command1");
//
//      private:
//       static forms::FormDesign Design() {
//         return {.name = "frmHello", .caption = "Olá", .width = 4800, .height = 2400,
//                 .controls = {
//                     {.name = "Text1", .type = forms::ControlType::TextBox,
//                      .left = 120, .top = 120, .width = 3000, .height = 315,
//                      .properties = {{"MaxLength", 20}}},
//                     {.name = "Command1", .type = forms::ControlType::CommandButton,
//                      .left = 3240, .top = 120, .width = 1200, .height = 375,
//                      .caption = "&OK", .properties = {{"Default", true}}},
//                 }};
//       }
//       void Form_Load() override { Text1.SetText("mundo"); }
//       void Text1_Validate(int& Cancel) { Cancel = Text1.Text().empty(); }
//       void Command1_Click() { forms::MsgBox("Olá " + Text1.Text()); Unload(); }
//     };
//
// Touching Text1 or calling Show loads the form (Form_Load runs once per load); other
// windows call Greet, or read Text1's Text, late-bound through vb::Object.

#include "platform/forms/Buttons.h"
#include "platform/forms/Constants.h"
#include "platform/forms/Control.h"
#include "platform/forms/DTPicker.h"
#include "platform/forms/Design.h"
#include "platform/forms/Desktop.h"
#include "platform/forms/Event.h"
#include "platform/forms/Form.h"
#include "platform/forms/FormListener.h"
#include "platform/forms/KeyboardUser.h"
#include "platform/forms/ListControls.h"
#include "platform/forms/ListView.h"
#include "platform/forms/Menu.h"
#include "platform/forms/ProgressBar.h"
#include "platform/forms/StaticControls.h"
#include "platform/forms/TextBox.h"
#include "platform/forms/Toolbar.h"
#include "platform/forms/TreeView.h"
