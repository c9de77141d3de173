// The shared connection's probe before every statement and the reconnect dialog.

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>

#include "common/ErrorTrap.h"
#include "common/modFechos.h"
#include "component/data/ComponentFixture.h"
#include "component/frmSQLServer.h"
#include "platform/ado/Recordset.h"
#include "platform/forms/KeyboardUser.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace {

using component::frmSQLServer;

class DataEnvironmentTest : public dvtest::ComponentTest {
 protected:
  void SetUp() override {
    ComponentTest::SetUp();
    ASSERT_TRUE(LoginAsAna());
    // Every statement the connection announces, the probes' included, in order.
    original_ = common::SqlServer()->WillExecute;
    common::SqlServer()->WillExecute = [this](ado::WillExecuteEvent& event) {
      seen_.push_back(event.Source);
      original_(event);
    };
  }
  void TearDown() override {
    common::SqlServer()->WillExecute = original_;
    ComponentTest::TearDown();
  }

  int32_t ErrorOf(const std::function<void()>& action) {
    try {
      action();
    } catch (const vb::Error& e) {
      return e.Number();
    }
    return 0;
  }

  int64_t Count(const std::string& sql) {
    ado::RecordsetPtr rs = common::SqlServer()->Execute(sql);
    return static_cast<int64_t>(vb::CDbl(rs->Fields(0).Value()));
  }

  // The connection breaks: closed, and its settings point where nothing can open.
  void BreakConnection() {
    CloseShared();
    Set("dtDataSource", "sqlite:" + sandbox_.Directory() + "/missing/poc.db");
  }

  std::function<void(ado::WillExecuteEvent&)> original_;
  std::vector<std::string> seen_;
};

const char* const kProbe = "SELECT @@TRANCOUNT as flTrans";

TEST_F(DataEnvironmentTest, EveryStatementIsProbedFirstInsideTransactionsToo) {
  common::SqlServer()->Execute("SELECT 1 AS x");
  ado::RecordsetPtr rs = ado::Recordset::Create();
  rs->Open("SELECT * FROM tbFechos", common::SqlServer());
  EXPECT_EQ(seen_, (std::vector<std::string>{"SELECT 1 AS x", kProbe, "SELECT * FROM tbFechos", kProbe}));
  // The probe opened no transaction of its own.
  EXPECT_EQ(Count("SELECT @@TRANCOUNT as n"), 0);

  common::SqlServer()->BeginTrans();
  seen_.clear();
  common::SqlServer()->Execute("INSERT INTO tbFechos (data, anulado) VALUES (GETDATE(), 0)");
  EXPECT_EQ(seen_.size(), 2u);
  EXPECT_EQ(seen_.at(1), kProbe);
  EXPECT_TRUE(common::IsTransactionOpen());  // the probe did not end it
  common::SqlServer()->RollbackTrans();
  EXPECT_EQ(Count("SELECT COUNT(*) FROM tbFechos"), 0);

  // Window messages run after each statement.
  int before = desktop_->doEventsCalls;
  common::SqlServer()->Execute("SELECT 1 AS x");
  EXPECT_GT(desktop_->doEventsCalls, before);
  EXPECT_TRUE(desktop_->modalForms.empty());
}

