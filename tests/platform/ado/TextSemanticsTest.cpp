// Texts through the engine: literals built the component's way come back byte for
// byte and never run SQL of their own; compares, LIKE and ORDER BY follow a
// case-insensitive, accent-sensitive Portuguese collation; amounts sum exactly.

#include <string>
#include <vector>

#include "AdoFixture.h"
#include "platform/vb/Error.h"

namespace ado::testing {
namespace {

// The component's Trtf: every apostrophe becomes ' + CHAR(39) + '.
std::string Trtf(const std::string& text) {
  std::string out;
  for (char c : text) out += c == '\'' ? std::string("' + CHAR(39) + '") : std::string(1, c);
  return out;
}

class TextSemantics : public DemoDatabase {
 protected:
  std::string StoreAndRead(const std::string& text) {
    conn_->Execute("INSERT INTO tbPOC_Dorvantos_Codigos (codigo, descrit) VALUES ('T', '" + Trtf(text) + "')");
    std::string id = std::to_string(Scalar("SELECT @@IDENTITY AS last").AsLong());
    return Scalar("SELECT descrit FROM tbPOC_Dorvantos_Codigos WHERE descrit_id = " + id).AsString();
  }
};

TEST_F(TextSemantics, hostile_texts_round_trip_and_run_nothing) {
  const std::vector<std::string> texts = {
      "O'Brien",
      "'",
      "''",
      "D'Ávila & Filhos, 100% 'certo'; -- fim",
      "x'); DELETE FROM tbFechos; --",
      "a' + CHAR(39) + 'b",
      "/* não é comentário */ ; DROP TABLE tbFechos",
      "[colchetes] \"aspas\" _ % \\ ;;",
      "linha 1\nlinha 2\tç ÇÃÕ €",
  };
  for (const std::string& text : texts) EXPECT_EQ(StoreAndRead(text), text);
  EXPECT_EQ(Scalar("SELECT COUNT(*) AS n FROM tbFechos"), vb::Variant(int32_t{2}));
  EXPECT_EQ(Scalar("SELECT 'O' + CHAR(39) + 'Brien' AS nome"), vb::Variant("O'Brien"));
}

TEST_F(TextSemantics, a_second_statement_is_refused_not_run) {
  EXPECT_THROW(conn_->Execute("SELECT 1 AS x; DELETE FROM tbFechos"), vb::Error);
  EXPECT_THROW(conn_->Execute("UPDATE tbFechos SET anulado = 1; DELETE FROM tbFechos;"), vb::Error);
  EXPECT_EQ(Scalar("SELECT COUNT(*) AS n FROM tbFechos WHERE anulado = 0"), vb::Variant(int32_t{1}));
  EXPECT_EQ(Scalar("SELECT 1 AS x;"), vb::Variant(int32_t{1}));  // a closing ";" is fine
  EXPECT_THROW(conn_->Execute("SELECT 'unterminated"), vb::Error);
}

TEST_F(TextSemantics, case_is_ignored_and_accents_count) {
  conn_->Execute("INSERT INTO tbPOC_Dorvantos_Codigos (codigo, descrit) VALUES ('ç1', 'Ação')");
  conn_->Execute("INSERT INTO tbPOC_Dorvantos_Codigos (codigo, descrit) VALUES ('a1', 'maçã')");
  conn_->Execute("INSERT INTO tbPOC_Dorvantos_Codigos (codigo, descrit) VALUES ('á1', 'MAÇÃ')");
  auto count = [&](const std::string& where) {
    return Scalar("SELECT COUNT(*) AS n FROM tbPOC_Dorvantos_Codigos WHERE " + where).AsLong();
  };
  EXPECT_EQ(count("codigo = 'Ç1'"), 1);
  EXPECT_EQ(count("codigo = 'A1'"), 1);  // not 'á1'
  EXPECT_EQ(count("codigo = 'Á1'"), 1);
  EXPECT_EQ(count("descrit = 'maçã'"), 2);
  EXPECT_EQ(count("descrit = 'maca'"), 0);
  EXPECT_EQ(count("descrit = 'AÇÃO'"), 1);
  EXPECT_EQ(count("codigo like 'ç%'"), 1);
  EXPECT_EQ(count("codigo like 'Ç_'"), 1);
  EXPECT_EQ(count("codigo like 'a%'"), 6);  // a1 and the five demo codes ABT ... APR, not á1
  EXPECT_EQ(count("codigo like 'á%'"), 1);
  const std::string mine = " AND codigo IN ('ç1', 'a1', 'á1')";
  EXPECT_EQ(count("descrit like '%AÇ%'" + mine), 3);
  EXPECT_EQ(count("descrit like '%AC%'" + mine), 0);
  EXPECT_EQ(count("codigo like '[aá]1'"), 2);
  EXPECT_EQ(count("codigo like '[^a]1'"), 2);

  auto rs = Query("SELECT codigo FROM tbPOC_Dorvantos_Codigos WHERE codigo IN ('a1', 'á1', 'ç1', 'ABT', 'CMB') ORDER BY codigo");
  std::vector<std::string> order;
  for (; !rs->Eof(); rs->MoveNext()) order.push_back(rs->Fields(0).Value().AsString());
  std::vector<std::string> expected = {"a1", "á1", "ABT", "ç1", "CMB"};
  EXPECT_EQ(order, expected);
}

TEST_F(TextSemantics, amounts_sum_exactly_to_four_decimals) {
  std::string entry;
  conn_->Execute("INSERT INTO tbPOC_Dorvantos (created_by, valor, finalizado) VALUES ('x', 0, 0)");
  entry = std::to_string(Scalar("SELECT @@IDENTITY AS last").AsLong());
  for (int i = 0; i < 10; ++i)
    conn_->Execute("INSERT INTO tbPOC_Dorvantos_Details (dorvanto_id, debito, credito) VALUES (" + entry +
                   ", 0.1, 0.7)");
  conn_->Execute("INSERT INTO tbPOC_Dorvantos_Details (dorvanto_id, debito, credito) VALUES (" + entry + ", 0.2, 0)");
  auto sums = Query("SELECT sum(debito) as debitos, sum(credito) as creditos FROM tbPOC_Dorvantos_Details WHERE dorvanto_id = " + entry);
  EXPECT_EQ(sums->Fields("debitos").Value(), vb::Variant(1.2));
  EXPECT_EQ(sums->Fields("creditos").Value(), vb::Variant(7.0));
  EXPECT_EQ(Scalar("SELECT SUM(contador) AS s FROM (SELECT 2 AS contador UNION ALL SELECT 3) t"), vb::Variant(int32_t{5}));
}

TEST_F(TextSemantics, plus_adds_numbers_and_joins_texts) {
  EXPECT_EQ(Scalar("SELECT 1 + 2 AS x"), vb::Variant(int32_t{3}));
  EXPECT_EQ(Scalar("SELECT 2 * 3 + 1 AS x"), vb::Variant(int32_t{7}));
  EXPECT_EQ(Scalar("SELECT 1 + 2 * 3 AS x"), vb::Variant(int32_t{7}));
  EXPECT_EQ(Scalar("SELECT 10 - 2 + 1 AS x"), vb::Variant(int32_t{9}));
  EXPECT_EQ(Scalar("SELECT 'a' + 'b' + 'c' AS x"), vb::Variant("abc"));
  EXPECT_EQ(Scalar("SELECT '5' + 1 AS x"), vb::Variant(int32_t{6}));
  EXPECT_EQ(Scalar("SELECT codigo + descrit AS x FROM tbPOC_Contas WHERE codigo = '11'"), vb::Variant("11Caixa"));
  EXPECT_TRUE(Scalar("SELECT 'a' + null AS x").IsNull());
  EXPECT_EQ(Scalar("SELECT (1 + 1) * 2 AS x"), vb::Variant(int32_t{4}));
  EXPECT_THROW(conn_->Execute("SELECT 'abc' + 1 AS x"), vb::Error);
}

TEST_F(TextSemantics, dates_from_convert_and_their_parts) {
  EXPECT_EQ(Scalar("SELECT CONVERT(DATETIME,'2010-03-05 9:07:00',102) AS d"),
            vb::Variant(*vb::DateSerial(2010, 3, 5, 9, 7, 0)));
  EXPECT_EQ(Scalar("SELECT year(CONVERT(DATETIME, '2010-03-05 0:00:00',102)) AS y"), vb::Variant(int32_t{2010}));
  EXPECT_EQ(Scalar("SELECT CONVERT(DATETIME, descrit, 102) AS d FROM (SELECT '2011.02.28' AS descrit) t"),
            vb::Variant(*vb::DateSerial(2011, 2, 28)));
  EXPECT_THROW(conn_->Execute("SELECT CONVERT(DATETIME,'2010-02-30 0:00:00',102) AS d"), vb::Error);
  // Stored dates order as dates, also across one- and two-digit hours.
  conn_->Execute("INSERT INTO tbFechos (data, anulado) VALUES (CONVERT(DATETIME,'2009-12-31 9:00:00',102), 0)");
  conn_->Execute("INSERT INTO tbFechos (data, anulado) VALUES (CONVERT(DATETIME,'2009-12-31 10:00:00',102), 0)");
  EXPECT_EQ(Scalar("SELECT MAX(data) AS m FROM tbFechos WHERE anulado = 0"),
            vb::Variant(*vb::DateSerial(2009, 12, 31, 10, 0, 0)));
  EXPECT_EQ(Scalar("SELECT COUNT(*) AS n FROM tbFechos WHERE data <= CONVERT(DATETIME, '2009-12-31 23:59:59',102)"),
            vb::Variant(int32_t{3}));
  // A text that merely looks like a date stays a text in a text column.
  conn_->Execute("INSERT INTO tbPOC_Dorvantos_Codigos (codigo, descrit) VALUES ('D', '2009-12-31 00:00:00')");
  EXPECT_EQ(Scalar("SELECT descrit FROM tbPOC_Dorvantos_Codigos WHERE codigo = 'D'"), vb::Variant("2009-12-31 00:00:00"));
}

}  // namespace
}  // namespace ado::testing
