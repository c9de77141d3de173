// A ledger made on a database server by "dorvantos setup-server", then a host that
// creates the component by ProgID and logs in as the person it was made for.

#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdlib>

#include "DorvantosCommand.h"
#include "platform/automation/CreateObject.h"
#include "platform/automation/TestSandbox.h"
#include "platform/registry/Store.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Variant.h"
#include "support/TestLedger.h"

namespace {

using dvtest::Command;
using dvtest::Outcome;
using vb::Variant;

class SetupServerTest : public ::testing::Test {
 protected:
  void SetUp() override {
    server_ = dvtest::PostgresUnderTest();
    if (!server_) GTEST_SKIP() << "needs the PostgreSQL server under test";
    catalog_ = "dvt_setup_" + std::to_string(::getpid());
    ::setenv("POC_ADMIN_PASSWORD", server_->password.c_str(), 1);
  }

  void TearDown() override {
    ::unsetenv("POC_ADMIN_PASSWORD");
    if (!server_) return;
    try {
      ado::DropServerDatabase({server_->DataSource(), server_->user, server_->password, catalog_, {}, false, false});
    } catch (const std::exception&) {
    }
  }

  std::string Setup(const std::string& extra) {
    return "--registry '" + registry::Store::DefaultPath() + "' setup-server --server '" + server_->DataSource() +
           "' --admin-user '" + server_->user + "' --catalog " + catalog_ + extra;
  }

  std::string Encoded(const std::string& password) {
    Outcome encoded = Command("encode-password '" + password + "'");
    return encoded.output.substr(0, encoded.output.find('\n'));
  }

  dvtest::Sandbox sandbox_;
  std::optional<dvtest::PgServer> server_;
  std::string catalog_;
};

TEST_F(SetupServerTest, TheLedgerIsMadeOnTheServerAndItsUserLogsInThroughTheComponent) {
  Outcome setup = Command(Setup(" --user Maria --password 'se;gredo'"));
  ASSERT_EQ(setup.status, 0) << setup.output;
  EXPECT_EQ(setup.output.find(server_->password), std::string::npos) << "the administrator's password was shown";

  auto hive = registry::Store::Default().Snapshot();
  const registry::Key* key = hive->Find("HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\POC");
  ASSERT_NE(key, nullptr);
  EXPECT_EQ(key->Find("dtDataSource")->data, server_->DataSource());
  EXPECT_EQ(key->Find("dtInitialCatalog")->data, catalog_);
  EXPECT_EQ(key->Find("dtUser")->data, "poc_dorvantos");
  EXPECT_EQ(key->Find("dtPassword")->data.rfind("dv1:", 0), 0u);

  // A second run leaves the ledger alone unless told to replace it.
  Outcome again = Command(Setup(" --user Maria --password x"));
  EXPECT_EQ(again.status, 1);
  EXPECT_NE(again.output.find("already exists"), std::string::npos) << again.output;

  vb::ObjectPtr general = automation::CreateObject("POC_Dorvantos.General");
  Variant refused = general->Call("Login", {Variant("maria"), Variant(Encoded("errada"))});
  EXPECT_EQ(refused, Variant(false)) << vb::CStr(refused);
  // Logins compare ignoring case, as on SQL Server.
  EXPECT_EQ(general->Call("Login", {Variant("MARIA"), Variant(Encoded("se;gredo"))}), Variant(true));
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());

  EXPECT_EQ(Command(Setup(" --user")).status, 2);
  EXPECT_EQ(Command("setup-server --admin-user x").status, 2);
}

}  // namespace
