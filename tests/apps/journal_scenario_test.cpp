// A journal entry kept from start to finish by a script working the real windows
// through dorvantos automate: a new entry, two lines typed as a person types them (the
// second proposed as the balancing amount), finalized with registration numbers.

#include <gtest/gtest.h>
#include <stdlib.h>
#include <sys/wait.h>

#include <cstdio>
#include <filesystem>

#include "DriverProcess.h"
#include "common/PasswordCodec.h"
#include "platform/ado/Database.h"
#include "platform/registry/Registry.h"
#include "platform/registry/Store.h"
#include "support/TestLedger.h"

namespace {

using Json = nlohmann::json;
using dvtest::DriverProcess;
using dvtest::LibDirectory;

class JournalScenario : public ::testing::Test {
 protected:
  void SetUp() override {
    char pattern[] = "/tmp/dv-scenario-XXXXXX";
    dir_ = mkdtemp(pattern);
    setenv("POC_ERROR_LOG", (dir_ + "/errors.log").c_str(), 1);
    const std::string registry = dir_ + "/registry.reg";
    const std::string command = "'" + dvtest::BinDirectory() + "/dorvantos' --registry '" +
                                registry + "' register '" + LibDirectory() +
                                "/libpoc_dorvantos.so' '" + LibDirectory() +
                                "/libravelport.so' >/dev/null 2>&1";
    ASSERT_EQ(std::system(command.c_str()), 0);
    ado::CreateOptions options;
    options.passwordIterations = 1000;
    ledger_.emplace(dir_, std::vector<ado::Login>{{"poc_dorvantos", "partilhada"}, {"demo", "demo"}}, options);
    registry::Store(registry).Update([&](registry::Hive& hive) {
      registry::Key& key = hive.Create("HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\POC");
      key.Set("dtSecurityInfo", {registry::REG_SZ, "False"});
      key.Set("dtUser", {registry::REG_SZ, "poc_dorvantos"});
      key.Set("dtPassword", {registry::REG_SZ, common::EncodePassword("partilhada")});
      key.Set("dtInitialCatalog", {registry::REG_SZ, ledger_->Catalog()});
      key.Set("dtDataSource", {registry::REG_SZ, ledger_->DataSource()});
    });
    driver_.emplace(std::vector<std::string>{"automate", "--registry", registry});
    ASSERT_TRUE(driver_->Started());
  }

  void TearDown() override {
    driver_.reset();
    ledger_.reset();
    unsetenv("POC_ERROR_LOG");
    std::error_code ignored;
    std::filesystem::remove_all(dir_, ignored);
  }

  // A request that must succeed without showing anything.
  Json Do(const Json& request) {
    auto reply = driver_->Request(request);
    EXPECT_EQ(reply.response["ok"], true) << request << " -> " << reply.response;
    EXPECT_TRUE(reply.events.empty()) << request << " -> " << reply.events.front();
    return reply.response;
  }

  Json Rows(const std::string& query) { return Do({{"op", "sql"}, {"query", query}})["rows"]; }

  // Types a line into the newest line editor as a person does: account, the rest of
  // the sub-account code after the account prefix, description, and an amount.
  void TypeLine(const std::string& account, const std::string& subAccountRest,
                const std::string& description, const std::string& debit) {
    const Json form = {{"form", "frmMainDetails"}};
    auto on = [&](Json request) { request.update(form); return Do(request); };
    on({{"op", "type"}, {"control", "FXConta_Codigo"}, {"text", account}});
    on({{"op", "key"}, {"control", "FXConta_Codigo"}, {"key", "Enter"}});
    on({{"op", "type"}, {"control", "FXSubconta_codigo"}, {"text", subAccountRest}});
    EXPECT_EQ(on({{"op", "key"}, {"control", "FXSubconta_codigo"}, {"key", "Enter"}})["focus"],
              "FXDescrit_ID");
    on({{"op", "type"}, {"control", "FXDescrit"}, {"text", description}});
    if (!debit.empty()) on({{"op", "type"}, {"control", "FXDebito"}, {"text", debit}});
    on({{"op", "click"}, {"control", "Command1"}});
  }

  std::string dir_;
  std::optional<DriverProcess> driver_;
  std::optional<dvtest::TestLedger> ledger_;
};

TEST_F(JournalScenario, AnEntryIsTypedBalancedAndFinalizedThroughItsWindows) {
  ASSERT_EQ(Do({{"op", "login"}, {"class", "General"}, {"user", "demo"}, {"password", "demo"}})
                ["result"],
            true);
  Do({{"op", "new"}, {"class", "General"}});
  const Json header = Do({{"op", "state"}, {"form", "frmMain"}});
  EXPECT_EQ(header["caption"], "Lançamento no Diário");
  EXPECT_EQ(header["controls"]["FXCreated_By"]["text"], "demo");

  Do({{"op", "select"}, {"form", "frmMain"}, {"control", "FXTipo_Diario_ID"}, {"itemData", 1}});
  // F2 in a header field asks for a new line.
  EXPECT_EQ(Do({{"op", "key"}, {"form", "frmMain"}, {"control", "FXObs"}, {"key", "F2"}})["active"]
               ["form"],
            "frmMainDetails");
  TypeLine("11", "001", "Venda a dinheiro", "100");

  // The entry does not balance yet: the next line editor opens by itself and proposes
  // the credit that balances it.
  const Json second = Do({{"op", "state"}, {"form", "frmMainDetails"}});
  EXPECT_EQ(second["controls"]["FXCredito"]["text"], "€ 100,00");
  EXPECT_EQ(second["controls"]["FXDebito"]["text"], "€ 0,00");
  TypeLine("12", "001", "Depósito na CGD", "");

  // Balanced: no further line editor, and the totals show it.
  const Json forms = Do({{"op", "forms"}})["forms"];
  ASSERT_EQ(forms.size(), 1u) << forms;
  const Json totals = Do({{"op", "state"}, {"form", "frmMain"}})["controls"];
  EXPECT_EQ(totals["FXTotal_Debitos"]["text"], "€ 100,00");
  EXPECT_EQ(totals["FXTotal_Creditos"]["text"], "€ 100,00");

  Do({{"op", "click"}, {"form", "frmMain"}, {"control", "Toolbar1"}, {"button", "finalizar"}});
  const Json lines = Rows(
      "SELECT reg_no, ano, debito, credito, conta, sub_conta, sub_conta_descrit FROM "
      "tbPOC_Dorvantos_Details ORDER BY diario_id");
  ASSERT_EQ(lines.size(), 2u) << lines;
  EXPECT_EQ(lines[0]["reg_no"], 1);
  EXPECT_EQ(lines[1]["reg_no"], 2);
  EXPECT_EQ(lines[0]["debito"], 100.0);
  EXPECT_EQ(lines[1]["credito"], 100.0);
  EXPECT_EQ(lines[0]["conta"], "11");
  EXPECT_EQ(lines[1]["sub_conta_descrit"], "Caixa Geral de Depósitos - c/ 0035 0123");
  EXPECT_FALSE(lines[0]["ano"].is_null());
  const Json entry = Rows("SELECT finalizado, valor, tipo_diario_id, created_by FROM tbPOC_Dorvantos");
  ASSERT_EQ(entry.size(), 1u);
  EXPECT_EQ(entry[0]["finalizado"], 1);
  EXPECT_EQ(entry[0]["valor"], 100.0);
  EXPECT_EQ(entry[0]["tipo_diario_id"], 1);
  EXPECT_EQ(entry[0]["created_by"], "demo");

  driver_->CloseInput();
  EXPECT_EQ(driver_->Wait(), 0);
}

}  // namespace
