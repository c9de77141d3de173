// Login of the public classes: the host's user checked on a private connection, the
// shared connection opened with the stored login, the component-wide login state.

#include <gtest/gtest.h>

#include "component/ClassObject.h"
#include "component/GeneralDetails.h"
#include "component/LoginState.h"
#include "component/data/ComponentFixture.h"
#include "platform/ado/ConnectionString.h"

namespace {

using dvtest::kHostPassword;
using dvtest::kHostUser;

class LoginTest : public dvtest::ComponentTest {};

TEST_F(LoginTest, OnlyTheUsersOwnEncodedPasswordLogsIn) {
  EXPECT_FALSE(Login(kHostUser, common::EncodePassword("errada")));
  EXPECT_FALSE(Login(kHostUser, kHostPassword));  // plain text is not the encoded form
  EXPECT_FALSE(Login("ninguem", common::EncodePassword(kHostPassword)));
  EXPECT_EQ(common::SqlServer()->State(), ado::adStateClosed);

  std::string encoded = common::EncodePassword(kHostPassword);
  EXPECT_TRUE(Login(kHostUser, encoded));
  EXPECT_TRUE(component::IsLoggedIn());
  EXPECT_EQ(component::LoggedUser(), kHostUser);
  EXPECT_EQ(component::LoggedPassword(), encoded);  // kept as given
  // The shared connection logs in as the stored login, not as the host's user.
  EXPECT_EQ(common::SqlServer()->State(), ado::adStateOpen);
  EXPECT_NE(common::SqlServer()->ConnectionString().find("User ID=poc_dorvantos;"), std::string::npos);

  EXPECT_TRUE(desktop_->messages.empty());
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

TEST_F(LoginTest, AMissingSettingOrAnUndecodableStoredPasswordRefuses) {
  for (const char* name : {"dtSecurityInfo", "dtUser", "dtPassword", "dtInitialCatalog", "dtDataSource"}) {
    SCOPED_TRACE(name);
    WriteSettings();
    Remove(name);
    EXPECT_FALSE(LoginAsAna());
  }
  WriteSettings();
  Set("dtPassword", dvtest::kSharedPassword);  // stored as plain text by hand
  EXPECT_FALSE(LoginAsAna());
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

TEST_F(LoginTest, ASecondLoginAnswersAtOnceWhileTheSharedConnectionIsOpen) {
  ASSERT_TRUE(LoginAsAna());
  // Settings gone: a second call does not read them.
  Remove("dtDataSource");
  EXPECT_TRUE(LoginAsAna());
  component::GeneralDetails other;
  std::string user = kHostUser, password = common::EncodePassword(kHostPassword);
  EXPECT_TRUE(other.Login(user, password));  // the login belongs to the component

  // Once the shared connection has closed, every step runs again.
  CloseShared();
  EXPECT_FALSE(LoginAsAna());
  WriteSettings();
  EXPECT_TRUE(LoginAsAna());
  EXPECT_EQ(common::SqlServer()->State(), ado::adStateOpen);
}

TEST_F(LoginTest, ASharedConnectionThatCannotOpenDoesNotRefuseTheUser) {
  Set("dtPassword", common::EncodePassword("outra"));
  EXPECT_TRUE(LoginAsAna());
  EXPECT_EQ(common::SqlServer()->State(), ado::adStateClosed);
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

TEST_F(LoginTest, SettingsAndPasswordsCannotAddKeysToTheConnectionString) {
  // The host's password holds ";", "=" and blanks at both ends, and still logs in. The
  // embedded engine takes no catalog; a server's driver refuses a name that could add
  // keys, so the login fails rather than reach another database.
  Set("dtInitialCatalog", ledger_->Catalog() + ";Data Source=sqlite:/nonexistent/other.db");
  EXPECT_EQ(LoginAsAna(), !ledger_->OnServer());

  component::ConnectionSettings settings{"False", "u", "", "POC;Provider=MSDASQL", " sqlite:x.db"};
  const std::string tricky = " a;b=\"c\" 'd' ";
  ado::ConnectionStringParts parts =
      ado::ConnectionStringParts::Parse(component::ConnectionString(settings, "eu;x=y", tricky));
  std::vector<std::string> keys;
  for (const auto& [key, value] : parts.Pairs()) keys.push_back(key);
  EXPECT_EQ(keys, (std::vector<std::string>{"Provider", "Persist Security Info", "User ID", "Password",
                                            "Initial Catalog", "Data Source", "Connect Timeout"}));
  EXPECT_EQ(parts.Get("Provider"), "SQLOLEDB.1");
  EXPECT_EQ(parts.Get("User ID"), "eu;x=y");
  EXPECT_EQ(parts.Get("Password"), tricky);
  EXPECT_EQ(parts.Get("Initial Catalog"), "POC;Provider=MSDASQL");
  EXPECT_EQ(parts.Get("Data Source"), " sqlite:x.db");
  EXPECT_EQ(parts.Get("Connect Timeout"), "15");
}

}  // namespace
