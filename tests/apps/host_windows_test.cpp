// The reference host's own windows and walk: the list of entries filled from the host's
// connection, kept current by the component's RemoteKey and opening entries through
// NovoRegisto and Registo; and `dorvantos demo`, one entry kept end to end headless.

#include <gtest/gtest.h>
#include <stdio.h>
#include <stdlib.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "DriverProcess.h"
#include "common/PasswordCodec.h"
#include "editor_list.h"
#include "platform/ado/Connection.h"
#include "platform/ado/Database.h"
#include "platform/ado/Recordset.h"
#include "platform/ado/RecordsetObject.h"
#include "platform/forms/Forms.h"
#include "platform/forms/ScriptedDesktop.h"
#include "platform/registry/Registry.h"
#include "platform/registry/Store.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace {

std::string TempDir() {
  char pattern[] = "/tmp/dv-host-XXXXXX";
  return mkdtemp(pattern);
}

ado::ConnectionPtr DemoDatabase(const std::string& path) {
  ado::CreateOptions options;
  options.passwordIterations = 1000;
  ado::CreateDatabase(path, {{"poc_dorvantos", "partilhada"}, {"demo", "demo"}}, options);
  auto connection = ado::Connection::Create();
  connection->Open(ado::EmbeddedConnectionString(path, "demo", "demo"));
  return connection;
}

// Stands in for POC_Dorvantos.General: records what the host asks of it.
class FakeGeneral : public vb::Object {
 public:
  struct Call {
    std::string name;
    std::vector<vb::Variant> args;
  };
  vb::Variant Invoke(const std::string& name, std::vector<vb::Variant>& args) override {
    calls.push_back({name, args});
    return {};
  }
  std::vector<Call> calls;
};

class EntryList : public ::testing::Test {
 protected:
  void SetUp() override {
    dir_ = TempDir();
    previous_ = forms::Desktop::Installed();
    forms::Desktop::Install(desktop_);
    db_ = DemoDatabase(dir_ + "/demo.db");
    component_ = std::make_shared<FakeGeneral>();
  }
  void TearDown() override {
    if (list_ && list_->Loaded()) list_->Unload();
    list_.reset();
    db_->Close();
    forms::Desktop::Install(previous_);
    std::error_code ignored;
    std::filesystem::remove_all(dir_, ignored);
  }

  int32_t AddEntry(const std::string& date, const std::string& number, const std::string& ref,
                   int finalized) {
    db_->Execute("INSERT INTO tbPOC_Dorvantos (data, dorvanto_no, tipo_diario_id, referencia, "
                 "finalizado, valor) VALUES (CONVERT(DATETIME,'" + date + " 00:00:00',102), '" +
                 number + "', 1, '" + ref + "', " + std::to_string(finalized) + ", 0)");
    ado::RecordsetPtr rs = db_->Execute("SELECT MAX(dorvanto_id) AS id FROM tbPOC_Dorvantos");
    return vb::CLng(rs->Fields("id").Value());
  }
  void AddLine(int32_t entry, const std::string& debit, const std::string& credit) {
    db_->Execute("INSERT INTO tbPOC_Dorvantos_Details (dorvanto_id, debito, credito) VALUES (" +
                 std::to_string(entry) + ", " + debit + ", " + credit + ")");
  }
  std::string JournalType() {
    ado::RecordsetPtr rs =
        db_->Execute("SELECT descrit FROM tbPOC_Diario_Tipos WHERE tipo_diario_id = 1");
    return vb::CStr(rs->Fields("descrit").Value());
  }

  app::frmDiario& Open() {
    list_ = std::make_shared<app::frmDiario>(db_, component_);
    list_->Show();
    return *list_;
  }

  std::string dir_;
  std::shared_ptr<forms::ScriptedDesktop> desktop_ = std::make_shared<forms::ScriptedDesktop>();
  std::shared_ptr<forms::Desktop> previous_;
  ado::ConnectionPtr db_;
  std::shared_ptr<FakeGeneral> component_;
  std::shared_ptr<app::frmDiario> list_;
};

