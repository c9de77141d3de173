#include "lines/LineStatements.h"

namespace lines {

std::string InsertLineStatement(const LineLiterals& line) {
  std::string sql =
      "INSERT INTO tbPOC_Dorvantos_Details (dorvanto_id, conta_id, sub_conta_id, codigo, descrit, "
      "ref, debito, credito, iva, iva_tx_id, iva_base_tributavel, iva_apuramento) VALUES (" +
      line.dorvanto_id + ", " + line.conta_id + ", " + line.sub_conta_id + ", " + line.codigo +
      ", " + line.descrit + ", " + line.ref + ", " + line.debito + ", " + line.credito;
  if (!line.iva) return sql + ", 0, Null, Null, Null)";
  return sql + ", 1, " + line.iva_tx_id + ", " + line.iva_base_tributavel + ", " +
         line.iva_apuramento + ")";
}

std::string UpdateLineStatement(const LineLiterals& line, int32_t Diario_ID) {
  std::string sql = "UPDATE tbPOC_Dorvantos_Details SET conta_id = " + line.conta_id +
                    ", sub_conta_id = " + line.sub_conta_id + ", codigo = " + line.codigo +
                    ", descrit = " + line.descrit + ", ref = " + line.ref +
                    ", debito = " + line.debito + ", credito = " + line.credito;
  if (!line.iva)
    sql += ", iva = 0, iva_tx_id = null, iva_base_tributavel = null, iva_apuramento = null WHERE diario_id = ";
  else
    sql += ", iva = 1, iva_tx_id = " + line.iva_tx_id + ", iva_base_tributavel = " +
           line.iva_base_tributavel + ", iva_apuramento = " + line.iva_apuramento +
           " WHERE diario_id = ";
  return sql + std::to_string(Diario_ID);
}

}  // namespace lines
