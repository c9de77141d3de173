// The PostgreSQL dialect: the translation on its own, then the schema, the demo data and
// the component's statements on a live server (the one POC_TEST_PG_ENV describes; see
// scripts/pg-test-server).

#include <gtest/gtest.h>
#include <libpq-fe.h>
#include <unistd.h>

#include <cstdlib>
#include <fstream>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/ado/Database.h"
#include "platform/ado/PostgresDialect.h"
#include "platform/ado/SqlTokenizer.h"

namespace ado::sql {
namespace {

std::string Pg(std::string_view tsql, int tranCount = 0) { return TranslateToPostgres(tsql, tranCount).sql; }

TEST(PostgresTranslation, server_variables_and_functions) {
  EXPECT_EQ(Pg("SELECT @@Identity as last"), "SELECT dv_identity() as last");
  EXPECT_EQ(Pg("SELECT @@TRANCOUNT as flTrans", 1), "SELECT 1 as flTrans");
  EXPECT_FALSE(TranslateToPostgres("SELECT @@TRANCOUNT as flTrans", 0).tranCountColumn);  // still sent
  EXPECT_EQ(Pg("SELECT GETDATE() AS DATE"), "SELECT GETDATE() AS DATE");
  EXPECT_EQ(Pg("SELECT ISNULL(a, N'Não')"), "SELECT COALESCE(a, 'Não')");
  EXPECT_EQ(Pg("SELECT CHAR(39), CHAR(186), CHAR(128), CHAR(n)"), "SELECT chr(39), chr(186), chr(8364), chr(n)");
  EXPECT_EQ(Pg("SELECT CAST(a AS CHAR(10))"), "SELECT CAST(a AS CHAR(10))");
  EXPECT_THROW(Pg("SELECT @@ROWCOUNT"), TranslateError);
  EXPECT_THROW(Pg("SELECT @x"), TranslateError);
}

TEST(PostgresTranslation, dates_and_conversions) {
  EXPECT_EQ(Pg("WHERE d >= CONVERT(DATETIME, '2009-12-31 0:00:00',102)"), "WHERE d >= TIMESTAMP '2009-12-31 00:00:00'");
  EXPECT_EQ(Pg("SELECT CONVERT(DATETIME, '2010.03.05', 102)"), "SELECT TIMESTAMP '2010-03-05 00:00:00'");
  EXPECT_EQ(Pg("SELECT CONVERT(DATETIME, x, 102)"), "SELECT CAST(x AS timestamp(3))");
  EXPECT_THROW(Pg("SELECT CONVERT(DATETIME, '2010-02-30', 102)"), TranslateError);
  EXPECT_EQ(Pg("SELECT CONVERT(varchar(20), CONVERT(decimal(9,2), t.tx * 100))"),
            "SELECT CAST(CAST(t.tx * 100 AS numeric(9,2)) AS varchar(20))");
  EXPECT_EQ(Pg("SELECT CONVERT(varchar, a), CONVERT(int, b), CONVERT(money, c), CONVERT(decimal, d)"),
            "SELECT CAST(a AS varchar(30)), CAST(b AS integer), CAST(c AS numeric(19,4)), CAST(d AS numeric(18,0))");
  EXPECT_THROW(Pg("SELECT CONVERT(xml, a)"), TranslateError);
}

TEST(PostgresTranslation, plus_joins_only_when_a_text_is_certain) {
  EXPECT_EQ(Pg("SELECT 'Factura n.' + CHAR(186) + ' 12'"), "SELECT 'Factura n.' || chr(186) || ' 12'");
  EXPECT_EQ(Pg("SELECT codigo + ' - ' + descrit"), "SELECT codigo || ' - ' || descrit");
  EXPECT_EQ(Pg("SELECT c.codigo + s.codigo"), "SELECT c.codigo + s.codigo");  // the schema's operator
  EXPECT_EQ(Pg("SELECT CONVERT(varchar(9), n) + x"), "SELECT CAST(n AS varchar(9)) || x");
  EXPECT_EQ(Pg("SELECT ('a' + b) + c, (1 + b) + c"), "SELECT('a' || b) || c, (1 + b) + c");
  EXPECT_EQ(Pg("SET contador = contador + 1"), "SET contador = contador + 1");
  EXPECT_EQ(Pg("SELECT '5' + 1, a - b + 2"), "SELECT '5' + 1, a - b + 2");  // numbers still add
  EXPECT_EQ(Pg("WHERE codigo like '%' + 'a' + CHAR(39) + '%'"),
            "WHERE codigo like '%' || 'a' || chr(39) || '%' ESCAPE ''");
}

TEST(PostgresTranslation, whole_numbers_compared_become_literals_of_either_type) {
  EXPECT_EQ(Pg("SELECT * FROM tbPOC_Contas WHERE codigo = 211"), "SELECT * FROM tbPOC_Contas WHERE codigo = '211'");
  EXPECT_EQ(Pg("WHERE 211 <> codigo AND x IN (1, -2, '3')"), "WHERE '211' <> codigo AND x IN('1', '-2', '3')");
  EXPECT_EQ(Pg("WHERE a = -1 AND b >= 2)"), "WHERE a = '-1' AND b >= '2')");
  EXPECT_EQ(Pg("WHERE a = 1 + b AND c - 1 = d AND e = 1.5"), "WHERE a = 1 + b AND c - 1 = d AND e = 1.5");
  EXPECT_EQ(Pg("WHERE x - 1 = 2"), "WHERE x - 1 = '2'");
  EXPECT_EQ(Pg("WHERE x IN (1, y) AND z IN (SELECT 1 FROM t)"), "WHERE x IN(1, y) AND z IN(SELECT 1 FROM t)");
  EXPECT_EQ(Pg("SELECT TOP 1 * FROM t ORDER BY 1"), "SELECT * FROM t ORDER BY 1 LIMIT 1");
}

TEST(PostgresTranslation, names_fold_and_table_hints_go) {
  EXPECT_EQ(Pg("SELECT [Dorvanto_ID], \"Obs\", [a]]b], \"q\"\"Q\" FROM [tbPOC_Dorvantos]"),
            "SELECT \"dorvanto_id\", \"obs\", \"a]b\", \"q\"\"q\" FROM \"tbpoc_dorvantos\"");
  EXPECT_EQ(Pg("SELECT * FROM tbPOC_Contadores WITH (UPDLOCK, HOLDLOCK) WHERE nome = 'reg_no'"),
            "SELECT * FROM tbPOC_Contadores WHERE nome = 'reg_no' FOR UPDATE");
  EXPECT_EQ(Pg("SELECT TOP 1 * FROM t WITH (UPDLOCK) WHERE a = 'x'"), "SELECT * FROM t WHERE a = 'x' LIMIT 1 FOR UPDATE");
  EXPECT_EQ(Pg("SELECT * FROM t WITH (NOLOCK)"), "SELECT * FROM t");
  EXPECT_EQ(Pg("UPDATE t WITH (UPDLOCK) SET a = 'x'"), "UPDATE t SET a = 'x'");
}

TEST(PostgresTranslation, literals_comments_and_one_statement) {
  EXPECT_EQ(Pg("SELECT 'TOP 1 + @@IDENTITY; [X] = 5' AS x -- ; DROP TABLE t\n"),
            "SELECT 'TOP 1 + @@IDENTITY; [X] = 5' AS x");
  EXPECT_EQ(Pg("SELECT 'it''s'"), "SELECT 'it''s'");
  EXPECT_EQ(Pg("WHERE a LIKE 'x!%' ESCAPE '!'"), "WHERE a LIKE 'x!%' ESCAPE '!'");
  EXPECT_EQ(Pg("SELECT 1;"), "SELECT 1");
  EXPECT_THROW(Pg("SELECT 1; DELETE FROM t"), TranslateError);
  EXPECT_THROW(Pg("SELECT 'open"), TranslateError);
}

// --- Live: a database of its own on the test server. ---

struct PgResultFree {
  void operator()(PGresult* r) const { PQclear(r); }
};
using Result = std::unique_ptr<PGresult, PgResultFree>;
struct PgConnFinish {
  void operator()(PGconn* c) const { PQfinish(c); }
};
using Conn = std::unique_ptr<PGconn, PgConnFinish>;

std::map<std::string, std::string> ReadEnvFile(const std::string& path) {
  std::map<std::string, std::string> values;
  std::ifstream in(path);
  for (std::string line; std::getline(in, line);) {
    size_t eq = line.find('=');
    if (eq == std::string::npos) continue;
    std::string value = line.substr(eq + 1);
    if (value.size() >= 2 && value.front() == '\'' && value.back() == '\'') value = value.substr(1, value.size() - 2);
    values[line.substr(0, eq)] = value;
  }
  return values;
}

class PostgresLive : public ::testing::Test {
 protected:
  static void SetUpTestSuite() {
    const char* envFile = std::getenv("POC_TEST_PG_ENV");
    if (envFile == nullptr) return;
    settings_ = ReadEnvFile(envFile);
    database_ = "dv_dialect_" + std::to_string(getpid());
    Conn admin = Connect("postgres");
    if (!admin) return;
    Admin(admin.get(), "DROP DATABASE IF EXISTS " + database_);
    Admin(admin.get(), "CREATE DATABASE " + database_ +
                           " TEMPLATE template0 ENCODING 'UTF8' LOCALE_PROVIDER icu ICU_LOCALE 'pt' "
                           "LOCALE 'C.UTF-8'");
    conn_ = Connect(database_).release();
    if (conn_ == nullptr) return;
    // The schema statement by statement, as split by the component's own tokenizer.
    for (const std::string& statement : SplitStatements(PostgresSchema())) Admin(conn_, statement);
    for (std::string_view script : EmbeddedDemoData())
      for (const std::string& statement : SplitStatements(script)) Admin(conn_, Pg(statement));
  }

