#pragma once
// The line editor against a database of its own: the demo chart of accounts,
// sub-accounts, VAT rates and description codes; the shared connection opened on it;
// the settings and login the record finder connects with; the real reporter and record
// finder registered by ProgID; a scripted desktop; every statement recorded.
//
// The header editor is stood in for by a recording object that answers the members the
// line editor calls on it by name.

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "common/PasswordCodec.h"
#include "common/SqlServer.h"
#include "component/LoginState.h"
#include "lines/LineEditor.h"
#include "lines/frmMainDetails.h"
#include "platform/ado/Database.h"
#include "platform/ado/Recordset.h"
#include "platform/automation/ServerLoader.h"
#include "platform/automation/TestSandbox.h"
#include "platform/forms/Forms.h"
#include "platform/forms/ScriptedDesktop.h"
#include "platform/registry/Store.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace dvtest {

// A control of the header editor that only shows a text.
class ShownText : public vb::Object {
 public:
  std::string text;
  vb::Variant Invoke(const std::string& name, std::vector<vb::Variant>&) override { return Get(name); }
  vb::Variant Get(const std::string& name) override {
    if (name != "Text") throw vb::Error(vb::kErrMemberNotSupported);
    return vb::Variant(text);
  }
};

// What the line editor may call on the header editor that opened it, recorded.
class RecordingHeaderEditor : public vb::Object {
 public:
  std::vector<int32_t> filled;  // DoFillDorvantos, with the line's key
  int newLinesAsked = 0;        // DoInsertDorvanto
  std::shared_ptr<ShownText> debitos = std::make_shared<ShownText>();
  std::shared_ptr<ShownText> creditos = std::make_shared<ShownText>();

  vb::Variant Invoke(const std::string& name, std::vector<vb::Variant>& args) override {
    if (name == "DoFillDorvantos") {
      filled.push_back(vb::CLng(args.at(0)));
      return {};
    }
    if (name == "DoInsertDorvanto") {
      ++newLinesAsked;
      return {};
    }
    throw vb::Error(vb::kErrMemberNotSupported);
  }
  vb::Variant Get(const std::string& name) override {
    if (name == "FXTotal_Debitos") return vb::Variant(vb::ObjectPtr(debitos));
    if (name == "FXTotal_Creditos") return vb::Variant(vb::ObjectPtr(creditos));
    throw vb::Error(vb::kErrMemberNotSupported);
  }
};

inline constexpr const char* kSharedUser = "poc_dorvantos";
inline constexpr const char* kSharedPassword = "partilhada";
inline constexpr const char* kHostUser = "ana";
inline constexpr const char* kHostPassword = "s3nha";

class LinesTest : public ::testing::Test {
 protected:
  void SetUp() override {
    for (const char* server : {"libravelport.so", "librecordfinder.so"})
      ASSERT_EQ(automation::LoadInprocServer(LibraryPath(server)).registerServer(), automation::S_OK);
    desktop_ = std::make_shared<forms::ScriptedDesktop>();
    forms::Desktop::Install(desktop_);
    db_ = sandbox_.Directory() + "/poc.db";
    ado::CreateDatabase(db_, {{kSharedUser, kSharedPassword}, {kHostUser, kHostPassword}},
                        {.demoData = true, .passwordIterations = 10});
    WriteSettings();
    const ado::ConnectionPtr& shared = common::SqlServer();
    if (shared->State() == ado::adStateOpen) shared->Close();
    shared->Open(ado::EmbeddedConnectionString(db_, kSharedUser, kSharedPassword));
    shared->WillExecute = [this](ado::WillExecuteEvent& e) {
      statements_.push_back(e.Source);
      if (e.Source == cancelStatement_) e.adStatus = ado::adStatusCancel;
    };
    component::RecordLoggedUser(kHostUser, common::EncodePassword(kHostPassword));
    header_ = std::make_shared<RecordingHeaderEditor>();
  }

  void TearDown() override {
    for (forms::Form* form : std::vector<forms::Form*>(forms::LoadedForms())) form->Unload();
    common::SqlServer()->WillExecute = nullptr;
    common::SqlServer()->Close();
    forms::Desktop::Install(nullptr);
  }

  void WriteSettings() {
    registry::Store::Default().Update([&](registry::Hive& hive) {
      auto& key = hive.Create("HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\POC");
      key.Set("dtSecurityInfo", {1, "False"});
      key.Set("dtUser", {1, kSharedUser});
      key.Set("dtPassword", {1, common::EncodePassword(kSharedPassword)});
      key.Set("dtInitialCatalog", {1, "POC"});
      key.Set("dtDataSource", {1, "sqlite:" + db_});
    });
  }

  static vb::Variant Scalar(const std::string& sql) {
    ado::RecordsetPtr rs = ado::Recordset::Create();
    rs->Open(sql, common::SqlServer());
    vb::Variant value = rs->Eof() ? vb::Variant() : rs->Fields(0).Value();
    rs->Close();
    return value;
  }
  static int32_t Key(const std::string& sql) { return vb::CLng(Scalar(sql)); }
  static int32_t Count(const std::string& where) {
    return Key("SELECT count(*) FROM tbPOC_Dorvantos_Details WHERE " + where);
  }

  static int32_t NewEntry(int finalizado = 0) {
    common::SqlServer()->Execute(
        "INSERT INTO tbPOC_Dorvantos (data, dorvanto_no, created_by, valor, finalizado) VALUES "
        "(CONVERT(DATETIME,'2024-03-15 00:00:00',102), '17', 'ana', 0, " +
        std::to_string(finalizado) + ")");
    return Key("SELECT @@Identity as last");
  }
  static int32_t AddLine(int32_t entry, const std::string& debito, const std::string& credito,
                         const std::string& extra_columns = "", const std::string& extra_values = "") {
    common::SqlServer()->Execute(
        "INSERT INTO tbPOC_Dorvantos_Details (dorvanto_id, debito, credito" + extra_columns +
        ") VALUES (" + std::to_string(entry) + ", " + debito + ", " + credito + extra_values + ")");
    return Key("SELECT @@Identity as last");
  }
  static int32_t ContaId(const std::string& codigo) {
    return Key("SELECT conta_id FROM tbPOC_Contas WHERE codigo = '" + codigo + "'");
  }
  static int32_t SubContaId(const std::string& codigo_completo) {
    return Key("SELECT sub_conta_id FROM vwPOC_SubContas WHERE codigo_completo = '" +
               codigo_completo + "'");
  }

  // A fresh editor opened by the header editor stand-in.
  std::shared_ptr<lines::frmMainDetails> NewEditor() {
    auto editor = std::dynamic_pointer_cast<lines::frmMainDetails>(lines::NewLineEditor());
    editor->MainClass = header_;
    statements_.clear();  // only what the editors run from here on
    return editor;
  }
  std::shared_ptr<lines::frmMainDetails> InsertLine(int32_t entry) {
    auto editor = NewEditor();
    editor->DoInsert(entry);
    return editor;
  }

  std::vector<std::string> StatementsStartingWith(const std::string& prefix) const {
    std::vector<std::string> found;
    for (const std::string& s : statements_)
      if (s.rfind(prefix, 0) == 0) found.push_back(s);
    return found;
  }

  Sandbox sandbox_;
  std::shared_ptr<forms::ScriptedDesktop> desktop_;
  std::shared_ptr<RecordingHeaderEditor> header_;
  std::string db_;
  std::vector<std::string> statements_;
  std::string cancelStatement_;
};

}  // namespace dvtest
