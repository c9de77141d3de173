#include <gtest/gtest.h>
#include <sys/stat.h>

#include <nlohmann/json.hpp>
#include <regex>

#include "platform/automation/TestSandbox.h"
#include "platform/automation/CreateObject.h"
#include "platform/automation/ServerLoader.h"
#include "platform/vb/Error.h"
#include "platform/vb/Variant.h"

namespace {

using vb::Variant;

class RavelportTest : public ::testing::Test {
 protected:
  void SetUp() override {
    const auto& server = automation::LoadInprocServer(dvtest::LibraryPath("libravelport.so"));
    ASSERT_EQ(server.registerServer(), automation::S_OK);
  }

  static void Report(const std::string& message) {
    automation::CreateObject("Ravelport.General")
        ->Call("Report", {Variant("POC Dorvantos"), Variant("Dorvantos"), Variant("frmMain"),
                          Variant("DoGravar"), Variant(message)});
  }

  dvtest::Sandbox sandbox_;
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
