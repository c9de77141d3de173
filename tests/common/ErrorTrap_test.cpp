#include "common/ErrorTrap.h"

#include <gtest/gtest.h>

#include <stdexcept>

#include <nlohmann/json.hpp>

#include "platform/automation/ClassRegistry.h"
#include "platform/automation/ServerLoader.h"
#include "platform/automation/TestSandbox.h"
#include "platform/vb/Error.h"

namespace {

using common::TrapSite;

// Each kind of procedure with what its reports must look like: whether an empty and a
// blank description are reported, and whether the message is the long form.
struct Case {
  const char* kind;
  TrapSite site;
  bool reportsEmpty;
  bool reportsBlank;
  bool longForm;
};

std::vector<Case> AllKinds() {
  return {
      {"Login", common::LoginSite("Login"), true, true, false},
      {"DataEnvironment", common::DataEnvironmentSite("SqlServer_WillExecute"), true, true, false},
      {"Class", common::ClassSite("NovoRegisto"), false, true, false},
      {"Form", common::FormSite("frmMain", "DoGravar"), false, false, false},
      {"FindConta", common::FindContaSite("DoFillConta"), false, false, false},
      {"ControlFill", common::ControlFillSite(), false, false, false},
      {"Registry", common::RegistrySite("ObterValorString"), false, false, true},
      {"Fechos", common::FechosSite("IsClosedDate"), false, false, true},
      {"Code", common::CodeSite("Trtf"), false, false, true},
      {"Data", common::DataSite("ListField"), false, false, true},
  };
}

TEST(ErrorTrapRules, WhichErrorsAreReportedAndHowDependsOnTheKindOfProcedure) {
  for (const Case& c : AllKinds()) {
    SCOPED_TRACE(c.kind);
    EXPECT_FALSE(common::ShouldReport(c.site, 0, "anything"));
    EXPECT_FALSE(common::ShouldReport(c.site, 3709, "closed"));
    EXPECT_TRUE(common::ShouldReport(c.site, 5, "x"));
    EXPECT_EQ(common::ShouldReport(c.site, 5, ""), c.reportsEmpty);
    EXPECT_EQ(common::ShouldReport(c.site, 5, "   "), c.reportsBlank);
    EXPECT_EQ(common::ReportMessage(c.site, 13, "Type mismatch"),
              c.longForm ? "Error Number = 13 | Description = Type mismatch" : "Type mismatch");
  }
}

TEST(ErrorTrapRules, LabelsQuotedForTheReporter) {
  TrapSite controlFill = common::ControlFillSite();
  EXPECT_EQ(controlFill.product + "|" + controlFill.project + "|" + controlFill.module,
            "ControlFill|ControlFill|modControlFill");
  EXPECT_EQ(common::RegistrySite("GravarValorString").product, "Módulo de Registo");
  EXPECT_EQ(common::FormSite("frmMainDetails", "DoGravar").project, "Dorvantos");
  EXPECT_EQ(common::FindContaSite("Form_Load").project, "Cordavel");
  EXPECT_EQ(common::DataEnvironmentSite("SqlServer_WillExecute").module, "DataEnvironment");
  // The classes report under two different fixed pairs.
  EXPECT_NE(common::LoginSite("Login").project, common::ClassSite("Login").project);
}

// A trap reporting through the real reporter into the sandbox's log.
class ErrorTrapTest : public ::testing::Test {
 protected:
  void SetUp() override {
    const auto& reporter = automation::LoadInprocServer(dvtest::LibraryPath("libravelport.so"));
    ASSERT_EQ(reporter.registerServer(), automation::S_OK);
    testing::internal::CaptureStderr();
  }
  void TearDown() override { stderr_ = testing::internal::GetCapturedStderr(); }

  std::vector<nlohmann::json> Reports() const {
    std::vector<nlohmann::json> reports;
    for (const std::string& line : sandbox_.ErrorLogLines()) {
      reports.push_back(nlohmann::json::parse(line));
    }
    return reports;
  }

