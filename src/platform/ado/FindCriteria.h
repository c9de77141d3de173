#pragma once
// One criterion of Recordset::Find: "field op value", op one of = <> < > <= >= LIKE;
// the value a number, a 'quoted text' (quote doubled inside), a #date# or bare text.
// Texts compare ignoring case and keeping accents, as the database does.

#include <string>
#include <string_view>

#include "platform/vb/Variant.h"

namespace ado {

struct FindCriteria {
  enum class Op { Equal, NotEqual, Less, Greater, LessEqual, GreaterEqual, Like };

  std::string field;
  Op op = Op::Equal;
  vb::Variant value;

  // Raises 3001 for a criterion it cannot read.
  static FindCriteria Parse(std::string_view text);
  bool Matches(const vb::Variant& candidate) const;
};

}  // namespace ado
