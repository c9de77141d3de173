#pragma once
// Fills a combo box or a list box with the rows of a query on the shared connection:
// one entry per row, its text from one field and, when a second field is named, its
// item data (normally the row's key) from that one.

#include <string>

#include "platform/forms/ListControls.h"

namespace common {

// The control is cleared and refilled only when the query has rows and names the
// fields exactly (letter case included); otherwise it keeps its entries. Rows whose
// text is Null are left out. Errors are trapped and reported; the control may then
// be half filled.
void ControlFill(forms::ListControl& ctl, const std::string& sql, const std::string& textField,
                 const std::string& itemDataField);

}  // namespace common
