#pragma once
// The two statements that write a line. Every value arrives already as an SQL literal
// (number, quoted text or null); a line without VAT always writes iva 0 and nulls in
// the three VAT columns, whatever the VAT controls still show.

#include <cstdint>
#include <string>

namespace lines {

struct LineLiterals {
  std::string dorvanto_id;
  std::string conta_id;
  std::string sub_conta_id;
  std::string codigo;
  std::string descrit;
  std::string ref;
  std::string debito;
  std::string credito;
  bool iva = false;
  std::string iva_tx_id;
  std::string iva_base_tributavel;
  std::string iva_apuramento;
};

std::string InsertLineStatement(const LineLiterals& line);
// dorvanto_id is not written: a line never moves to another entry.
std::string UpdateLineStatement(const LineLiterals& line, int32_t Diario_ID);

}  // namespace lines
