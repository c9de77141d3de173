// Building database files: the demo chart hangs together, creation is all or nothing,
// logins keep no password, and random hostile texts survive the literal rules.

#include <filesystem>
#include <random>
#include <set>
#include <string>

#include "AdoFixture.h"
#include "platform/vb/Error.h"

namespace ado::testing {
namespace {

using DemoContents = DemoDatabase;

TEST_F(DemoContents, chart_tree_is_complete_and_every_posting_account_has_sub_accounts) {
  auto rs = Query("SELECT * FROM tbPOC_Contas ORDER BY codigo");
  std::set<std::string> codes;
  std::set<int> classes;
  for (; !rs->Eof(); rs->MoveNext()) {
    std::string code = rs->Fields("codigo").Value().AsString();
    EXPECT_TRUE(codes.insert(code).second) << "duplicate " << code;
    if (code.size() > 1) {
      EXPECT_TRUE(codes.count(code.substr(0, code.size() - 1))) << "no parent for " << code;
    }
    EXPECT_LE(code.size(), 4u);
    classes.insert(code[0] - '0');
  }
  EXPECT_EQ(classes, (std::set<int>{1, 2, 3, 4, 5, 6, 7, 8}));
  EXPECT_GT(codes.size(), 150u);

  EXPECT_EQ(Scalar("SELECT COUNT(*) AS n FROM tbPOC_Contas c WHERE atribuicao = 1 AND NOT EXISTS "
                   "(SELECT 1 FROM vwPOC_SubContas s WHERE s.conta_id = c.conta_id)"),
            vb::Variant(int32_t{0}));
  EXPECT_EQ(Scalar("SELECT COUNT(*) AS n FROM vwPOC_SubContas s JOIN tbPOC_Contas c ON c.conta_id = s.conta_id "
                   "WHERE s.codigo_completo <> c.codigo + s.codigo"),
            vb::Variant(int32_t{0}));
  EXPECT_EQ(Scalar("SELECT COUNT(*) AS n FROM vwTaxas_Iva"), vb::Variant(int32_t{10}));
  EXPECT_GE(Scalar("SELECT COUNT(*) AS n FROM tbPOC_Dorvantos_Codigos").AsLong(), 30);
}

TEST_F(DemoContents, creation_refuses_an_existing_file_and_leaves_no_debris) {
  EXPECT_THROW(CreateDatabase(path_, {}), std::runtime_error);
  EXPECT_EQ(Scalar("SELECT COUNT(*) AS n FROM tbFechos"), vb::Variant(int32_t{2}));  // untouched

  std::string other = (dir_ / "fresh.db").string();
  // A login name given twice fails the whole creation: no file is left behind.
  EXPECT_THROW(CreateDatabase(other, {{"ana", "1"}, {"ANA", "2"}}, {.passwordIterations = 10}), std::runtime_error);
  for (const auto& entry : std::filesystem::directory_iterator(dir_))
    EXPECT_TRUE(entry.path().filename().string().starts_with("poc.db")) << entry.path();

  CreateDatabase(other, {{"ana", "1"}}, {.demoData = false, .passwordIterations = 10});
  auto conn = Connection::Create();
  conn->Open(EmbeddedConnectionString(other, "ana", "1"));
  EXPECT_TRUE(conn->Execute("SELECT * FROM tbPOC_Contas")->Eof());
}

TEST_F(DemoContents, logins_store_salted_hashes_only) {
  AddLoginToDatabase(path_, "revisor", "outra senha", 50);
  EXPECT_THROW(AddLoginToDatabase(path_, "Revisor", "x", 50), std::runtime_error);
  EXPECT_THROW(AddLoginToDatabase((dir_ / "none.db").string(), "x", "y", 50), std::runtime_error);

  auto rs = Query("SELECT * FROM dv_logins ORDER BY login_name");
  ASSERT_EQ(rs->RecordCount(), 2);
  std::set<std::string> salts;
  for (; !rs->Eof(); rs->MoveNext()) {
    for (int i = 0; i < rs->Fields().Count(); ++i) {
      const vb::Variant& v = rs->Fields(i).Value();
      if (v.IsString()) {
        EXPECT_EQ(v.AsString().find("outra senha"), std::string::npos);
        EXPECT_EQ(v.AsString().find(kPassword), std::string::npos);
      }
    }
    salts.insert(rs->Fields("salt").Value().AsString());
  }
  EXPECT_EQ(salts.size(), 2u);
  rs->MoveFirst();
  EXPECT_EQ(rs->Fields("iterations").Value(), vb::Variant(int32_t{1000}));

  auto conn = Connection::Create();
  conn->Open(EmbeddedConnectionString(path_, "revisor", "outra senha"));
  EXPECT_EQ(conn->State(), adStateOpen);
}

TEST_F(DemoContents, random_hostile_texts_survive_the_literal_rules) {
  // Texts made of the characters that break naive SQL building; each is stored through
  // the component's literal form and must read back unchanged, with nothing else run.
  const std::string alphabet[] = {"'", ";", "-", "/", "*", "%", "_", "[", "]", "\"", "+", "(", ")",
                                  "a", "Z", "ç", "Á", " ", "\n", "\\", "@@", "N'"};
  std::mt19937 random(20100305);
  std::uniform_int_distribution<size_t> pick(0, std::size(alphabet) - 1), length(0, 24);
  conn_->Execute("INSERT INTO tbPOC_Dorvantos_Codigos (codigo, descrit) VALUES ('R', null)");
  std::string id = std::to_string(Scalar("SELECT @@IDENTITY AS last").AsLong());
  for (int round = 0; round < 300; ++round) {
    std::string text;
    for (size_t n = length(random); n > 0; --n) text += alphabet[pick(random)];
    std::string literal = "'";
    for (char c : text) literal += c == '\'' ? std::string("' + CHAR(39) + '") : std::string(1, c);
    literal += "'";
    conn_->Execute("UPDATE tbPOC_Dorvantos_Codigos SET descrit = " + literal + " WHERE descrit_id = " + id);
    ASSERT_EQ(Scalar("SELECT descrit FROM tbPOC_Dorvantos_Codigos WHERE descrit_id = " + id), vb::Variant(text))
        << literal;
  }
  EXPECT_EQ(Scalar("SELECT COUNT(*) AS n FROM tbPOC_Dorvantos_Codigos WHERE codigo = 'R'"), vb::Variant(int32_t{1}));
}

}  // namespace
}  // namespace ado::testing
