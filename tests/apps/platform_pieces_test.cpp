// The platform pieces the driver adds: classes served by the process itself, and a
// recordset handed to a component as a late-bound object.

#include <gtest/gtest.h>
#include <stdlib.h>

#include <filesystem>

#include "platform/ado/Connection.h"
#include "platform/ado/Database.h"
#include "platform/ado/RecordsetObject.h"
#include "platform/automation/ClassObjects.h"
#include "platform/automation/CreateObject.h"
#include "platform/registry/Store.h"
#include "platform/vb/Error.h"

namespace {

using vb::Variant;

class Echo : public vb::Object {
 public:
  explicit Echo(std::string word) : word_(std::move(word)) {}
  Variant Invoke(const std::string&, std::vector<Variant>&) override { return Variant(word_); }

 private:
  std::string word_;
};

int32_t ErrorNumber(const std::function<void()>& fn) {
  try {
    fn();
  } catch (const vb::Error& e) {
    return e.Number();
  }
  return 0;
}

class TempDir {
 public:
  TempDir() {
    char pattern[] = "/tmp/dv-apps-XXXXXX";
    path_ = mkdtemp(pattern);
  }
  ~TempDir() {
    std::error_code ignored;
    std::filesystem::remove_all(path_, ignored);
  }
  const std::string& Path() const { return path_; }

 private:
  std::string path_;
};

TEST(ClassObjects, AClassOfTheProcessComesBeforeTheRegistryUntilRevoked) {
  TempDir dir;
  registry::Store::SetDefaultPath(dir.Path() + "/registry.reg");
  EXPECT_EQ(ErrorNumber([] { automation::CreateObject("Teste.Eco"); }), vb::kErrCannotCreateObject);

  int made = 0;
  automation::RegisterClassObject("Teste.Eco", [&] {
    ++made;
    return std::make_shared<Echo>("um");
  });
  // Each creation is a new instance; the ProgID compares ignoring letter case.
  vb::ObjectPtr a = automation::CreateObject("Teste.Eco");
  vb::ObjectPtr b = automation::CreateObject("TESTE.eco");
  EXPECT_NE(a, b);
  EXPECT_EQ(made, 2);
  EXPECT_EQ(a->Call("Dizer"), Variant("um"));

  // A second registration takes the place of the first.
  automation::RegisterClassObject("Teste.Eco", [] { return std::make_shared<Echo>("dois"); });
  EXPECT_EQ(automation::CreateObject("Teste.Eco")->Call("Dizer"), Variant("dois"));

  // The registry alone does not know it.
  EXPECT_EQ(ErrorNumber([] { automation::CreateRegisteredObject("Teste.Eco"); }),
            vb::kErrCannotCreateObject);

  EXPECT_TRUE(automation::RevokeClassObject("teste.ECO"));
  EXPECT_FALSE(automation::RevokeClassObject("Teste.Eco"));
  EXPECT_EQ(ErrorNumber([] { automation::CreateObject("Teste.Eco"); }), vb::kErrCannotCreateObject);
  registry::Store::SetDefaultPath("");
}

TEST(ClassObjects, AFactoryThatFailsIsAClassThatCannotBeCreated) {
  automation::RegisterClassObject("Teste.Avaria", []() -> vb::ObjectPtr {
    throw std::runtime_error("sem memória para isto");
  });
  automation::RegisterClassObject("Teste.Vazio", [] { return vb::ObjectPtr(); });
  EXPECT_EQ(ErrorNumber([] { automation::CreateObject("Teste.Avaria"); }), vb::kErrCannotCreateObject);
  EXPECT_EQ(ErrorNumber([] { automation::CreateObject("Teste.Vazio"); }), vb::kErrCannotCreateObject);
  automation::RevokeClassObject("Teste.Avaria");
  automation::RevokeClassObject("Teste.Vazio");

  EXPECT_THROW(automation::RegisterClassObject("não é um nome", [] { return vb::ObjectPtr(); }),
               std::invalid_argument);
  EXPECT_THROW(automation::RegisterClassObject("Teste.Nada", {}), std::invalid_argument);
}

class RecordsetObjectTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::string db = dir_.Path() + "/poc.db";
    ado::CreateOptions options;
    options.demoData = false;
    options.passwordIterations = 1000;
    ado::CreateDatabase(db, {{"teste", "teste"}}, options);
    connection_->Open(ado::EmbeddedConnectionString(db, "teste", "teste"));
    connection_->Execute(
        "INSERT INTO tbPOC_Dorvantos (referencia, valor) VALUES ('primeiro', 1.5)");
    connection_->Execute("INSERT INTO tbPOC_Dorvantos (referencia, valor) VALUES ('segundo', 2)");
    connection_->Execute("INSERT INTO tbPOC_Dorvantos (referencia, valor) VALUES ('terceiro', 3)");
    records_ = connection_->Execute("SELECT * FROM tbPOC_Dorvantos ORDER BY dorvanto_id");
    wrapped_ = ado::RecordsetObject::Wrap(records_);
  }

  TempDir dir_;
  ado::ConnectionPtr connection_ = ado::Connection::Create();
  ado::RecordsetPtr records_;
  Variant wrapped_;
};

