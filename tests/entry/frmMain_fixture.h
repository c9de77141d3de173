#pragma once
// The header editor against a real database with the demo data (embedded, or on the
// PostgreSQL server under test), the shared
// connection open on it, a private settings file with the POC key, a logged-in user and
// the scripted desktop. The windows it opens (line editors, the next header editor) and
// the host's call-back object are recorders.
//
// Every test also checks that no procedure of the window trapped an error it did not
// take with TakeErrors: with no reporter registered, trapped errors land on stderr.

#include <gtest/gtest.h>
#include <stdlib.h>

#include <filesystem>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "common/SqlServer.h"
#include "common/modRegistry.h"
#include "component/LoginState.h"
#include "entry/frmMain.h"
#include "platform/ado/Database.h"
#include "platform/ado/Recordset.h"
#include "platform/forms/Forms.h"
#include "platform/forms/ScriptedDesktop.h"
#include "platform/registry/Store.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"
#include "support/TestLedger.h"

namespace entry::testing {

// An automation object that records what is called on it and set on it. Objects set on
// it are held weakly, so a line editor's MainClass makes no cycle with the form.
class Recorder : public vb::Object {
 public:
  struct CallSeen {
    std::string name;
    std::vector<vb::Variant> args;
  };

  vb::Variant Invoke(const std::string& name, std::vector<vb::Variant>& args) override {
    calls.push_back({name, args});
    if (failing) throw vb::Error(vb::kErrMemberNotSupported, "Object doesn't support this property or method");
    auto result = results.find(name);
    return result == results.end() ? vb::Variant() : result->second;
  }
  void Let(const std::string& name, const vb::Variant& value) override {
    if (value.IsObject())
      objects[name] = value.AsObject();
    else
      values[name] = value;
  }
  // The arguments of the one call of that name; fails the test when there is not one.
  std::vector<vb::Variant> OnlyCall(const std::string& name) const {
    std::vector<vb::Variant> found;
    int count = 0;
    for (const auto& call : calls)
      if (call.name == name) {
        found = call.args;
        ++count;
      }
    EXPECT_EQ(count, 1) << "calls of " << name;
    return found;
  }

  std::vector<CallSeen> calls;
  std::map<std::string, vb::Variant> results;
  std::map<std::string, std::weak_ptr<vb::Object>> objects;
  std::map<std::string, vb::Variant> values;
  bool failing = false;
};

// frmMain whose finalization, called by name, is answered by the test unless the test
// asks for the real one.
class TestMain : public frmMain {
 public:
  explicit TestMain(HeaderEditorWindows windows) : frmMain(std::move(windows)) {
    Method("DoFinalizar", [this](std::vector<vb::Variant>&) {
      ++finalizations;
      return vb::Variant(realFinalize ? DoFinalizar() : finalizeAnswer);
    });
  }
  bool realFinalize = false;
  bool finalizeAnswer = true;
  int finalizations = 0;
  bool Final() const { return Finalizado; }
  bool Unlocked() const { return Desbloqueado; }

  // What the system-document password does.
  void Unlock() {
    Desbloqueado = true;
    DoPaint();
  }
  bool SaveMark() { return SaveButton().Enabled(); }
};

class HeaderEditorTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::string pattern = (std::filesystem::temp_directory_path() / "dv-frmmain-XXXXXX").string();
    ASSERT_NE(::mkdtemp(pattern.data()), nullptr);
    folder_ = pattern;
    registry::Store::SetDefaultPath((folder_ / "registry.reg").string());
    registry::Store::Default().Update([](registry::Hive& hive) { hive.Create(kPocSettingsKey); });

    ledger_.emplace(folder_.string(), std::vector<ado::Login>{{"ana", "segredo"}},
                    ado::CreateOptions{.demoData = true, .passwordIterations = 10});
    common::SqlServer()->Open(ledger_->ConnectionString("ana", "segredo"));
    component::RecordLoggedUser("ana", "segredo");
    component::SetLoggedIn();