TEST_F(EntryList, ShowsEveryEntryWithItsStateAndTotalAndSelectsTheLast) {
  const int32_t open = AddEntry("2026-03-02", "D-2", "Caixa", 0);
  const int32_t closed = AddEntry("2026-03-01", "D-1", "Venda 17", 1);
  AddLine(closed, "100.5", "0");
  AddLine(closed, "0", "100.5");
  app::frmDiario& list = Open();

  EXPECT_EQ(list.Caption(), "Diário - Lançamentos");
  forms::ListItemList& items = list.ListView1.ListItems();
  ASSERT_EQ(items.Count(), 2);
  // In date order, whatever the order they were written in.
  const forms::ListItem& first = items(1);
  EXPECT_EQ(first.Key(), app::EntryKey(closed));
  EXPECT_EQ(first.Text(), "01-03-2026");
  EXPECT_EQ(first.SubItems(1), JournalType());
  EXPECT_EQ(first.SubItems(2), "D-1");
  EXPECT_EQ(first.SubItems(3), "Venda 17");
  EXPECT_EQ(first.SubItems(4), "Finalizado");
  EXPECT_EQ(first.SubItems(5), "100,50");
  const forms::ListItem& second = items(2);
  EXPECT_EQ(second.Key(), app::EntryKey(open));
  EXPECT_EQ(second.SubItems(4), "Aberto");
  EXPECT_EQ(second.SubItems(5).find_first_not_of(' '), std::string::npos)
      << "an entry without lines has no total yet: " << second.SubItems(5);
  EXPECT_EQ(list.SelectedEntry(), open);
  EXPECT_TRUE(desktop_->messages.empty());
}

TEST_F(EntryList, RemoteKeyReadsTheEntriesAgainAndSelectsTheOneReported) {
  const int32_t older = AddEntry("2026-01-10", "A", "", 0);
  AddEntry("2026-01-20", "B", "", 0);
  app::frmDiario& list = Open();
  ASSERT_EQ(list.ListView1.ListItems().Count(), 2);

  // The component saved a new entry and finalized another meanwhile.
  const int32_t added = AddEntry("2026-01-15", "C", "", 0);
  db_->Execute("UPDATE tbPOC_Dorvantos SET finalizado = 1 WHERE dorvanto_id = " +
               std::to_string(older));
  list.CallBack()->Call("RemoteKey", {vb::Variant(added)});
  forms::ListItemList& items = list.ListView1.ListItems();
  ASSERT_EQ(items.Count(), 3);
  EXPECT_EQ(items(app::EntryKey(older)).SubItems(4), "Finalizado");
  EXPECT_EQ(list.SelectedEntry(), added);
  EXPECT_TRUE(items(app::EntryKey(added)).Selected());

  // An entry removed in the editor is reported with a key no longer listed: the list
  // drops it and keeps a selection.
  db_->Execute("DELETE FROM tbPOC_Dorvantos WHERE dorvanto_id = " + std::to_string(added));
  list.CallBack()->Call("RemoteKey", {vb::Variant(added)});
  EXPECT_EQ(items.Count(), 2);
  EXPECT_EQ(items.Find(app::EntryKey(added)), nullptr);
  EXPECT_TRUE(list.SelectedEntry().has_value());
}

TEST_F(EntryList, TheCallBackOutlivingItsWindowDoesNothing) {
  Open();
  vb::ObjectPtr callBack = list_->CallBack();
  list_->Unload();
  list_.reset();
  EXPECT_NO_THROW(callBack->Call("RemoteKey", {vb::Variant(1)}));
  EXPECT_THROW(callBack->Call("Other", {}), vb::Error);
}

TEST_F(EntryList, NewEntryAndOpeningHandTheComponentTheCallBack) {
  const int32_t first = AddEntry("2026-02-01", "X", "", 0);
  AddEntry("2026-02-02", "Y", "", 0);
  app::frmDiario& list = Open();
  forms::KeyboardUser person(list);

  ASSERT_TRUE(person.Click(list.Command1));
  ASSERT_EQ(component_->calls.size(), 1u);
  EXPECT_EQ(component_->calls[0].name, "NovoRegisto");
  EXPECT_EQ(vb::CStr(component_->calls[0].args[0]), "tbPOC_Dorvantos");
  ASSERT_TRUE(component_->calls[0].args[3].IsObject());
  EXPECT_EQ(component_->calls[0].args[3].AsObject(), list.CallBack());

  // Enter on the selected row opens that entry, with a recordset of the entries.
  ASSERT_TRUE(person.ClickItem(list.ListView1, app::EntryKey(first)));
  person.Press(forms::vbKeyReturn);
  ASSERT_EQ(component_->calls.size(), 2u);
  const FakeGeneral::Call& opened = component_->calls[1];
  EXPECT_EQ(opened.name, "Registo");
  EXPECT_EQ(vb::CLng(opened.args[1]), first);
  ado::RecordsetPtr handed = ado::RecordsetObject::From(opened.args[0]);
  ASSERT_TRUE(handed);
  EXPECT_FALSE(handed->Eof());
  EXPECT_EQ(opened.args[4].AsObject(), list.CallBack());

  ASSERT_TRUE(person.DoubleClickItem(list.ListView1, app::EntryKey(first)));
  EXPECT_EQ(component_->calls.size(), 3u);
  EXPECT_EQ(component_->calls[2].name, "Registo");
}

