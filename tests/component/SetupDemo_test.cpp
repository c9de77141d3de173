// A machine made ready by "dorvantos setup-demo", then a host that creates the
// component by ProgID and logs in as the demo user.

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>

#include "DorvantosCommand.h"
#include "platform/automation/CreateObject.h"
#include "platform/automation/TestSandbox.h"
#include "platform/registry/Store.h"
#include "platform/vb/Variant.h"

namespace {

using vb::Variant;

using dvtest::Command;
using dvtest::Outcome;

class SetupDemoTest : public ::testing::Test {
 protected:
  std::string Setup(const std::string& extra = {}) {
    return "--registry '" + registry::Store::DefaultPath() + "' setup-demo --db '" + db_ + "'" + extra;
  }

  dvtest::Sandbox sandbox_;
  std::string db_ = sandbox_.Directory() + "/data/demo.db";
};

TEST_F(SetupDemoTest, TheDemoUserLogsInThroughTheComponentCreatedByProgId) {
  Outcome setup = Command(Setup());
  ASSERT_EQ(setup.status, 0) << setup.output;
  EXPECT_NE(setup.output.find(db_), std::string::npos) << setup.output;
  EXPECT_NE(setup.output.find(registry::Store::DefaultPath()), std::string::npos) << setup.output;
  EXPECT_NE(setup.output.find("demo"), std::string::npos);

  // The settings name the database; the stored password is encoded; the file is private.
  auto hive = registry::Store::Default().Snapshot();
  const registry::Key* key = hive->Find("HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\POC");
  ASSERT_NE(key, nullptr);
  EXPECT_EQ(key->Find("dtDataSource")->data, "sqlite:" + db_);
  EXPECT_EQ(key->Find("dtSecurityInfo")->data, "False");
  EXPECT_EQ(key->Find("dtPassword")->data.rfind("dv1:", 0), 0u);
  struct stat settings {};
  ASSERT_EQ(stat(registry::Store::DefaultPath().c_str(), &settings), 0);
  EXPECT_EQ(settings.st_mode & 0777, 0600u);
  struct stat database {};
  ASSERT_EQ(stat(db_.c_str(), &database), 0);
  EXPECT_EQ(database.st_mode & 0777, 0600u);

  Outcome encoded = Command("encode-password demo");
  ASSERT_EQ(encoded.status, 0) << encoded.output;
  std::string password = encoded.output.substr(0, encoded.output.find('\n'));

  vb::ObjectPtr general = automation::CreateObject("POC_Dorvantos.General");
  Outcome wrong = Command("encode-password nao-e-esta");
  EXPECT_EQ(general->Call("Login", {Variant("demo"), Variant(wrong.output.substr(0, wrong.output.find('\n')))}),
            Variant(false));
  EXPECT_EQ(general->Call("Login", {Variant("demo"), Variant("demo")}), Variant(false));
  EXPECT_EQ(general->Call("Login", {Variant("demo"), Variant(password)}), Variant(true));
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

TEST_F(SetupDemoTest, AnExistingDatabaseIsReplacedOnlyWhenForced) {
  ASSERT_EQ(Command(Setup()).status, 0);
  auto written = std::filesystem::last_write_time(db_);
  Outcome again = Command(Setup());
  EXPECT_EQ(again.status, 1);
  EXPECT_NE(again.output.find("--force"), std::string::npos) << again.output;
  EXPECT_EQ(std::filesystem::last_write_time(db_), written);

  Outcome forced = Command(Setup(" --force --user maria --password 'a;b'"));
  EXPECT_EQ(forced.status, 0) << forced.output;
  EXPECT_NE(forced.output.find("maria"), std::string::npos);
  EXPECT_EQ(Command(Setup(" --user")).status, 2);
  EXPECT_EQ(Command("encode-password").status, 2);
}

}  // namespace
