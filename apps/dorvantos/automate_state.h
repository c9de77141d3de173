#pragma once
// What the automation driver reads off the form model and writes as JSON: a window's
// state with its controls, the message boxes and menus it asks a script to answer, and
// the names scripts use for keys and controls. Kept apart from the driver's loop so that
// it can be checked without a pipe.

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include <nlohmann/json.hpp>

#include "platform/forms/Forms.h"
#include "platform/vb/Variant.h"

namespace app::automate {

using Json = nlohmann::ordered_json;

// A key as a script names it: "Enter", "Tab", "Left", "Right", "Up", "Down", "Delete",
// "Backspace", "Escape", "Space", "Home", "End", "PageUp", "PageDown", "Insert",
// "F1".."F12", "Add" and "Subtract" (the keypad's), each optionally after "Shift+",
// "Ctrl+" and "Alt+". Names compare ignoring letter case.
struct KeyStroke {
  int keyCode = 0;
  int shift = 0;      // vbShiftMask | vbCtrlMask | vbAltMask
  int character = 0;  // what the key types by itself (KeyPress), 0 for none
};
std::optional<KeyStroke> KeyFromName(std::string_view name);

// A control's name as scripts use it: "Text1", or "Label2(1)" for one of an array.
std::string ControlName(const forms::Control& control);
// Splits "Label2(1)" into "Label2" and 1; a name without an index gives -1. Nothing
// for text that is not a name with an optional non-negative index.
struct ControlRef {
  std::string name;
  int index = -1;
};
std::optional<ControlRef> ParseControlName(std::string_view text);

// A colour as Basic writes it: "&H8000000F", "&HFFFFFF".
std::string ColorText(int32_t color);
// "yyyy-mm-dd hh:mm:ss".
std::string DateText(vb::Date date);
// A value as JSON: Empty, Null and objects as null, dates as DateText, numbers as numbers.
Json ValueJson(const vb::Variant& value);

// One control with its type and properties in camelCase.
Json ControlState(forms::Control& control);
// The state of a loaded window, without its identity (name and instance).
Json FormState(forms::Form& form);

// The events a script answers.
Json MsgBoxEvent(const forms::MessageBox& box);
Json InputBoxEvent(const forms::InputRequest& request);
Json MenuEvent(forms::Menu& menu);

// A button name of a message box answer ("ok", "yes"...) as its answer, or nothing.
std::optional<int> AnswerFromName(std::string_view name);
// What closing a box without choosing gives: Cancel, or No, or OK, whichever it offers.
int CancelAnswer(const forms::MessageBox& box);

}  // namespace app::automate