  dvtest::Sandbox sandbox_;
  std::string stderr_;
};

TEST_F(ErrorTrapTest, AnErrorIsReportedWithTheSiteLabelsAndTheProcedureEnds) {
  int result = 1;
  bool reachedEnd = false;
  bool ok = common::Trap(common::FormSite("frmMain", "DoGravar"), [&] {
    result = 2;
    throw vb::Error(vb::kErrTypeMismatch);
    reachedEnd = true;
  });
  EXPECT_FALSE(ok);
  EXPECT_FALSE(reachedEnd);
  EXPECT_EQ(result, 2);  // what the procedure had set before the error

  std::vector<nlohmann::json> reports = Reports();
  ASSERT_EQ(reports.size(), 1u);
  EXPECT_EQ(reports[0]["product"], common::kProductLabel);
  EXPECT_EQ(reports[0]["project"], "Dorvantos");
  EXPECT_EQ(reports[0]["module"], "frmMain");
  EXPECT_EQ(reports[0]["procedure"], "DoGravar");
  EXPECT_EQ(reports[0]["message"], "Type mismatch");

  EXPECT_TRUE(common::Trap(common::FormSite("frmMain", "DoGravar"), [] {}));
  EXPECT_EQ(Reports().size(), 1u);
}

TEST_F(ErrorTrapTest, UnreportedErrorsStillEndTheProcedure) {
  EXPECT_FALSE(common::Trap(common::FormSite("frmMain", "DoOpen"),
                            [] { throw vb::Error(vb::kErrConnectionClosed); }));
  EXPECT_FALSE(common::Trap(common::FormSite("frmMain", "DoOpen"),
                            [] { throw vb::Error(5, "  "); }));
  EXPECT_FALSE(common::Trap(common::ClassSite("Registo"), [] { throw vb::Error(5, ""); }));
  EXPECT_TRUE(Reports().empty());
  // ...where the login reports even an error without description.
  EXPECT_FALSE(common::Trap(common::LoginSite("Login"), [] { throw vb::Error(5, ""); }));
  ASSERT_EQ(Reports().size(), 1u);
  EXPECT_EQ(Reports()[0]["message"], "");
}

TEST_F(ErrorTrapTest, OtherExceptionsAreReportedWithTheirText) {
  EXPECT_FALSE(common::Trap(common::RegistrySite("ObterValorString"),
                            [] { throw std::runtime_error("disk on fire"); }));
  EXPECT_FALSE(common::Trap(common::CodeSite("Trtf"), [] { throw 42; }));
  std::vector<nlohmann::json> reports = Reports();
  ASSERT_EQ(reports.size(), 2u);
  EXPECT_EQ(reports[0]["message"], "Error Number = 51 | Description = disk on fire");
  EXPECT_EQ(reports[0]["product"], "Módulo de Registo");
  EXPECT_EQ(reports[1]["message"], "Error Number = 51 | Description = Internal error");
}

TEST_F(ErrorTrapTest, OnErrorRunsBeforeTheReportAndOnlyOnError) {
  int undone = 0;
  size_t reportsWhenUndoing = 99;
  auto undo = [&] {
    ++undone;
    reportsWhenUndoing = Reports().size();
    throw std::runtime_error("the roll-back failed too");  // must not hide the first error
  };
  common::Trap(common::FormSite("frmMain", "DoFinalizar"), [] {}, undo);
  EXPECT_EQ(undone, 0);

  common::Trap(common::FormSite("frmMain", "DoFinalizar"),
               [] { throw vb::Error(5, "Contadores em falta"); }, undo);
  EXPECT_EQ(undone, 1);
  EXPECT_EQ(reportsWhenUndoing, 0u);
  ASSERT_EQ(Reports().size(), 1u);
  EXPECT_EQ(Reports()[0]["message"], "Contadores em falta");
}

// Without a working reporter the caller goes on and the report lands on stderr.
class BrokenReporterTest : public ::testing::Test {
 protected:
  std::string TrapOnce() {
    testing::internal::CaptureStderr();
    bool ok = true;
    EXPECT_NO_THROW(ok = common::Trap(common::FormSite("frmMain", "DoGravar"),
                                      [] { throw vb::Error(5, "lost?"); }));
    EXPECT_FALSE(ok);
    return testing::internal::GetCapturedStderr();
  }

  dvtest::Sandbox sandbox_;
};

TEST_F(BrokenReporterTest, MissingReporter) {
  std::string console = TrapOnce();
  EXPECT_NE(console.find("unreported error in frmMain.DoGravar: lost?"), std::string::npos)
      << console;
  EXPECT_NE(console.find("429"), std::string::npos) << console;
}

TEST_F(BrokenReporterTest, ReporterWhoseReportFails) {
  automation::RegisterClass(
      {"FailingReporter", common::kReporterProgId, "{1D4D7D95-C6DC-4995-AEAD-245B4987B317}"}, {},
      dvtest::LibraryPath("libdvtest_server.so"));
  std::string console = TrapOnce();
  EXPECT_NE(console.find("the reporter's store is gone"), std::string::npos) << console;
  EXPECT_NE(console.find("unreported error in frmMain.DoGravar: lost?"), std::string::npos);
  // A second error after the failure is handled the same way.
  EXPECT_NE(TrapOnce().find("lost?"), std::string::npos);
}

}  // namespace
