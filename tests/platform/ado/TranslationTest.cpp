// The dialect translation and the connection string rules, on their own.

#include <gtest/gtest.h>

#include "platform/ado/ConnectionString.h"
#include "platform/ado/SqlTokenizer.h"
#include "platform/ado/SqlTranslator.h"

namespace ado::sql {
namespace {

std::string Sqlite(std::string_view tsql) { return TranslateToSqlite(tsql).sql; }

TEST(Translation, rewrites_what_the_engine_lacks) {
  EXPECT_EQ(Sqlite("SELECT TOP 1 * FROM t WHERE a = 1 ORDER BY b"), "SELECT * FROM t WHERE a = 1 ORDER BY b LIMIT 1");
  EXPECT_EQ(Sqlite("SELECT x FROM t WHERE y IN (SELECT TOP 2 y FROM u)"),
            "SELECT x FROM t WHERE y IN(SELECT y FROM u LIMIT 2)");
  EXPECT_EQ(Sqlite("SELECT * FROM tbPOC_Contadores WITH (UPDLOCK, HOLDLOCK) WHERE nome = 'reg_no'"),
            "SELECT * FROM tbPOC_Contadores WHERE nome = 'reg_no'");
  EXPECT_EQ(Sqlite("SELECT @@Identity as last"), "SELECT dv_identity() as last");
  EXPECT_EQ(Sqlite("WHERE d >= CONVERT(DATETIME, '2010-3-5 0:00:00',102)"), "WHERE d >= '2010-03-05 00:00:00'");
  EXPECT_EQ(Sqlite("SELECT ISNULL(a, N'x')"), "SELECT IFNULL(a, 'x')");
  EXPECT_EQ(Sqlite("SELECT a + b * c - d + e"), "SELECT dv_plus((dv_plus(a, b * c) - d), e)");
  EXPECT_EQ(Sqlite("SELECT f(a + 1, 'x' + CHAR(39))"), "SELECT f(dv_plus(a, 1), dv_plus('x', CHAR(39)))");
  EXPECT_EQ(Sqlite("SELECT t.* FROM t WHERE t.a = -1"), "SELECT t.* FROM t WHERE t.a = - 1");
}

TEST(Translation, literals_and_comments_are_never_rewritten) {
  EXPECT_EQ(Sqlite("SELECT 'TOP 1 + @@IDENTITY; --' AS x"), "SELECT 'TOP 1 + @@IDENTITY; --' AS x");
  EXPECT_EQ(Sqlite("SELECT 1 -- ; DELETE FROM t\n"), "SELECT 1");
  EXPECT_EQ(Sqlite("SELECT /* ; /* nested */ ; */ 1"), "SELECT 1");
  EXPECT_THROW(Sqlite("SELECT 1; SELECT 2"), TranslateError);
  EXPECT_THROW(Sqlite("SELECT 'a''"), TranslateError);
  EXPECT_THROW(Sqlite("SELECT 1 /* open"), TranslateError);
  EXPECT_THROW(Sqlite("SELECT @x"), TranslateError);
}

TEST(Translation, trancount_alone_is_answered_without_the_engine) {
  EXPECT_EQ(TranslateToSqlite("SELECT @@TRANCOUNT as flTrans").tranCountColumn, "flTrans");
  EXPECT_EQ(TranslateToSqlite("select @@trancount valor;").tranCountColumn, "valor");
  EXPECT_FALSE(TranslateToSqlite("SELECT @@TRANCOUNT + 1 as v").tranCountColumn);
  EXPECT_FALSE(TranslateToSqlite("SELECT @@TRANCOUNT as a, 1 as b").tranCountColumn);
}

TEST(Translation, scripts_split_at_semicolons_outside_literals) {
  auto parts = SplitStatements("INSERT INTO t VALUES ('a;b'); -- c;\nSELECT 1;;");
  ASSERT_EQ(parts.size(), 2u);
  EXPECT_EQ(parts[0], "INSERT INTO t VALUES ('a;b')");
  EXPECT_EQ(parts[1], "SELECT 1");
}

TEST(ConnectionStrings, quoted_values_cannot_add_keys) {
  auto cs = ConnectionStringParts::Parse(
      "Provider=SQLOLEDB.1; user id = ana ;Password=\"a;Data Source=evil\";Data Source='c:\\x''s.db'");
  EXPECT_EQ(cs.Get("User ID"), "ana");
  EXPECT_EQ(cs.Get("password"), "a;Data Source=evil");
  EXPECT_EQ(cs.Get("Data Source"), "c:\\x's.db");
  EXPECT_FALSE(cs.Get("Initial Catalog"));

  // Unquoted, a ";" does end the value: which is why values are built quoted.
  EXPECT_EQ(ConnectionStringParts::Parse("Password=a;Data Source=evil").Get("Data Source"), "evil");

  const std::string hostile[] = {"a;Data Source=evil", "say \"hi\"", "it's", "both ' and \"", " pad ", "plain"};
  for (const std::string& value : hostile) {
    std::string built = BuildConnectionString({{"Password", value}, {"Data Source", "sqlite:/d.db"}});
    auto back = ConnectionStringParts::Parse(built);
    EXPECT_EQ(back.Get("Password"), value) << built;
    EXPECT_EQ(back.Get("Data Source"), "sqlite:/d.db") << built;
  }
  EXPECT_EQ(ConnectionStringElement("User ID", "ana"), "User ID=ana");
}

}  // namespace
}  // namespace ado::sql