  static void TearDownTestSuite() {
    if (conn_ != nullptr) PQfinish(conn_);
    conn_ = nullptr;
    if (database_.empty()) return;
    if (Conn admin = Connect("postgres"))
      Admin(admin.get(), "DROP DATABASE IF EXISTS " + database_ + " WITH (FORCE)");
  }

  void SetUp() override {
    if (std::getenv("POC_TEST_PG_ENV") == nullptr)
      GTEST_SKIP() << "POC_TEST_PG_ENV is not set: no PostgreSQL server to test on";
    ASSERT_TRUE(conn_ != nullptr) << "no connection to the test server";
    ASSERT_TRUE(setupError_.empty()) << setupError_;
  }

  static Conn Connect(const std::string& database) {
    const char* keys[] = {"host", "port", "user", "password", "dbname", "client_encoding", "options", nullptr};
    const char* values[] = {settings_["POC_TEST_PG_HOST"].c_str(), settings_["POC_TEST_PG_PORT"].c_str(),
                            settings_["POC_TEST_PG_USER"].c_str(), settings_["POC_TEST_PG_PASSWORD"].c_str(),
                            database.c_str(), "UTF8", "-c client_min_messages=warning", nullptr};
    Conn c(PQconnectdbParams(keys, values, 0));
    if (PQstatus(c.get()) != CONNECTION_OK) {
      setupError_ = std::string("cannot connect: ") + PQerrorMessage(c.get());
      return nullptr;
    }
    return c;
  }