TEST_F(DataEnvironmentTest, AClosedConnectionReopensWithoutAskingWhenItCan) {
  CloseShared();
  EXPECT_EQ(Count("SELECT 1"), 1);
  EXPECT_EQ(common::SqlServer()->State(), ado::adStateOpen);
  // An error left by a failed statement makes the next one reconnect, silently.
  EXPECT_NE(ErrorOf([] { common::SqlServer()->Execute("SELECT FROM nada"); }), 0);
  EXPECT_EQ(Count("SELECT 2"), 2);
  EXPECT_EQ(common::SqlServer()->Errors().Count(), 0);
  EXPECT_TRUE(desktop_->modalForms.empty());
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

TEST_F(DataEnvironmentTest, TheDialogRetriesAsOftenAsThePersonAsks) {
  BreakConnection();
  int shown = 0;
  auto retry = [&](bool fixFirst) {
    return [&, fixFirst](forms::Form& form) {
      ++shown;
      auto& dialog = dynamic_cast<frmSQLServer&>(form);
      EXPECT_EQ(dialog.Caption(), "Ligação ao Servidor de Dados (SQL)");
      EXPECT_TRUE(dialog.TopMost());
      EXPECT_EQ(dialog.Image1.Picture(), dialog.ImageList1.Picture(1));
      if (fixFirst) WriteSettings();
      EXPECT_TRUE(forms::KeyboardUser(dialog).Click(dialog.Command1));
      // Clicked once; the dialog waits hidden for the loop to read its answer.
      EXPECT_FALSE(dialog.Command1.Enabled());
      EXPECT_FALSE(dialog.Showing());
      EXPECT_TRUE(dialog.Loaded());
      EXPECT_EQ(dialog.Get("TryAgain"), vb::Variant(true));
    };
  };
  desktop_->WhenShown("frmSQLServer", retry(false));
  desktop_->WhenShown("frmSQLServer", retry(true));

  EXPECT_EQ(Count("SELECT 7"), 7);
  EXPECT_EQ(shown, 2);
  EXPECT_EQ(desktop_->modalForms, (std::vector<std::string>{"frmSQLServer", "frmSQLServer"}));
  EXPECT_TRUE(desktop_->leftOpen.empty());
  EXPECT_EQ(component::Data().Dialog(), nullptr);
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

TEST_F(DataEnvironmentTest, SairLetsTheStatementFailUnreported) {
  BreakConnection();
  desktop_->WhenShown("frmSQLServer", [](forms::Form& form) {
    auto& dialog = dynamic_cast<frmSQLServer&>(form);
    EXPECT_TRUE(forms::KeyboardUser(dialog).Click(dialog.Command2));
  });
  EXPECT_EQ(ErrorOf([] { common::SqlServer()->Execute("SELECT 1"); }), vb::kErrConnectionClosed);

  // The close box is "&Sair" too; a trapped caller reports nothing of it.
  bool ranClean = common::Trap(common::FormSite("frmMain", "DoGravar"),
                               [] { common::SqlServer()->Execute("SELECT 1"); });
  EXPECT_FALSE(ranClean);
  EXPECT_EQ(desktop_->modalForms.size(), 2u);
  EXPECT_TRUE(desktop_->leftOpen.empty());
  EXPECT_EQ(common::SqlServer()->State(), ado::adStateClosed);
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

TEST_F(DataEnvironmentTest, MissingSettingsGiveUpWithoutAsking) {
  CloseShared();
  Remove("dtUser");
  EXPECT_EQ(ErrorOf([] { common::SqlServer()->Execute("SELECT 1"); }), vb::kErrConnectionClosed);
  EXPECT_TRUE(desktop_->modalForms.empty());
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

// The database server stops in the middle of a session and comes back: the next
// statement finds the connection broken and shows the dialog; "Ligar ao servidor SQL"
// after the restart goes on, and what was written before is still there.
TEST_F(DataEnvironmentTest, AServerThatStopsAndComesBackIsReconnectedWithNothingLost) {
  if (!ledger_->OnServer()) GTEST_SKIP() << "needs a database server it may stop";
  const std::string server = std::string(POC_SOURCE_DIR) + "/scripts/pg-test-server";
  const std::string folder = std::filesystem::path(std::getenv("POC_TEST_PG_ENV")).parent_path().string();
  auto run = [&](const std::string& verb) {
    return std::system(("'" + server + "' " + verb + " '" + folder + "' >/dev/null").c_str());
  };
  common::SqlServer()->Execute("INSERT INTO tbFechos (data, descrit, anulado) VALUES (GETDATE(), 'antes', 0)");

  ASSERT_EQ(run("halt"), 0);
  int shown = 0;
  desktop_->WhenShown("frmSQLServer", [&](forms::Form& form) {
    ++shown;
    auto& dialog = dynamic_cast<frmSQLServer&>(form);
    EXPECT_EQ(run("resume"), 0);
    EXPECT_TRUE(forms::KeyboardUser(dialog).Click(dialog.Command1));
  });
  common::SqlServer()->Execute("INSERT INTO tbFechos (data, descrit, anulado) VALUES (GETDATE(), 'depois', 0)");

  EXPECT_EQ(shown, 1);
  EXPECT_EQ(Count("SELECT COUNT(*) FROM tbFechos WHERE descrit IN ('antes', 'depois')"), 2);
  EXPECT_EQ(common::SqlServer()->Errors().Count(), 0);
  EXPECT_TRUE(desktop_->leftOpen.empty());
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

}  // namespace