TEST_F(RecordsetObjectTest, AComponentMovesFindsAndReadsByMemberName) {
  const vb::ObjectPtr& rs = wrapped_.AsObject();
  EXPECT_EQ(rs->Get("RecordCount"), Variant(int32_t{3}));
  rs->Call("MoveLast");
  EXPECT_EQ(rs->Call("Fields", {Variant("REFERENCIA")}).AsObject()->Get("Value"), Variant("terceiro"));

  // A field follows the cursor, as an ADO field does.
  rs->Call("MoveFirst");
  vb::ObjectPtr field = rs->Call("Fields", {Variant("referencia")}).AsObject();
  EXPECT_EQ(field->Get("Name"), Variant("referencia"));
  EXPECT_EQ(field->Get("Value"), Variant("primeiro"));
  rs->Call("MoveNext");
  EXPECT_EQ(field->Get("Value"), Variant("segundo"));

  rs->Call("MoveFirst");
  rs->Call("Find", {Variant("referencia='terceiro'")});
  EXPECT_EQ(rs->Get("EOF"), Variant(false));
  EXPECT_EQ(rs->Get("AbsolutePosition"), Variant(int32_t{3}));
  rs->Call("Find", {Variant("referencia='primeiro'")});
  EXPECT_EQ(rs->Get("eof"), Variant(true));
  rs->Call("MoveFirst");
  EXPECT_EQ(rs->Get("BOF"), Variant(false));

  vb::ObjectPtr fields = rs->Get("Fields").AsObject();
  EXPECT_GT(fields->Get("Count").AsLong(), 3);
  EXPECT_EQ(fields->Call("Item", {Variant(int32_t{0})}).AsObject()->Get("Name"), Variant("dorvanto_id"));
}

TEST_F(RecordsetObjectTest, MistakesRaiseTheErrorsAHostWouldSee) {
  const vb::ObjectPtr& rs = wrapped_.AsObject();
  EXPECT_EQ(ErrorNumber([&] { rs->Call("Update"); }), vb::kErrMemberNotSupported);
  EXPECT_EQ(ErrorNumber([&] { rs->Call("MoveNext", {Variant(int32_t{1})}); }), 450);
  EXPECT_EQ(ErrorNumber([&] { rs->Call("Find"); }), 450);
  EXPECT_NE(ErrorNumber([&] { rs->Call("Fields", {Variant("nao_existe")}); }), 0);
  EXPECT_NE(ErrorNumber([&] { rs->Call("Fields", {Variant(int32_t{99})}); }), 0);
  // Past the last record a field has no value to give.
  rs->Call("MoveLast");
  rs->Call("MoveNext");
  vb::ObjectPtr field = rs->Call("Fields", {Variant("referencia")}).AsObject();
  EXPECT_NE(ErrorNumber([&] { field->Get("Value"); }), 0);
}

TEST_F(RecordsetObjectTest, TheRecordsetComesBackWholeFromItsVariant) {
  EXPECT_EQ(ado::RecordsetObject::From(wrapped_), records_);
  EXPECT_EQ(ado::RecordsetObject::From(Variant()), nullptr);
  EXPECT_EQ(ado::RecordsetObject::From(Variant::Missing()), nullptr);
  EXPECT_EQ(ado::RecordsetObject::From(vb::Nothing()), nullptr);
  EXPECT_EQ(ErrorNumber([] { ado::RecordsetObject::From(Variant("tbPOC_Dorvantos")); }),
            vb::kErrTypeMismatch);
  EXPECT_EQ(ErrorNumber([] { ado::RecordsetObject::From(Variant(vb::ObjectPtr(std::make_shared<Echo>("x")))); }),
            vb::kErrTypeMismatch);
  EXPECT_EQ(ErrorNumber([] { ado::RecordsetObject::Wrap(nullptr); }), vb::kErrObjectNotSet);
}

}  // namespace
