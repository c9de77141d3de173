#pragma once
// The tables the finder knows, by the key its callers name them with, and the rows it
// offers from them. Only "POC_SUBCONTAS" (the view vwPOC_SubContas) is known today.
//
// A filter narrows the rows before the person sees them. It is given as SQL-like text
// ("conta_id = 12"), but it is never pasted into a statement: only comparisons of a
// key column with a whole number, joined by AND, are accepted, and they are written
// out again from what was understood.

#include <cstdint>
#include <string>
#include <vector>

#include "platform/ado/Connection.h"

namespace recordfinder {

struct FinderRow {
  int32_t key = 0;
  std::string code;
  std::string name;
  std::string account;
};

struct FinderTable {
  std::string title;  // the window's caption
  std::vector<FinderRow> rows;
};

// Raises vb::Error 5 for a table key it does not know or a filter it does not accept.
FinderTable LoadFinderTable(const ado::ConnectionPtr& connection, const std::string& tableKey,
                            const std::string& filter);

// The WHERE condition a filter stands for, rebuilt from its parts; "" for no filter.
std::string FilterCondition(const std::string& filter);

// Whether a row matches what the person typed: its code begins with the text, or its
// name contains it, letter case ignored. An empty text matches every row.
bool RowMatches(const FinderRow& row, const std::string& typed);

}  // namespace recordfinder
