#pragma once
// The component in-process against a database of its own: a private settings store
// holding the five connection settings, an error log, the real reporter, a scripted
// desktop, and a database (embedded, or on the PostgreSQL server under test) with the
// shared connection's login and one host user.
//
// The login state and the shared connection live as long as the process, as they do in
// a host; each test starts with the shared connection closed, so Login runs its steps.

#include <gtest/gtest.h>

#include <memory>
#include <optional>
#include <string>

#include "common/PasswordCodec.h"
#include "common/SqlServer.h"
#include "component/ConnectionSettings.h"
#include "component/Data.h"
#include "component/General.h"
#include "platform/ado/Database.h"
#include "platform/automation/ServerLoader.h"
#include "platform/automation/TestSandbox.h"
#include "platform/forms/ScriptedDesktop.h"
#include "platform/registry/Store.h"
#include "support/TestLedger.h"

namespace dvtest {

inline constexpr const char* kSharedUser = "poc_dorvantos";
inline constexpr const char* kSharedPassword = "partilhada";
inline constexpr const char* kHostUser = "ana";
// Would end the value early, and add a key, were it not quoted.
inline constexpr const char* kHostPassword = " s3nha;Data Source=x ";

class ComponentTest : public ::testing::Test {
 protected:
  void SetUp() override {
    const auto& reporter = automation::LoadInprocServer(LibraryPath("libravelport.so"));
    ASSERT_EQ(reporter.registerServer(), automation::S_OK);
    desktop_ = std::make_shared<forms::ScriptedDesktop>();
    forms::Desktop::Install(desktop_);
    ledger_.emplace(sandbox_.Directory(),
                    std::vector<ado::Login>{{kSharedUser, kSharedPassword}, {kHostUser, kHostPassword}},
                    ado::CreateOptions{.demoData = false, .passwordIterations = 10});
    WriteSettings();
    CloseShared();
  }

  void TearDown() override {
    CloseShared();
    ledger_.reset();
    forms::Desktop::Install(nullptr);
  }

  static void CloseShared() {
    const ado::ConnectionPtr& shared = common::SqlServer();
    if (shared->State() == ado::adStateOpen) shared->Close();
    shared->Errors().Clear();
  }

  void WriteSettings() {
    Set("dtSecurityInfo", "False");
    Set("dtUser", kSharedUser);
    Set("dtPassword", common::EncodePassword(kSharedPassword));
    Set("dtInitialCatalog", ledger_->Catalog());
    Set("dtDataSource", ledger_->DataSource());
  }

  void Set(const std::string& name, const std::string& value) {
    registry::Store::Default().Update([&](registry::Hive& hive) {
      hive.Create(component::SettingsKey()).Set(name, {1, value});
    });
  }

  void Remove(const std::string& name) {
    registry::Store::Default().Update([&](registry::Hive& hive) {
      hive.Create(component::SettingsKey()).Erase(name);
    });
  }

  bool Login(std::string user, std::string encodedPassword) {
    return general_.Login(user, encodedPassword);
  }
  bool LoginAsAna() { return Login(kHostUser, common::EncodePassword(kHostPassword)); }

  Sandbox sandbox_;
  std::shared_ptr<forms::ScriptedDesktop> desktop_;
  std::optional<dvtest::TestLedger> ledger_;
  component::General general_;
};

}  // namespace dvtest