  static void Admin(PGconn* c, const std::string& sql) {
    Result r(PQexec(c, sql.c_str()));
    auto status = PQresultStatus(r.get());
    if (status != PGRES_COMMAND_OK && status != PGRES_TUPLES_OK && setupError_.empty())
      setupError_ = sql + "\n" + PQresultErrorMessage(r.get());
  }

  // A component statement, translated and run; the rows as texts (nullopt for NULL).
  static std::vector<std::vector<std::optional<std::string>>> Rows(const std::string& tsql, PGconn* c = nullptr,
                                                                  int tranCount = 0) {
    std::string sql = Pg(tsql, tranCount);
    Result r(PQexec(c != nullptr ? c : conn_, sql.c_str()));
    auto status = PQresultStatus(r.get());
    EXPECT_TRUE(status == PGRES_COMMAND_OK || status == PGRES_TUPLES_OK)
        << sql << "\n" << PQresultErrorMessage(r.get());
    std::vector<std::vector<std::optional<std::string>>> rows;
    for (int i = 0; i < PQntuples(r.get()); ++i) {
      rows.emplace_back();
      for (int j = 0; j < PQnfields(r.get()); ++j)
        rows.back().push_back(PQgetisnull(r.get(), i, j) ? std::nullopt
                                                          : std::optional<std::string>(PQgetvalue(r.get(), i, j)));
    }
    return rows;
  }