    previous_ = forms::Desktop::Installed();
    desktop = std::make_shared<forms::ScriptedDesktop>();
    forms::Desktop::Install(desktop);
    caller = std::make_shared<Recorder>();
    form = NewForm();
    ::testing::internal::CaptureStderr();
  }

  void TearDown() override {
    const std::string errors = ::testing::internal::GetCapturedStderr();
    EXPECT_EQ(errors.find("frmMain."), std::string::npos) << errors;
    if (form) {
      form->MainClass.reset();
      form->CallBackClass.reset();
    }
    form.reset();
    forms::Desktop::Install(previous_);
    if (common::SqlServer()->State() == ado::adStateOpen) common::SqlServer()->Close();
    ledger_.reset();
    registry::Store::SetDefaultPath("");
    std::error_code ignored;
    std::filesystem::remove_all(folder_, ignored);
  }

  std::shared_ptr<TestMain> NewForm() {
    return std::make_shared<TestMain>(HeaderEditorWindows{
        .LineEditor = [this] { return Made(lineEditors); },
        .HeaderEditor = [this] { return Made(headerEditors); },
    });
  }

  // What the window's traps reported since the test began (or last asked).
  std::string TakeErrors() {
    std::string errors = ::testing::internal::GetCapturedStderr();
    ::testing::internal::CaptureStderr();
    return errors;
  }

  // ---- the database ----
  void Execute(const std::string& sql) { common::SqlServer()->Execute(sql); }
  vb::Variant Scalar(const std::string& sql) {
    auto rs = ado::Recordset::Create();
    rs->Open(sql, common::SqlServer());
    return rs->Eof() ? vb::Variant::Null() : rs->Fields(0).Value();
  }
  int32_t LastId() { return vb::CLng(Scalar("SELECT @@Identity as last")); }
  int32_t Journal(const char* descrit) {
    return vb::CLng(Scalar(std::string("SELECT tipo_diario_id FROM tbPOC_Diario_Tipos WHERE descrit = '") +
                           descrit + "'"));
  }
  int32_t Integration(const char* descrit) {
    return vb::CLng(Scalar(std::string("SELECT tipo_id FROM tbContactos_ContasCorrentes_Tipos WHERE "
                                       "descrit = '") + descrit + "'"));
  }
  // An entry made by someone, as other windows or modules leave them.
  int32_t AddEntry(const std::string& columns = "", const std::string& values = "") {
    Execute("INSERT INTO tbPOC_Dorvantos (data, created_by, valor" + columns +
            ") VALUES (CONVERT(DATETIME,'2024-05-10 09:15:00',102), 'ana', 0" + values + ")");
    return LastId();
  }
  int32_t AddLine(int32_t entry, const std::string& debito, const std::string& credito,
                  const std::string& more_columns = "", const std::string& more_values = "") {
    Execute("INSERT INTO tbPOC_Dorvantos_Details (dorvanto_id, debito, credito" + more_columns +
            ") VALUES (" + std::to_string(entry) + ", " + debito + ", " + credito + more_values + ")");
    return LastId();
  }

  // ---- settings ----
  void Remember(const char* name, const std::string& value) {
    registry::Store::Default().Update(
        [&](registry::Hive& hive) { hive.Create(kPocSettingsKey).Set(name, {registry::REG_SZ, value}); });
  }
  vb::Variant Remembered(const char* name) { return common::ObterValorString(kPocSettingsKey, name); }

  // ---- the window ----
  void Open(int32_t entry, int32_t line = 0) {
    form->MainClass = mainClass;
    form->CallBackClass = caller;
    form->DoOpen(entry, line);
  }
  forms::ToolbarButton& Button(forms::Toolbar& bar, const char* key) { return bar.Buttons()(key); }
  std::vector<std::string> Keys() {
    std::vector<std::string> keys;
    auto& items = form->ListView1.ListItems();
    for (int32_t i = 1; i <= items.Count(); ++i) keys.push_back(items(i).Key());
    return keys;
  }
  std::string Key(int32_t line) { return "#" + std::to_string(line); }

  std::shared_ptr<forms::ScriptedDesktop> desktop;
  std::shared_ptr<Recorder> caller;
  std::shared_ptr<Recorder> mainClass = std::make_shared<Recorder>();
  std::vector<std::shared_ptr<Recorder>> lineEditors;
  std::vector<std::shared_ptr<Recorder>> headerEditors;
  // What a line editor answers to DoRemove.
  bool lineRemoved = true;
  std::shared_ptr<TestMain> form;
  std::optional<dvtest::TestLedger> ledger_;

 private:
  vb::ObjectPtr Made(std::vector<std::shared_ptr<Recorder>>& made) {
    made.push_back(std::make_shared<Recorder>());
    made.back()->results["DoRemove"] = vb::Variant(lineRemoved);
    return made.back();
  }

  std::filesystem::path folder_;
  std::shared_ptr<forms::Desktop> previous_;
};

}  // namespace entry::testing
