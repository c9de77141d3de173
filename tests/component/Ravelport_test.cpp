#include <gtest/gtest.h>
#include <sys/stat.h>

#include <nlohmann/json.hpp>
#include <regex>

#include "platform/automation/TestSandbox.h"
#include "platform/automation/CreateObject.h"
#include "platform/automation/ServerLoader.h"
#include "platform/forms/ScriptedDesktop.h"
#include "platform/vb/Error.h"
#include "platform/vb/Variant.h"

namespace {

using vb::Variant;

class RavelportTest : public ::testing::Test {
 protected:
  void SetUp() override {
    const auto& server = automation::LoadInprocServer(dvtest::LibraryPath("libravelport.so"));
    ASSERT_EQ(server.registerServer(), automation::S_OK);
    // The console desktop would print each notice too; the stderr line checked here is
    // the reporter's own.
    forms::Desktop::Install(desktop_);
  }
  void TearDown() override { forms::Desktop::Install(nullptr); }

  static void Report(const std::string& message) {
    automation::CreateObject("Ravelport.General")
        ->Call("Report", {Variant("POC Dorvantos"), Variant("Dorvantos"), Variant("frmMain"),
                          Variant("DoGravar"), Variant(message)});
  }

  dvtest::Sandbox sandbox_;
  std::shared_ptr<forms::ScriptedDesktop> desktop_ = std::make_shared<forms::ScriptedDesktop>();
};

TEST_F(RavelportTest, EachReportIsOneJsonLineAndOneStderrLine) {
  testing::internal::CaptureStderr();
  Report("Type mismatch");
  Report("linha 1\nlinha 2 \xff");  // a line break and a byte that is no UTF-8
  std::string console = testing::internal::GetCapturedStderr();

  std::vector<std::string> lines = sandbox_.ErrorLogLines();
  ASSERT_EQ(lines.size(), 2u);
  nlohmann::json first = nlohmann::json::parse(lines[0]);
  EXPECT_EQ(first["product"], "POC Dorvantos");
  EXPECT_EQ(first["project"], "Dorvantos");
  EXPECT_EQ(first["module"], "frmMain");
  EXPECT_EQ(first["procedure"], "DoGravar");
  EXPECT_EQ(first["message"], "Type mismatch");
  EXPECT_TRUE(std::regex_match(first["time"].get<std::string>(),
                               std::regex(R"(\d{4}-\d\d-\d\dT\d\d:\d\d:\d\d\.\d{3}Z)")))
      << first["time"];

  nlohmann::json second = nlohmann::json::parse(lines[1]);
  EXPECT_EQ(second["message"], "linha 1\nlinha 2 \xEF\xBF\xBD");

  EXPECT_EQ(console,
            "POC Dorvantos [Dorvantos] frmMain.DoGravar: Type mismatch\n"
            "POC Dorvantos [Dorvantos] frmMain.DoGravar: linha 1 linha 2 \xff\n");
}

TEST_F(RavelportTest, DefaultLogIsPrivateToTheUser) {
  unsetenv("POC_ERROR_LOG");
  std::string state = sandbox_.Directory() + "/state";
  setenv("XDG_STATE_HOME", state.c_str(), 1);
  testing::internal::CaptureStderr();
  Report("x");
  testing::internal::GetCapturedStderr();
  unsetenv("XDG_STATE_HOME");

  struct stat directory {};
  struct stat file {};
  ASSERT_EQ(stat((state + "/poc-dorvantos").c_str(), &directory), 0);
  ASSERT_EQ(stat((state + "/poc-dorvantos/errors.log").c_str(), &file), 0);
  EXPECT_EQ(directory.st_mode & 0777, 0700u);
  EXPECT_EQ(file.st_mode & 0777, 0600u);
}

TEST_F(RavelportTest, ALogThatCannotBeWrittenIsAnErrorNotASilentLoss) {
  std::string unwritable = sandbox_.Directory() + "/missing/errors.log";
  setenv("POC_ERROR_LOG", unwritable.c_str(), 1);
  testing::internal::CaptureStderr();
  try {
    Report("x");
    ADD_FAILURE() << "the report claimed success";
  } catch (const vb::Error& e) {
    EXPECT_EQ(e.Number(), 75);
    EXPECT_NE(e.Description().find(unwritable), std::string::npos) << e.Description();
  }
  // Still seen on stderr.
  EXPECT_NE(testing::internal::GetCapturedStderr().find("frmMain.DoGravar: x"), std::string::npos);
}

TEST_F(RavelportTest, EachLoggedReportIsShownWithoutSecrets) {
  testing::internal::CaptureStderr();
  Report("Falha na ligação: Password=segredo;User ID=demo;Data Source=sqlite:/srv/poc.db");
  Report("Palavra-passe dv1:QUJDREVGR0hJSktM+/= recusada");
  testing::internal::GetCapturedStderr();

  ASSERT_EQ(desktop_->notices.size(), 2u);
  EXPECT_EQ(desktop_->notices[0].title, "POC Dorvantos");
  EXPECT_EQ(desktop_->notices[0].text,
            "frmMain.DoGravar: Falha na ligação: Password=***;User ID=***;Data Source=***");
  EXPECT_EQ(desktop_->notices[1].text, "frmMain.DoGravar: Palavra-passe *** recusada");
  // Nothing was asked of the person.
  EXPECT_TRUE(desktop_->messages.empty());
  // The log keeps what happened, and came first.
  ASSERT_EQ(sandbox_.ErrorLogLines().size(), 2u);
}

// A desktop whose notice fails: the report has been logged and stays a success.
class FailingNoticeDesktop : public forms::ScriptedDesktop {
 public:
  void ShowNotice(const std::string&, const std::string&) override {
    throw std::runtime_error("no display");
  }
};

TEST_F(RavelportTest, ANoticeThatFailsLosesNoLogLine) {
  forms::Desktop::Install(std::make_shared<FailingNoticeDesktop>());
  testing::internal::CaptureStderr();
  EXPECT_NO_THROW(Report("Type mismatch"));
  std::string console = testing::internal::GetCapturedStderr();
  EXPECT_EQ(sandbox_.ErrorLogLines().size(), 1u);
  EXPECT_NE(console.find("no display"), std::string::npos) << console;
}

TEST_F(RavelportTest, ReportTakesExactlyFiveArguments) {
  vb::ObjectPtr reporter = automation::CreateObject("Ravelport.General");
  try {
    reporter->Call("Report", {Variant("a"), Variant("b")});
    ADD_FAILURE() << "a short report was taken";
  } catch (const vb::Error& e) {
    EXPECT_EQ(e.Number(), 449);
  }
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

}  // namespace
