// The server questions against a real database on the shared connection.

#include "common/modFechos.h"

#include <gtest/gtest.h>

#include <cmath>
#include <nlohmann/json.hpp>

#include "common/SqlServer.h"
#include "platform/ado/Database.h"
#include "platform/ado/Recordset.h"
#include "platform/automation/ServerLoader.h"
#include "platform/automation/TestSandbox.h"
#include "platform/vb/Conversions.h"

namespace {

using vb::Variant;

Variant D(int y, int m, int d, int h = 0, int n = 0, int s = 0) {
  return Variant(*vb::DateSerial(y, m, d, h, n, s));
}

class ServerQuestionsTest : public ::testing::Test {
 protected:
  void SetUp() override {
    const auto& reporter = automation::LoadInprocServer(dvtest::LibraryPath("libravelport.so"));
    ASSERT_EQ(reporter.registerServer(), automation::S_OK);
    path_ = sandbox_.Directory() + "/poc.db";
    ado::CreateDatabase(path_, {{"ana", "x"}}, {.demoData = false, .passwordIterations = 10});
    common::SqlServer()->Open(ado::EmbeddedConnectionString(path_, "ana", "x"));
    common::SqlServer()->WillExecute = [this](ado::WillExecuteEvent&) { ++statements_; };
  }
  void TearDown() override {
    common::SqlServer()->WillExecute = nullptr;
    if (common::SqlServer()->State() == ado::adStateOpen) common::SqlServer()->Close();
  }

  void Closing(const char* when, const char* anulado) {
    common::SqlServer()->Execute(std::string("INSERT INTO tbFechos (data, descrit, anulado) VALUES "
                                             "(CONVERT(DATETIME,'") +
                                 when + "',102), 'fecho', " + anulado + ")");
  }
  bool Closed(const Variant& date) { return common::IsClosedDate(date, common::SqlServer()); }

  dvtest::Sandbox sandbox_;
  std::string path_;
  int statements_ = 0;
};

TEST_F(ServerQuestionsTest, AClosingCoversItsWholeDayAndNothingAfter) {
  int before = statements_;
  EXPECT_FALSE(Closed(D(1990, 1, 1)));  // no closing yet
  EXPECT_EQ(statements_, before + 1);   // asked afresh, through the connection's events
  Closing("2009-12-31 00:00:00", "0");
  EXPECT_TRUE(Closed(D(2009, 12, 31, 18, 0, 0)));
  EXPECT_TRUE(Closed(D(2009, 12, 31, 23, 59, 59)));
  EXPECT_TRUE(Closed(D(2001, 5, 2)));
  EXPECT_FALSE(Closed(D(2010, 1, 1, 0, 0, 0)));
  EXPECT_FALSE(Closed(Variant::Null()));
  EXPECT_TRUE(Closed(Variant("15-06-2009")));  // dates as typed convert

  // Later closings that were cancelled do not count; a null mark counts as in force,
  // and the time a closing was stored with does not shorten its day.
  Closing("2010-06-30 00:00:00", "1");
  EXPECT_FALSE(Closed(D(2010, 3, 1)));
  Closing("2010-02-28 09:30:00", "NULL");
  EXPECT_TRUE(Closed(D(2010, 2, 28, 22, 0, 0)));
  EXPECT_FALSE(Closed(D(2010, 3, 1)));
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

TEST_F(ServerQuestionsTest, OnlyCancelledClosingsCloseNothing) {
  Closing("2009-12-31 00:00:00", "1");
  EXPECT_FALSE(Closed(D(2000, 1, 1)));
}

TEST_F(ServerQuestionsTest, AFailedClosingQueryIsReportedInTheLongFormAndAnswersOpen) {
  Closing("2009-12-31 00:00:00", "0");
  common::SqlServer()->Execute("DROP TABLE tbFechos");
  testing::internal::CaptureStderr();
  EXPECT_FALSE(Closed(D(2001, 1, 1)));
  testing::internal::GetCapturedStderr();
  auto lines = sandbox_.ErrorLogLines();
  ASSERT_EQ(lines.size(), 1u);
  nlohmann::json report = nlohmann::json::parse(lines[0]);
  EXPECT_EQ(report["module"], "modFechos");
  EXPECT_EQ(report["procedure"], "IsClosedDate");
  EXPECT_EQ(report["message"].get<std::string>().rfind("Error Number = ", 0), 0u) << report["message"];
}

TEST_F(ServerQuestionsTest, TransactionsAreSeenAndAClosedConnectionIsNotAsked) {
  EXPECT_FALSE(common::IsTransactionOpen());
  common::SqlServer()->BeginTrans();
  EXPECT_TRUE(common::IsTransactionOpen());
  common::SqlServer()->RollbackTrans();
  EXPECT_FALSE(common::IsTransactionOpen());

  common::SqlServer()->Close();
  int before = statements_;
  EXPECT_FALSE(common::IsTransactionOpen());
  EXPECT_EQ(statements_, before);
}

TEST_F(ServerQuestionsTest, ServerDateComesFromTheServerOrIsNull) {
  Variant now = common::GetServerDate();
  ASSERT_EQ(now.Type(), vb::VarType::Date) << now.Debug();
  EXPECT_LT(std::fabs(now.AsDate().serial - vb::Now().serial), 1.0 / 24);

  common::SqlServer()->Close();
  testing::internal::CaptureStderr();
  EXPECT_TRUE(common::GetServerDate().IsNull());
  common::SqlServer()->Open(ado::EmbeddedConnectionString(path_, "ana", "x"));
  common::SqlServer()->WillExecute = [](ado::WillExecuteEvent& e) { e.Source = "SELECT nonsense("; };
  EXPECT_TRUE(common::GetServerDate().IsNull());
  EXPECT_EQ(testing::internal::GetCapturedStderr(), "");
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

}  // namespace
