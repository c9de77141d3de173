// The statements the component sends, in the text it sends them, against a demo
// database: each must prepare and give the right rows and types.

#include <cmath>
#include <string>

#include "AdoFixture.h"
#include "platform/vb/Date.h"

namespace ado::testing {
namespace {

using vb::VarType;

std::string Key(const vb::Variant& v) { return std::to_string(v.AsLong()); }

class StatementShapes : public DemoDatabase {
 protected:
  // DoInsert of the header editor.
  std::string NewEntry() {
    conn_->Execute(
        "INSERT INTO tbPOC_Dorvantos (data, dorvanto_no, tipo_diario_id, created_by, obs, valor, "
        "finalizado) VALUES (GETDATE(), null, null, 'contabilista', null, 0, 0)");
    auto rs = Query("SELECT @@Identity as last");
    EXPECT_FALSE(rs->Eof());
    return Key(rs->Fields("last").Value());
  }

  // DoGravar of the line editor, a new line.
  std::string NewLine(const std::string& entry, const std::string& debit, const std::string& credit,
                      bool vat = false) {
    vb::Variant sub = Scalar("SELECT * FROM vwPOC_SubContas WHERE codigo_completo = '11001'");
    std::string tail = vat ? ", 1, 4, 100.1, 1)" : ", 0, Null, Null, Null)";
    conn_->Execute(
        "INSERT INTO tbPOC_Dorvantos_Details (dorvanto_id, conta_id, sub_conta_id, codigo, descrit, "
        "ref, debito, credito, iva, iva_tx_id, iva_base_tributavel, iva_apuramento) VALUES (" +
        entry + ", 2, " + Key(sub) + ", 'FCL', 'Factura n.' + CHAR(186) + ' 12', 'FT 12', " + debit +
        ", " + credit + tail);
    return Key(Scalar("SELECT @@Identity as last"));
  }
};

TEST_F(StatementShapes, new_entry_has_server_date_defaults_and_no_lines) {
  std::string key = NewEntry();
  auto rs = Query("SELECT * FROM tbPOC_Dorvantos WHERE dorvanto_id = " + key);
  ASSERT_FALSE(rs->Eof());
  EXPECT_EQ(rs->Fields("DATA").Value().Type(), VarType::Date);
  double ageDays = vb::Now().serial - rs->Fields("data").Value().AsDate().serial;
  EXPECT_LT(std::fabs(ageDays), 1.0 / 24 / 60);
  for (const char* column : {"dorvanto_no", "tipo_diario_id", "obs", "referencia", "sistema", "tipo_id"})
    EXPECT_TRUE(rs->Fields(column).Value().IsNull()) << column;
  EXPECT_EQ(rs->Fields("valor").Value(), vb::Variant(0.0));
  EXPECT_EQ(rs->Fields("finalizado").Value(), vb::Variant(int32_t{0}));
  EXPECT_EQ(rs->Fields("created_by").Value(), vb::Variant("contabilista"));

  EXPECT_TRUE(Query("SELECT TOP 1 * FROM tbPOC_Dorvantos_Details WHERE dorvanto_id = " + key)->Eof());
  auto sums = Query(
      "SELECT sum(debito) as debitos, sum(credito) as creditos FROM tbPOC_Dorvantos_Details "
      "WHERE dorvanto_id = " + key);
  EXPECT_TRUE(sums->Fields("debitos").Value().IsNull());
  EXPECT_TRUE(sums->Fields("creditos").Value().IsNull());
}

TEST_F(StatementShapes, header_save_day_total_and_document_number_check) {
  std::string key = NewEntry();
  NewLine(key, "100.10", "0");
  conn_->Execute(
      "UPDATE tbPOC_Dorvantos SET data = CONVERT(DATETIME,'2010-03-05 0:00:00',102), referencia = "
      "'R-1', tipo_diario_id = 1, obs = null, dorvanto_no = 'D-1' WHERE Dorvanto_ID = " + key);
  conn_->Execute("UPDATE tbPOC_Dorvantos_Details SET data = CONVERT(DATETIME,'2010-03-05 0:00:00',102) WHERE Dorvanto_ID = " + key);
  conn_->Execute("UPDATE tbPOC_Dorvantos_Details SET related_id = 7, tipo_id = null WHERE Dorvanto_ID = " + key);
  conn_->Execute("UPDATE tbPOC_Dorvantos SET finalizado = 1, valor = 100.1 WHERE dorvanto_id = " + key);

  auto line = Query("SELECT TOP 1 * FROM tbPOC_Dorvantos_Details WHERE dorvanto_id = " + key);
  EXPECT_EQ(line->Fields("related_id").Value(), vb::Variant(int32_t{7}));
  EXPECT_EQ(line->Fields("data").Value(), vb::Variant(*vb::DateSerial(2010, 3, 5)));

  const std::string day = "2010-03-05";
  std::string total =
      "SELECT SUM(valor) as total FROM tbPOC_Dorvantos WHERE tipo_diario_id = 1 AND data >= "
      "CONVERT(DATETIME, '" + day + " 0:00:00',102) AND data <= CONVERT(DATETIME, '" + day + " 23:59:59',102)";
  EXPECT_EQ(Scalar(total), vb::Variant(100.1));
  EXPECT_TRUE(Scalar("SELECT SUM(valor) as total FROM tbPOC_Dorvantos WHERE tipo_diario_id = 1 AND data >= "
                     "CONVERT(DATETIME, '2010-03-06 0:00:00',102) AND data <= CONVERT(DATETIME, "
                     "'2010-03-06 23:59:59',102)").IsNull());

  std::string other = NewEntry();
  conn_->Execute("UPDATE tbPOC_Dorvantos SET data = CONVERT(DATETIME,'2010-12-31 0:00:00',102), dorvanto_no = 'd-1' WHERE Dorvanto_ID = " + other);
  EXPECT_EQ(Scalar("SELECT COUNT(*) as no FROM tbPOC_Dorvantos WHERE year(data) = 2010 AND "
                   "dorvanto_no = 'D-1' AND Dorvanto_ID <> " + key),
            vb::Variant(int32_t{1}));
  EXPECT_EQ(Scalar("SELECT COUNT(*) as no FROM tbPOC_Dorvantos WHERE year(data) = 2011 AND "
                   "dorvanto_no = 'D-1' AND Dorvanto_ID <> " + key),
            vb::Variant(int32_t{0}));
}

TEST_F(StatementShapes, finalization_numbers_lines_and_freezes_account_texts) {
  std::string key = NewEntry();
  std::string first = NewLine(key, "100.10", "0", true);
  std::string second = NewLine(key, "0", "100.10");

  conn_->BeginTrans();
  auto lines = Query("SELECT * FROM vwPOC_Dorvantos_Details WHERE dorvanto_id = " + key);
  ASSERT_EQ(lines->RecordCount(), 2);
  EXPECT_TRUE(Query("SELECT * FROM tbPOC_Contadores WHERE nome = 'reg_no'")->Eof());
  conn_->Execute("INSERT INTO tbPOC_Contadores (nome, contador) VALUES ('reg_no',2)");
  conn_->Execute("INSERT INTO tbPOC_Contadores (nome, contador) VALUES ('ano',2010)");
  conn_->Execute("UPDATE tbPOC_Dorvantos_Details SET reg_no = 1, ano = 2010 WHERE diario_id = " + first);
  auto counter = Query("SELECT * FROM tbPOC_Contadores WHERE nome = 'reg_no'");
  std::string number = Key(counter->Fields("contador").Value());
  conn_->Execute("UPDATE tbPOC_Contadores SET contador = contador + 1 WHERE nome = 'reg_no'");
  conn_->Execute("UPDATE tbPOC_Dorvantos_Details SET reg_no = " + number + ", ano = 2010 WHERE diario_id = " + second);
  for (lines->MoveFirst(); !lines->Eof(); lines->MoveNext()) {
    auto text = [&](const char* f) {
      const vb::Variant& v = lines->Fields(f).Value();
      return v.IsNull() ? std::string("null") : "'" + v.AsString() + "'";
    };
    conn_->Execute("UPDATE tbPOC_Dorvantos_Details SET codigo_completo = " + text("codigo_completo_list") +
                   ", conta = " + text("conta_list") + ", conta_descrit = " + text("conta_descrit_list") +
                   ", sub_conta = " + text("sub_conta_list") + ", sub_conta_descrit = " +
                   text("sub_conta_descrit_list") + ", data = CONVERT(DATETIME,'2010-03-05 0:00:00',102) WHERE diario_id = " +
                   Key(lines->Fields("diario_id").Value()));
  }
  conn_->Execute("UPDATE tbPOC_Dorvantos SET finalizado = 1, valor = 100.1 WHERE dorvanto_id = " + key);
  conn_->CommitTrans();

  EXPECT_EQ(Scalar("SELECT contador FROM tbPOC_Contadores WHERE nome = 'reg_no'"), vb::Variant(int32_t{3}));
  auto listed = Query("SELECT * FROM vwPOC_Dorvantos_Details WHERE dorvanto_id = " + key + " ORDER BY diario_id");
  EXPECT_EQ(listed->Fields("reg_no").Value(), vb::Variant(int32_t{1}));
  EXPECT_EQ(listed->Fields("conta_list").Value(), vb::Variant("11"));
  EXPECT_EQ(listed->Fields("codigo_completo_list").Value(), vb::Variant("11001"));
  EXPECT_EQ(listed->Fields("iva_tx").Value(), vb::Variant(0.23));
  EXPECT_EQ(listed->Fields("iva_base_tributavel").Value(), vb::Variant(100.1));
  EXPECT_EQ(listed->Fields("descrit").Value(), vb::Variant("Factura n.\xC2\xBA 12"));
  listed->MoveNext();
  EXPECT_EQ(listed->Fields("reg_no").Value(), vb::Variant(int32_t{2}));
  EXPECT_TRUE(listed->Fields("iva_tx").Value().IsNull());

  auto frozen = Query("SELECT tbPOC_Dorvantos_Details.*, tbPOC_Dorvantos.data, tbPOC_Dorvantos.dorvanto_no "
                      "FROM tbPOC_Dorvantos_Details LEFT JOIN tbPOC_Dorvantos ON "
                      "tbPOC_Dorvantos_Details.dorvanto_id = tbPOC_Dorvantos.dorvanto_id WHERE "
                      "tbPOC_Dorvantos_Details.diario_id = " + first);
  EXPECT_EQ(frozen->Fields("conta_descrit").Value(), vb::Variant("Caixa"));
  EXPECT_EQ(frozen->Fields("sub_conta").Value(), vb::Variant("001"));
  EXPECT_EQ(frozen->Fields("ano").Value(), vb::Variant(int32_t{2010}));
  EXPECT_TRUE(frozen->Fields("dorvanto_no").Value().IsNull());

  conn_->Execute("UPDATE tbPOC_Dorvantos SET finalizado = 0 WHERE dorvanto_id = " + key);
  conn_->Execute("DELETE FROM tbPOC_Dorvantos_Details WHERE Diario_ID = " + first);
  conn_->Execute("DELETE FROM tbPOC_Dorvantos_Details WHERE Dorvanto_ID = " + key);
  conn_->Execute("DELETE FROM tbPOC_Dorvantos WHERE Dorvanto_ID = " + key);
  EXPECT_TRUE(Query("SELECT * FROM tbPOC_Dorvantos WHERE dorvanto_id = " + key)->Eof());
}

TEST_F(StatementShapes, line_update_with_and_without_vat) {
  std::string key = NewEntry();
  std::string line = NewLine(key, "10", "0");
  conn_->Execute("UPDATE tbPOC_Dorvantos_Details SET conta_id = 2, sub_conta_id = 1, codigo = 'REC', descrit = "
                 "'Recebimento', ref = null, debito = 0, credito = 10.5, iva = 1, iva_tx_id = 4, "
                 "iva_base_tributavel = 8.54, iva_apuramento = 0 WHERE diario_id = " + line);
  auto rs = Query("SELECT * FROM tbPOC_Dorvantos_Details WHERE diario_id = " + line);
  EXPECT_EQ(rs->Fields("credito").Value(), vb::Variant(10.5));
  EXPECT_EQ(rs->Fields("debito").Value(), vb::Variant(0.0));  // amounts are Double even when whole
  EXPECT_EQ(rs->Fields("iva_tx_id").Value(), vb::Variant(int32_t{4}));
  conn_->Execute("UPDATE tbPOC_Dorvantos_Details SET conta_id = 2, sub_conta_id = 1, codigo = 'REC', descrit = "
                 "'Recebimento', ref = null, debito = 0, credito = 10.5, iva = 0, iva_tx_id = null, "
                 "iva_base_tributavel = null, iva_apuramento = null WHERE diario_id = " + line);
  EXPECT_TRUE(Scalar("SELECT iva_base_tributavel FROM tbPOC_Dorvantos_Details WHERE diario_id = " + line).IsNull());
}

TEST_F(StatementShapes, reference_lists_and_lookups) {
  auto journals = Query("SELECT * FROM tbPOC_Diario_Tipos ORDER BY descrit");
  EXPECT_EQ(journals->Fields("descrit").Value(), vb::Variant("Abertura e encerramento"));
  EXPECT_EQ(journals->RecordCount(), 7);

  auto integration = Query(
      "SELECT * FROM tbContactos_ContasCorrentes_Tipos WHERE tipo_diario_id is not null ORDER BY descrit");
  EXPECT_EQ(integration->RecordCount(), 9);
  EXPECT_EQ(integration->Fields("descrit").Value(), vb::Variant("Facturas de clientes"));
  EXPECT_FALSE(Query("SELECT * FROM tbContactos_ContasCorrentes_Tipos WHERE tipo_id = 1")->Eof());

  // An unquoted number against the text codes, as the line editor sends it.
  auto account = Query("SELECT * FROM tbPOC_Contas WHERE codigo = 2432");
  ASSERT_FALSE(account->Eof());
  EXPECT_EQ(account->Fields("descrit").Value(), vb::Variant("IVA - Dedutível"));
  std::string id = Key(account->Fields("conta_id").Value());
  EXPECT_EQ(Scalar("SELECT * FROM tbPOC_Contas WHERE conta_id = " + id), account->Fields(0).Value());
  EXPECT_TRUE(Query("SELECT * FROM tbPOC_Contas WHERE codigo = 99999")->Eof());

  auto sub = Query("SELECT * FROM vwPOC_SubContas WHERE codigo_completo = '2432002'");
  ASSERT_FALSE(sub->Eof());
  EXPECT_EQ(sub->Fields("conta_id").Value().AsLong(), std::stoi(id));
  EXPECT_EQ(sub->Fields("conta_descrit").Value(), vb::Variant("IVA - Dedutível"));
  EXPECT_EQ(sub->Fields("codigo").Value(), vb::Variant("002"));
  EXPECT_FALSE(Query("SELECT * FROM vwPOC_SubContas WHERE sub_conta_id = " +
                     Key(sub->Fields("sub_conta_id").Value()))->Eof());

  auto vat = Query("SELECT * FROM vwTaxas_Iva ORDER BY tx");
  EXPECT_EQ(vat->Fields("tx").Value(), vb::Variant(0.0));
  vat->MoveLast();
  EXPECT_EQ(vat->Fields("tx").Value(), vb::Variant(0.23));
  EXPECT_EQ(vat->Fields("descrit2").Value(), vb::Variant("23,00 % - Taxa normal (Continente)"));

  auto codes = Query("SELECT * FROM tbPOC_Dorvantos_Codigos ORDER BY codigo");
  EXPECT_EQ(codes->Fields("codigo").Value(), vb::Variant("ABT"));
  EXPECT_EQ(Query("SELECT * FROM tbPOC_Dorvantos_Codigos WHERE codigo like '%c%'")->RecordCount(),
            Query("SELECT * FROM tbPOC_Dorvantos_Codigos WHERE codigo like '%C%'")->RecordCount());
  EXPECT_EQ(Scalar("SELECT descrit FROM tbPOC_Dorvantos_Codigos WHERE codigo like '%FC%'"),
            vb::Variant("Factura de cliente"));
  EXPECT_FALSE(Query("SELECT * FROM tbPOC_Dorvantos_Codigos WHERE descrit_id = 1")->Eof());
}

TEST_F(StatementShapes, account_tree_query_joins_texts_with_plus) {
  conn_->Execute("INSERT INTO tbPOC_Contas (codigo, descrit, atribuicao) VALUES ('999', null, 0)");
  auto rs = Query(
      "SELECT CASE WHEN codigo is null AND descrit is null THEN null WHEN codigo is null AND descrit is "
      "not null THEN ' - ' + descrit WHEN codigo is not null AND descrit is null THEN codigo + ' - ' "
      "WHEN codigo is not null AND descrit is not null THEN codigo + ' - ' + descrit END as "
      "codigo_descrit, CASE WHEN conta_activo is null and conta_passivo is null THEN '' WHEN "
      "conta_activo is not null and conta_passivo is null THEN ' => ' + conta_activo + '' WHEN "
      "conta_activo is null and conta_passivo is not null THEN ' => ' + conta_passivo + '' WHEN "
      "conta_activo is not null and conta_passivo is not null THEN ' => ' + conta_activo + ', ' + "
      "conta_passivo + '' END as associacao, * FROM tbPOC_Contas ORDER BY codigo");
  EXPECT_EQ(rs->Fields("codigo_descrit").Value(), vb::Variant("1 - Disponibilidades"));
  EXPECT_EQ(rs->Fields("associacao").Value(), vb::Variant(""));
  rs->Find("codigo = '12'");
  EXPECT_EQ(rs->Fields("associacao").Value(), vb::Variant(" => 12, 231"));
  rs->Find("codigo = '999'");
  EXPECT_EQ(rs->Fields("codigo_descrit").Value(), vb::Variant("999 - "));
  // Parents come before their children in code order.
  rs->MoveFirst();
  EXPECT_EQ(rs->Fields("codigo").Value(), vb::Variant("1"));
  rs->MoveNext();
  EXPECT_EQ(rs->Fields("codigo").Value(), vb::Variant("11"));
}

TEST_F(StatementShapes, server_questions_clock_trancount_and_closings) {
  vb::Variant now = Scalar("SELECT GETDATE() AS DATE");
  ASSERT_EQ(now.Type(), VarType::Date);
  EXPECT_LT(std::fabs(now.AsDate().serial - vb::Now().serial), 1.0 / 24 / 60);
  EXPECT_EQ(conn_->Execute("SELECT GETDATE() AS DATE")->Fields("date").Value().Type(), VarType::Date);

  EXPECT_EQ(Scalar("SELECT @@TRANCOUNT as valor"), vb::Variant(int32_t{0}));
  conn_->BeginTrans();
  EXPECT_EQ(Scalar("SELECT @@TRANCOUNT as valor"), vb::Variant(int32_t{1}));
  EXPECT_EQ(Scalar("SELECT @@TRANCOUNT + 0 as valor"), vb::Variant(int32_t{1}));  // the engine's own answer
  conn_->RollbackTrans();
  EXPECT_EQ(Scalar("SELECT @@TRANCOUNT as flTrans"), vb::Variant(int32_t{0}));

  const std::string closing =
      "SELECT MAX(data) as max_data FROM tbFechos WHERE (anulado is null OR anulado = 0)";
  EXPECT_EQ(Scalar(closing), vb::Variant(*vb::DateSerial(2009, 12, 31)));
  conn_->Execute("INSERT INTO tbFechos (data, anulado) VALUES (CONVERT(DATETIME,'2011-01-31 0:00:00',102), null)");
  EXPECT_EQ(Scalar(closing), vb::Variant(*vb::DateSerial(2011, 1, 31)));
  conn_->Execute("DELETE FROM tbFechos");
  EXPECT_TRUE(Scalar(closing).IsNull());
}

TEST_F(StatementShapes, identity_follows_the_last_insert_of_this_connection) {
  EXPECT_TRUE(Scalar("SELECT @@IDENTITY as last").IsNull());  // nothing inserted yet
  std::string a = NewEntry();
  std::string b = NewEntry();
  EXPECT_EQ(std::stoi(b), std::stoi(a) + 1);
  // Another connection's insert does not move ours.
  auto other = Connection::Create();
  other->Open(ConnectionString(kUser, kPassword));
  other->Execute("INSERT INTO tbPOC_Dorvantos (created_by, valor, finalizado) VALUES ('x', 0, 0)");
  EXPECT_EQ(Key(Scalar("SELECT @@Identity as last")), b);
  // Keys are never handed out twice, even after the last row is deleted.
  conn_->Execute("DELETE FROM tbPOC_Dorvantos");
  std::string c = NewEntry();
  EXPECT_GT(std::stoi(c), std::stoi(b) + 1);
}

}  // namespace
}  // namespace ado::testing
