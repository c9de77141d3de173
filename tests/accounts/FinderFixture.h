#pragma once
// The account finder at work: a scripted desktop, a private embedded database with the
// shared connection open on it, the real error reporter writing into the sandbox, and
// an opener standing in for the line editor that records the call-backs it receives.

#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include <nlohmann/json.hpp>

#include "accounts/AccountFinder.h"
#include "accounts/frmFindConta.h"
#include "common/SqlServer.h"
#include "platform/ado/Database.h"
#include "platform/automation/ServerLoader.h"
#include "platform/automation/TestSandbox.h"
#include "platform/forms/Forms.h"
#include "platform/forms/ScriptedDesktop.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace accounts::testing {

// A window that opens the finder, as the line editor does: it offers DoFillConta and
// remembers every key it was handed.
class RecordingOpener : public forms::Form {
 public:
  RecordingOpener()
      : Form({.name = "frmMainDetails", .caption = "Linha", .width = 6000, .height = 4000}) {
    Method("DoFillConta", [this](std::vector<vb::Variant>& args) {
      received.push_back(vb::CLng(args.at(0)));
      return vb::Variant();
    });
  }
  std::vector<int32_t> received;
};

// An opener known only as an automation object, that is not one of our windows.
class RecordingObject : public vb::Object {
 public:
  vb::Variant Invoke(const std::string& name, std::vector<vb::Variant>& args) override {
    calls.push_back(name);
    if (name == "DoFillConta") {
      received.push_back(vb::CLng(args.at(0)));
      return {};
    }
    if (name == "Unload") return {};
    throw vb::Error(vb::kErrMemberNotSupported);
  }
  std::vector<std::string> calls;
  std::vector<int32_t> received;
};

// The scripted desktop, with a hook for what the person does while window messages run.
class PumpingDesktop : public forms::ScriptedDesktop {
 public:
  void DoEvents() override {
    ScriptedDesktop::DoEvents();
    if (whileMessagesRun) whileMessagesRun();
  }
  std::function<void()> whileMessagesRun;
};

// One row of tbPOC_Contas for a chart written by a test.
struct Account {
  const char* codigo;
  const char* descrit;
  int atribuicao = 0;
};

class FinderTest : public ::testing::Test {
 protected:
  void SetUp() override {
    const auto& reporter = automation::LoadInprocServer(dvtest::LibraryPath("libravelport.so"));
    ASSERT_EQ(reporter.registerServer(), automation::S_OK);
    previousDesktop_ = forms::Desktop::Installed();
    forms::Desktop::Install(desktop);
    path_ = sandbox_.Directory() + "/poc.db";
  }

  void TearDown() override {
    finder.reset();
    opener.reset();
    if (common::SqlServer()->State() == ado::adStateOpen) common::SqlServer()->Close();
    forms::Desktop::Install(previousDesktop_);
  }

  // The database with the demo chart of accounts, or with an empty one to be written.
  void OpenDatabase(bool demoData) {
    ado::CreateDatabase(path_, {{"ana", "segredo"}},
                        {.demoData = demoData, .passwordIterations = 10});
    common::SqlServer()->Open(ado::EmbeddedConnectionString(path_, "ana", "segredo"));
  }

  void OpenChart(const std::vector<Account>& chart) {
    OpenDatabase(false);
    for (const Account& a : chart) {
      std::string descrit = a.descrit ? std::string("'") + a.descrit + "'" : "NULL";
      common::SqlServer()->Execute(
          std::string("INSERT INTO tbPOC_Contas (codigo, descrit, atribuicao) VALUES ('") +
          a.codigo + "', " + descrit + ", " + std::to_string(a.atribuicao) + ")");
    }
  }

  // Opens the finder the way the line editor does: MainForm set, DoOpen called, both
  // by name.
  void OpenFinder(const vb::ObjectPtr& mainForm) {
    finder = accounts::NewAccountFinder();
    finder->Let("MainForm", vb::Variant(mainForm));
    finder->Call("DoOpen");
  }

  void OpenFinderFromWindow() {
    opener = std::make_shared<RecordingOpener>();
    opener->Show();
    OpenFinder(opener);
  }

  frmFindConta& Finder() { return dynamic_cast<frmFindConta&>(*finder); }
  forms::NodeList& Nodes() { return Finder().TreeView1.Nodes(); }
  forms::Node& NodeOf(const std::string& codigo) { return Nodes()("#" + codigo); }

  int32_t ContaId(const std::string& codigo) {
    auto rs = common::SqlServer()->Execute("SELECT conta_id FROM tbPOC_Contas WHERE codigo = '" +
                                           codigo + "'");
    return vb::CLng(rs->Fields("conta_id").Value());
  }

  std::vector<nlohmann::json> Reports() const {
    std::vector<nlohmann::json> reports;
    for (const std::string& line : sandbox_.ErrorLogLines())
      reports.push_back(nlohmann::json::parse(line));
    return reports;
  }

  dvtest::Sandbox sandbox_;
  std::shared_ptr<PumpingDesktop> desktop = std::make_shared<PumpingDesktop>();
  std::shared_ptr<RecordingOpener> opener;
  std::shared_ptr<forms::Form> finder;

 private:
  std::string path_;
  std::shared_ptr<forms::Desktop> previousDesktop_;
};

}  // namespace accounts::testing