  static std::optional<std::string> Scalar(const std::string& tsql, PGconn* c = nullptr) {
    auto rows = Rows(tsql, c);
    return rows.empty() || rows[0].empty() ? std::nullopt : rows[0][0];
  }

  static void Run(const std::string& tsql, int tranCount = 0) { Rows(tsql, nullptr, tranCount); }

  static inline std::map<std::string, std::string> settings_;
  static inline std::string database_;
  static inline std::string setupError_;
  static inline PGconn* conn_ = nullptr;
};

TEST_F(PostgresLive, demo_data_loads_and_reads_back) {
  EXPECT_EQ(Scalar("SELECT COUNT(*) as no FROM tbPOC_Diario_Tipos"), "7");
  // Sub-account codes built with "+" from two text columns and from a column and a literal.
  EXPECT_EQ(Scalar("SELECT descrit FROM vwPOC_SubContas WHERE codigo_completo = '11001'"), "Caixa - Sede (Lisboa)");
  EXPECT_EQ(Scalar("SELECT conta_descrit FROM vwPOC_SubContas WHERE codigo_completo = '2432002'"), "IVA - Dedutível");
  EXPECT_EQ(Scalar("SELECT MAX(data) as max_data FROM tbFechos WHERE (anulado is null OR anulado = 0)"),
            "2009-12-31 00:00:00");
  auto vat = Rows("SELECT * FROM vwTaxas_Iva ORDER BY tx");
  ASSERT_EQ(vat.size(), 10u);
  EXPECT_EQ(vat.back()[4], "23,00 % - Taxa normal (Continente)");
}

TEST_F(PostgresLive, texts_ignore_case_keep_accents_and_sort_in_portuguese) {
  EXPECT_EQ(Scalar("SELECT descrit FROM tbPOC_Diario_Tipos WHERE descrit = 'OPERAÇÕES DIVERSAS'"), "Operações diversas");
  EXPECT_EQ(Scalar("SELECT descrit FROM tbPOC_Diario_Tipos WHERE descrit LIKE '%çõ%'"), "Operações diversas");
  EXPECT_EQ(Scalar("SELECT COUNT(*) FROM tbPOC_Diario_Tipos WHERE descrit = 'Operacoes diversas'"), "0");
  EXPECT_EQ(Scalar("SELECT COUNT(*) FROM tbPOC_Diario_Tipos WHERE descrit LIKE 'SALARIOS'"), "0");
  EXPECT_EQ(Scalar("SELECT descrit FROM tbPOC_Dorvantos_Codigos WHERE codigo like '%fc%'"), "Factura de cliente");

  Run("INSERT INTO tbPOC_Dorvantos_Codigos (codigo, descrit) VALUES ('ZZ1', 'Zeta'), ('ZZ2', 'álamo'), "
      "('ZZ3', 'Bravo'), ('ZZ4', 'Alamo'), ('ZZ5', 'a\\b')");
  auto sorted = Rows("SELECT descrit FROM tbPOC_Dorvantos_Codigos WHERE codigo LIKE 'zz%' ORDER BY descrit");
  ASSERT_EQ(sorted.size(), 5u);
  EXPECT_EQ(sorted[0][0], "a\\b");
  EXPECT_EQ(sorted[1][0], "Alamo");
  EXPECT_EQ(sorted[2][0], "álamo");  // after its plain letter, before "b"
  EXPECT_EQ(sorted[3][0], "Bravo");
  EXPECT_EQ(Scalar("SELECT codigo FROM tbPOC_Dorvantos_Codigos WHERE descrit LIKE '%a\\b%'"), "ZZ5");
  Run("DELETE FROM tbPOC_Dorvantos_Codigos WHERE codigo LIKE 'ZZ%'");
}

TEST_F(PostgresLive, unquoted_numbers_meet_text_and_number_columns) {
  auto account = Rows("SELECT * FROM tbPOC_Contas WHERE codigo = 2432");
  ASSERT_EQ(account.size(), 1u);
  EXPECT_EQ(account[0][2], "IVA - Dedutível");
  EXPECT_EQ(Scalar("SELECT codigo FROM tbPOC_Contas WHERE conta_id = " + *account[0][0]), "2432");
  EXPECT_EQ(Scalar("SELECT COUNT(*) FROM tbPOC_Contas WHERE codigo IN (11, 12, 99999)"), "2");
  EXPECT_TRUE(Rows("SELECT * FROM tbPOC_Contas WHERE codigo = 99999").empty());
  EXPECT_EQ(Rows("SELECT TOP 3 * FROM tbPOC_Contas ORDER BY codigo").size(), 3u);
  EXPECT_EQ(Scalar("SELECT TOP 1 codigo FROM tbPOC_Contas WHERE atribuicao = 1 ORDER BY codigo"), "11");
}

TEST_F(PostgresLive, identity_is_null_before_an_insert_then_the_new_key) {
  Conn fresh = Connect(database_);
  ASSERT_TRUE(fresh) << setupError_;
  EXPECT_FALSE(Scalar("SELECT @@IDENTITY as last", fresh.get()).has_value());
  Rows("INSERT INTO tbPOC_Dorvantos (data, dorvanto_no, tipo_diario_id, created_by, obs, valor, finalizado) "
       "VALUES (GETDATE(), null, null, 'contabilista', null, 0, 0)",
       fresh.get());
  auto key = Scalar("SELECT @@Identity as last", fresh.get());
  ASSERT_TRUE(key);
  EXPECT_EQ(Scalar("SELECT created_by FROM tbPOC_Dorvantos WHERE dorvanto_id = " + *key), "contabilista");
  // Another session's insert does not move this one's.
  Run("INSERT INTO tbPOC_Dorvantos (created_by, valor, finalizado) VALUES ('x', 0, 0)");
  EXPECT_EQ(Scalar("SELECT @@Identity as last", fresh.get()), key);
}

TEST_F(PostgresLive, an_entry_with_dates_lines_and_finalization) {
  Run("INSERT INTO tbPOC_Dorvantos (data, dorvanto_no, tipo_diario_id, created_by, obs, valor, finalizado) "
      "VALUES (GETDATE(), null, null, 'contabilista', null, 0, 0)");
  std::string key = *Scalar("SELECT @@Identity as last");
  EXPECT_EQ(Scalar("SELECT COUNT(*) FROM tbPOC_Dorvantos WHERE year(data) = year(GETDATE()) AND dorvanto_id = " + key),
            "1");
  Run("UPDATE tbPOC_Dorvantos SET data = CONVERT(DATETIME,'2010-03-05 0:00:00',102), referencia = 'R-1', "
      "tipo_diario_id = 1, obs = null, dorvanto_no = 'D-1' WHERE Dorvanto_ID = " + key);
  std::string sub = *Scalar("SELECT sub_conta_id FROM vwPOC_SubContas WHERE codigo_completo = '11001'");
  Run("INSERT INTO tbPOC_Dorvantos_Details (dorvanto_id, conta_id, sub_conta_id, codigo, descrit, ref, debito, "
      "credito, iva, iva_tx_id, iva_base_tributavel, iva_apuramento) VALUES (" + key + ", 2, " + sub +
      ", 'FCL', 'Factura n.' + CHAR(186) + ' 12', 'FT 12', 100.10, 0, 0, Null, Null, Null)");
  std::string line = *Scalar("SELECT @@Identity as last");
  EXPECT_EQ(Scalar("SELECT descrit FROM tbPOC_Dorvantos_Details WHERE diario_id = " + line), "Factura n.º 12");
  EXPECT_EQ(Scalar("SELECT sum(debito) as debitos, sum(credito) as creditos FROM tbPOC_Dorvantos_Details "
                   "WHERE dorvanto_id = " + key),
            "100.1000");

  EXPECT_EQ(Scalar("SELECT COUNT(*) as no FROM tbPOC_Dorvantos WHERE year(data) = 2010 AND dorvanto_no = 'd-1' "
                   "AND Dorvanto_ID <> 0"),
            "1");
  Run("UPDATE tbPOC_Dorvantos SET finalizado = 1, valor = 100.1 WHERE dorvanto_id = " + key);
  const std::string total = "SELECT SUM(valor) as total FROM tbPOC_Dorvantos WHERE tipo_diario_id = 1 AND data >= "
                            "CONVERT(DATETIME, '2010-03-05 0:00:00',102) AND data <= CONVERT(DATETIME, "
                            "'2010-03-05 23:59:59',102)";
  EXPECT_EQ(Scalar(total), "100.1000");

  // Finalization's counter, locked for the transaction.
  Run("BEGIN");
  EXPECT_EQ(Scalar("SELECT @@TRANCOUNT as flTrans"), "0");
  EXPECT_EQ(Rows("SELECT @@TRANCOUNT as flTrans", nullptr, 1)[0][0], "1");
  EXPECT_TRUE(Rows("SELECT * FROM tbPOC_Contadores WITH (UPDLOCK, HOLDLOCK) WHERE nome = 'reg_no'").empty());
  Run("INSERT INTO tbPOC_Contadores (nome, contador) VALUES ('reg_no',2)");
  Run("UPDATE tbPOC_Contadores SET contador = contador + 1 WHERE nome = 'reg_no'");
  Run("UPDATE tbPOC_Dorvantos_Details SET reg_no = 1, ano = 2010 WHERE diario_id = " + line);
  Run("COMMIT");
  EXPECT_EQ(Scalar("SELECT contador FROM tbPOC_Contadores WITH (UPDLOCK, HOLDLOCK) WHERE nome = 'REG_NO'"), "3");
  auto listed = Rows("SELECT * FROM vwPOC_Dorvantos_Details WHERE dorvanto_id = " + key);
  ASSERT_EQ(listed.size(), 1u);
  EXPECT_EQ(listed[0][2], "1");
  EXPECT_EQ(listed[0][5], "11");
  EXPECT_EQ(listed[0][6], "Caixa");

  Run("DELETE FROM tbPOC_Dorvantos_Details WHERE Dorvanto_ID = " + key);
  Run("DELETE FROM tbPOC_Dorvantos WHERE Dorvanto_ID = " + key);
  EXPECT_TRUE(Rows("SELECT TOP 1 * FROM tbPOC_Dorvantos_Details WHERE dorvanto_id = " + key).empty());
}

TEST_F(PostgresLive, account_tree_joins_texts_with_plus) {
  Run("INSERT INTO tbPOC_Contas (codigo, descrit, atribuicao) VALUES ('999', null, 0)");
  auto rows = Rows(
      "SELECT CASE WHEN codigo is null AND descrit is null THEN null WHEN codigo is null AND descrit is "
      "not null THEN ' - ' + descrit WHEN codigo is not null AND descrit is null THEN codigo + ' - ' "
      "WHEN codigo is not null AND descrit is not null THEN codigo + ' - ' + descrit END as "
      "codigo_descrit, CASE WHEN conta_activo is null and conta_passivo is null THEN '' WHEN "
      "conta_activo is not null and conta_passivo is null THEN ' => ' + conta_activo + '' WHEN "
      "conta_activo is null and conta_passivo is not null THEN ' => ' + conta_passivo + '' WHEN "
      "conta_activo is not null and conta_passivo is not null THEN ' => ' + conta_activo + ', ' + "
      "conta_passivo + '' END as associacao, * FROM tbPOC_Contas ORDER BY codigo");
  ASSERT_GT(rows.size(), 3u);
  EXPECT_EQ(rows[0][0], "1 - Disponibilidades");
  EXPECT_EQ(rows[0][1], "");
  EXPECT_EQ(rows[1][3], "11");  // a parent before its children
  bool bank = false, bare = false;
  for (const auto& r : rows) {
    if (r[3] == "12") bank = r[1] == " => 12, 231";
    if (r[3] == "999") bare = r[0] == "999 - ";
  }
  EXPECT_TRUE(bank);
  EXPECT_TRUE(bare);
  Run("DELETE FROM tbPOC_Contas WHERE codigo = 999");
}

// The other statements the component and its host send, as they send them: each runs.
TEST_F(PostgresLive, the_remaining_component_statements_run) {
  const char* statements[] = {
      "SELECT GETDATE() AS DATE",
      "SELECT * FROM tbPOC_Diario_Tipos ORDER BY descrit",
      "SELECT * FROM tbContactos_ContasCorrentes_Tipos WHERE tipo_diario_id is not null ORDER BY descrit",
      "SELECT * FROM tbContactos_ContasCorrentes_Tipos WHERE tipo_id = 1",
      "SELECT * FROM tbPOC_Dorvantos_Codigos ORDER BY codigo",
      "SELECT * FROM tbPOC_Dorvantos_Codigos WHERE descrit_id = 1",
      "SELECT * FROM tbPOC_Dorvantos_Codigos WHERE codigo like '%a' + CHAR(39) + 'b%'",
      "SELECT * FROM vwTaxas_Iva ORDER BY tx",
      "SELECT * FROM vwPOC_SubContas WHERE sub_conta_id = 1",
      "SELECT sub_conta_id, codigo_completo, descrit, conta_descrit FROM vwPOC_SubContas WHERE conta_id = 2 "
      "AND sub_conta_id = 1 ORDER BY codigo_completo",
      "SELECT tbPOC_Dorvantos_Details.*, tbPOC_Dorvantos.data, tbPOC_Dorvantos.dorvanto_no FROM "
      "tbPOC_Dorvantos_Details LEFT JOIN tbPOC_Dorvantos ON tbPOC_Dorvantos_Details.dorvanto_id = "
      "tbPOC_Dorvantos.dorvanto_id WHERE tbPOC_Dorvantos_Details.diario_id = 1",
      "SELECT d.dorvanto_id, d.data, t.descrit AS tipo, d.dorvanto_no, d.referencia, d.finalizado, (SELECT "
      "SUM(x.debito) FROM tbPOC_Dorvantos_Details x WHERE x.dorvanto_id = d.dorvanto_id) AS total FROM "
      "tbPOC_Dorvantos d LEFT JOIN tbPOC_Diario_Tipos t ON t.tipo_diario_id = d.tipo_diario_id ORDER BY "
      "d.data, d.dorvanto_id",
      "UPDATE tbPOC_Dorvantos_Details SET conta_id = 2, sub_conta_id = 1, codigo = 'REC', descrit = "
      "'Recebimento', ref = null, debito = 0, credito = 10.5, iva = 1, iva_tx_id = 4, iva_base_tributavel = "
      "8.54, iva_apuramento = 0 WHERE diario_id = 0",
      "UPDATE tbPOC_Dorvantos_Details SET related_id = 7, tipo_id = null WHERE Dorvanto_ID = 0",
      "UPDATE tbPOC_Dorvantos SET tipo_diario_id = null, referencia = 'R', obs = null, dorvanto_no = null "
      "WHERE Dorvanto_ID = 0",
      "DELETE FROM tbPOC_Dorvantos_Details WHERE Diario_ID = 0",
  };
  for (const char* statement : statements) Rows(statement);
}

}  // namespace
}  // namespace ado::sql
