#pragma once
// The display text of a record's field in a list cell.

#include <cstdint>
#include <string>

#include "platform/ado/Recordset.h"

namespace common {

// Display kinds of list cells.
enum ListKind : int32_t {
  kListDate = 1,         // "dd-mm-yyyy"
  kListNumber = 2,       // "#,##0.00;- #,##0.00"
  kListText = 3,         // the value as text
  kListEuro = 4,         // "€ #,##0.00;€ -#,##0.00"
  kListPercent = 5,      // "0.00 %", the value a fraction
  kListWhole = 6,        // rounded half to even, "#,##0"
  kListDateTime = 7,     // "dd-mm-yyyy Hh:Nn:Ss"
};

// The field of the current record named fieldName (letter case ignored), shown in a
// display kind. A field the recordset lacks, or a Null, shows " " so the cell is not
// empty; an unknown kind shows "". Errors are reported under "modData" and give what
// was built so far ("").
std::string ListField(const ado::RecordsetPtr& rs, const std::string& fieldName, int32_t kind);

}  // namespace common
