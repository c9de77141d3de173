// List cells of a record's fields in each display kind.

#include "common/modData.h"

#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "platform/ado/Database.h"
#include "platform/automation/ServerLoader.h"
#include "platform/automation/TestSandbox.h"
#include "platform/vb/Locale.h"

namespace {

using common::ListField;

class ListFieldTest : public ::testing::Test {
 protected:
  void SetUp() override {
    vb::SetLocale(vb::Locale{});
    const auto& reporter = automation::LoadInprocServer(dvtest::LibraryPath("libravelport.so"));
    ASSERT_EQ(reporter.registerServer(), automation::S_OK);
    std::string path = sandbox_.Directory() + "/poc.db";
    ado::CreateDatabase(path, {{"ana", "x"}}, {.demoData = false, .passwordIterations = 10});
    connection_->Open(ado::EmbeddedConnectionString(path, "ana", "x"));
    rs_ = ado::Recordset::Create();
    rs_->Open("SELECT 0.23 AS Taxa, 1234.5 AS Valor, -1234.5 AS Negativo, 2.5 AS Par, "
              "3.5 AS Impar, -2.5 AS ParNegativo, 1234567.5 AS Grande, NULL AS Nada, "
              "'O''Brien' AS Nome, CONVERT(DATETIME,'2010-01-02 03:04:05',102) AS Quando",
              connection_);
  }

  dvtest::Sandbox sandbox_;
  ado::ConnectionPtr connection_ = ado::Connection::Create();
  ado::RecordsetPtr rs_;
};

TEST_F(ListFieldTest, FieldsAreFoundIgnoringCaseAndAbsentOrNullShowABlank) {
  EXPECT_EQ(ListField(rs_, "TAXA", common::kListText), ListField(rs_, "taxa", common::kListText));
  EXPECT_EQ(ListField(rs_, "nome", common::kListText), "O'Brien");
  EXPECT_EQ(ListField(rs_, "semelhante", common::kListText), " ");
  EXPECT_EQ(ListField(rs_, "Nada", common::kListEuro), " ");
  EXPECT_EQ(ListField(rs_, "Valor", 0), "");
  EXPECT_EQ(ListField(rs_, "Valor", 8), "");
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

TEST_F(ListFieldTest, EachDisplayKindHasItsPicture) {
  EXPECT_EQ(ListField(rs_, "Quando", common::kListDate), "02-01-2010");
  EXPECT_EQ(ListField(rs_, "Quando", common::kListDateTime), "02-01-2010 03:04:05");
  EXPECT_EQ(ListField(rs_, "Valor", common::kListNumber), "1.234,50");
  EXPECT_EQ(ListField(rs_, "Negativo", common::kListNumber), "- 1.234,50");
  EXPECT_EQ(ListField(rs_, "Valor", common::kListEuro), "€ 1.234,50");
  EXPECT_EQ(ListField(rs_, "Negativo", common::kListEuro), "€ -1.234,50");
  EXPECT_EQ(ListField(rs_, "Taxa", common::kListPercent), "23,00 %");
  // Whole numbers round halves to the even neighbour.
  EXPECT_EQ(ListField(rs_, "Par", common::kListWhole), "2");
  EXPECT_EQ(ListField(rs_, "Impar", common::kListWhole), "4");
  EXPECT_EQ(ListField(rs_, "ParNegativo", common::kListWhole), "-2");
  EXPECT_EQ(ListField(rs_, "Grande", common::kListWhole), "1.234.568");
}

TEST_F(ListFieldTest, AFailureIsReportedInTheLongFormAndGivesNothing) {
  rs_->Close();
  testing::internal::CaptureStderr();
  EXPECT_EQ(ListField(rs_, "Valor", common::kListNumber), "");
  EXPECT_EQ(ListField(nullptr, "Valor", common::kListNumber), "");
  testing::internal::GetCapturedStderr();
  auto lines = sandbox_.ErrorLogLines();
  ASSERT_EQ(lines.size(), 2u);
  for (const std::string& line : lines) {
    nlohmann::json report = nlohmann::json::parse(line);
    EXPECT_EQ(report["module"], "modData");
    EXPECT_EQ(report["procedure"], "ListField");
    EXPECT_EQ(report["message"].get<std::string>().rfind("Error Number = ", 0), 0u);
  }
}

}  // namespace