TEST_F(EntryList, AnEmptyJournalOpensNothing) {
  app::frmDiario& list = Open();
  EXPECT_EQ(list.ListView1.ListItems().Count(), 0);
  forms::KeyboardUser person(list);
  ASSERT_TRUE(person.Click(list.Command2));
  EXPECT_TRUE(component_->calls.empty());
}

// ---- dorvantos demo ---------------------------------------------------------------------

struct Outcome {
  int status = -1;
  std::string output;
};

Outcome RunDorvantos(const std::string& arguments) {
  Outcome outcome;
  const std::string command = "'" + dvtest::BinDirectory() + "/dorvantos' " + arguments + " 2>&1";
  FILE* pipe = popen(command.c_str(), "r");
  if (!pipe) return outcome;
  char buffer[4096];
  size_t read;
  while ((read = fread(buffer, 1, sizeof buffer, pipe)) > 0) outcome.output.append(buffer, read);
  const int status = pclose(pipe);
  outcome.status = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  return outcome;
}

class DemoCommand : public ::testing::Test {
 protected:
  void SetUp() override {
    dir_ = TempDir();
    registry_ = dir_ + "/registry.reg";
    setenv("POC_ERROR_LOG", (dir_ + "/errors.log").c_str(), 1);
    ASSERT_EQ(RunDorvantos("--registry '" + registry_ + "' register '" + dvtest::LibDirectory() +
                           "/libpoc_dorvantos.so' '" + dvtest::LibDirectory() +
                           "/libravelport.so'").status,
              0);
    const std::string db = dir_ + "/demo.db";
    DemoDatabase(db)->Close();
    registry::Store(registry_).Update([&](registry::Hive& hive) {
      registry::Key& key = hive.Create("HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\POC");
      key.Set("dtSecurityInfo", {registry::REG_SZ, "False"});
      key.Set("dtUser", {registry::REG_SZ, "poc_dorvantos"});
      key.Set("dtPassword", {registry::REG_SZ, common::EncodePassword("partilhada")});
      key.Set("dtInitialCatalog", {registry::REG_SZ, "POC"});
      key.Set("dtDataSource", {registry::REG_SZ, "sqlite:" + db});
    });
  }
  void TearDown() override {
    unsetenv("POC_ERROR_LOG");
    std::error_code ignored;
    std::filesystem::remove_all(dir_, ignored);
  }
  std::string dir_, registry_;
};

TEST_F(DemoCommand, KeepsOneEntryToTheEndAndPrintsTheJournal) {
  const Outcome run = RunDorvantos("--registry '" + registry_ + "' demo");
  ASSERT_EQ(run.status, 0) << run.output;
  const std::string& out = run.output;
  // The steps, in order.
  const size_t fresh = out.find("Novo lançamento");
  const size_t balanced = out.find("Total de Débitos € 100,00  Total de Créditos € 100,00");
  const size_t finalized = out.find("Finalizar");
  const size_t closed = out.find("Fechar a janela");
  ASSERT_NE(fresh, std::string::npos) << out;
  ASSERT_NE(balanced, std::string::npos) << out;
  EXPECT_LT(fresh, balanced);
  EXPECT_LT(balanced, finalized);
  EXPECT_LT(finalized, closed);
  // The journal: the entry finalized, its two lines registered.
  const size_t journal = out.find("Diário:");
  ASSERT_NE(journal, std::string::npos) << out;
  EXPECT_NE(out.find("Finalizado", journal), std::string::npos) << out;
  EXPECT_NE(out.find("Venda a dinheiro", journal), std::string::npos) << out;
  EXPECT_NE(out.find("Depósito na CGD", journal), std::string::npos) << out;
  // Sub-accounts by their whole code, as the header editor lists them.
  EXPECT_NE(out.find("11001", journal), std::string::npos) << out;
  EXPECT_NE(out.find("12001", journal), std::string::npos) << out;
  EXPECT_NE(out.find("100,00", journal), std::string::npos) << out;
}

TEST_F(DemoCommand, AFailedLoginFailsTheCommand) {
  const Outcome run = RunDorvantos("--registry '" + registry_ + "' demo --password errada");
  EXPECT_EQ(run.status, 1) << run.output;
  EXPECT_NE(run.output.find("não foi aceite"), std::string::npos) << run.output;
  EXPECT_EQ(run.output.find("Diário:"), std::string::npos) << run.output;
}

TEST_F(DemoCommand, WrongArgumentsAreAUsageError) {
  EXPECT_EQ(RunDorvantos("--registry '" + registry_ + "' demo --user").status, 2);
  EXPECT_EQ(RunDorvantos("--registry '" + registry_ + "' demo --colour red").status, 2);
}

}  // namespace
