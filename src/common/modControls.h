#pragma once
// How the editor windows put values into plain controls and read them back as SQL.
// There is no data binding: each window calls these with the value kind of the field.
//
// A numeric text box (kinds 2, 4, 5, 6, 7, 8) keeps two things: its raw value, as text
// with the regional decimal comma, in Tag, and that value formatted for the eye in
// Text. Records are saved from the raw value, so what is shown can be as rounded and
// decorated as it likes. While the box has the focus it shows the raw value for editing:
//
//     SetControlValue / FormatControlText      BeginEdit (GotFocus)       EndEdit (LostFocus)
//     Tag "1234,5"  Text "€ 1.234,50"   -->   Text "1234,5"        -->   Tag from the typing,
//                                                                         Text formatted again
//
// None of these trap errors: a conversion that fails (a raw value that is no number)
// reaches the trap of the event handler that called them.

#include <cstdint>
#include <string>

#include "platform/forms/Control.h"
#include "platform/forms/TextBox.h"
#include "platform/vb/Variant.h"

namespace common {

// Value kinds of edit controls.
enum ValueKind : int32_t {
  kValuePlain = 0,    // as it comes; a number is also kept as the raw value
  kValueDate = 1,     // "dd-mm-yyyy"
  kValueNumber = 2,   // number with 2 decimals
  kValueText = 3,     // text
  kValueEuro = 4,     // euro amount with 2 decimals
  kValuePercent = 5,  // percentage; the raw value is the fraction (0,15 shows 15,00 %)
  kValueWhole = 6,    // whole number
  kValueEuro3 = 7,    // euro amount with 3 decimals
  kValueNumber3 = 8,  // number with 3 decimals
};

// Puts a value into a text box, label, combo or list box, date picker, check box or
// option button; any other control is left alone.
void SetControlValue(forms::Control& ctl, const vb::Variant& value, int32_t kind);

// The SQL literal of what a control holds; "" for a control that holds no value.
std::string ControlSqlValue(forms::Control& ctl, int32_t kind);

// Shows a numeric text box's raw value in the kind's format; an empty raw value leaves
// the box as it is.
void FormatControlText(forms::TextBox& box, int32_t kind);

// The box got the focus: show the raw value for editing, all of it selected.
void BeginEdit(forms::TextBox& box, int32_t kind);

// The box lost the focus: take what was typed as the new raw value and show it
// formatted. An empty box keeps its old raw value (and saves as null).
void EndEdit(forms::TextBox& box, int32_t kind);

}  // namespace common
