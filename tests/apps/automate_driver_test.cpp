// dorvantos automate end to end: a script on a pipe, the component (or a stand-in for
// it) loaded by ProgID from the test's own settings store, a database of the test's own.

#include <gtest/gtest.h>
#include <stdlib.h>
#include <sys/wait.h>

#include <cstdio>
#include <filesystem>
#include <fstream>

#include "DriverProcess.h"
#include "common/PasswordCodec.h"
#include "platform/ado/Database.h"
#include "platform/registry/Registry.h"
#include "platform/registry/Store.h"

namespace {

using Json = nlohmann::json;
using dvtest::DriverProcess;
using dvtest::LibDirectory;

class AutomateTest : public ::testing::Test {
 protected:
  AutomateTest() {
    char pattern[] = "/tmp/dv-automate-XXXXXX";
    dir_ = mkdtemp(pattern);
    setenv("POC_ERROR_LOG", ErrorLog().c_str(), 1);
  }
  ~AutomateTest() override {
    unsetenv("POC_ERROR_LOG");
    std::error_code ignored;
    std::filesystem::remove_all(dir_, ignored);
  }

  std::string Registry() const { return dir_ + "/registry.reg"; }
  std::string Database() const { return dir_ + "/poc.db"; }
  std::string ErrorLog() const { return dir_ + "/errors.log"; }

  // dorvantos with the test's settings store; the exit status, output kept for messages.
  int Dorvantos(const std::string& arguments) {
    std::string line = "'" + dvtest::BinDirectory() + "/dorvantos' --registry '" + Registry() +
                       "' " + arguments + " 2>&1";
    FILE* pipe = popen(line.c_str(), "r");
    if (!pipe) return -1;
    char buffer[512];
    output_.clear();
    for (size_t n; (n = fread(buffer, 1, sizeof buffer, pipe)) > 0;) output_.append(buffer, n);
    int status = pclose(pipe);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  }

  void RegisterComponent() {
    ASSERT_EQ(Dorvantos("register '" + LibDirectory() + "/libpoc_dorvantos.so' '" + LibDirectory() +
                        "/libravelport.so'"),
              0)
        << output_;
  }
  // The stand-in under the component's ProgIDs, and the real reporter beside it.
  void RegisterStandIn() {
    ASSERT_EQ(Dorvantos("register '" + LibDirectory() + "/libdvtest_fake_component.so' '" +
                        LibDirectory() + "/libravelport.so'"),
              0)
        << output_;
  }

  // A database whose shared login is "poc_dorvantos", and the settings that reach it.
  // The stored password may be made wrong to keep the shared connection from opening.
  void CreateDatabaseAndSettings(const std::string& storedPassword = "partilhada") {
    ado::CreateOptions options;
    options.demoData = false;
    options.passwordIterations = 1000;
    ado::CreateDatabase(Database(), {{"poc_dorvantos", "partilhada"}, {"demo", "demo"}}, options);
    registry::Store(Registry()).Update([&](registry::Hive& hive) {
      registry::Key& key = hive.Create("HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\POC");
      key.Set("dtSecurityInfo", {registry::REG_SZ, "False"});
      key.Set("dtUser", {registry::REG_SZ, "poc_dorvantos"});
      key.Set("dtPassword", {registry::REG_SZ, common::EncodePassword(storedPassword)});
      key.Set("dtInitialCatalog", {registry::REG_SZ, "POC"});
      key.Set("dtDataSource", {registry::REG_SZ, "sqlite:" + Database()});
    });
  }

  DriverProcess Start() { return DriverProcess({"automate", "--registry", Registry()}); }

  std::vector<std::string> ErrorLogLines() const {
    std::vector<std::string> lines;
    std::ifstream in(ErrorLog());
    for (std::string line; std::getline(in, line);) lines.push_back(line);
    return lines;
  }

  std::string dir_;
  std::string output_;
};

Json Ok() { return Json{{"ok", true}}; }

// ---- the real component ----------------------------------------------------------------

TEST_F(AutomateTest, TheComponentLogsInAndTheScriptReadsAndWritesTheDatabase) {
  RegisterComponent();
  CreateDatabaseAndSettings();
  DriverProcess driver = Start();
  ASSERT_TRUE(driver.Started());

  auto refused = driver.Request({{"op", "login"}, {"class", "General"}, {"user", "demo"},
                                 {"password", "errada"}});
  EXPECT_EQ(refused.response, (Json{{"ok", true}, {"result", false}}));
  auto accepted = driver.Request({{"op", "login"}, {"class", "General"}, {"user", "demo"},
                                  {"password", "demo"}});
  EXPECT_EQ(accepted.response, (Json{{"ok", true}, {"result", true}}));
  EXPECT_TRUE(accepted.events.empty()) << accepted.events.front();

  auto insert = driver.Request(
      {{"op", "sql"},
       {"query", "INSERT INTO tbPOC_Dorvantos (data, created_by, valor, referencia) VALUES "
                 "(CONVERT(DATETIME, '2009.12.31', 102), 'demo', 12.5, 'Fatura nº 7')"}});
  EXPECT_EQ(insert.response, (Json{{"ok", true}, {"rows", Json::array()}}));
  auto rows = driver.Request(
      {{"op", "sql"},
       {"query", "SELECT dorvanto_id, data, created_by, valor, referencia, obs FROM tbPOC_Dorvantos"}});
  ASSERT_EQ(rows.response["ok"], true) << rows.response;
  ASSERT_EQ(rows.response["rows"].size(), 1u);
  const Json& row = rows.response["rows"][0];
  EXPECT_EQ(row["dorvanto_id"], 1);
  EXPECT_EQ(row["data"], "2009-12-31 00:00:00");
  EXPECT_EQ(row["created_by"], "demo");
  EXPECT_EQ(row["valor"], 12.5);
  EXPECT_EQ(row["referencia"], "Fatura nº 7");
  EXPECT_EQ(row["obs"], nullptr);

  auto bad = driver.Request({{"op", "sql"}, {"query", "SELECT * FROM tbNada"}});
  EXPECT_EQ(bad.response["ok"], false);
  EXPECT_TRUE(bad.response["error"].is_string());

  // The host's recordset reaches Registo of both classes.
  EXPECT_EQ(driver.Request({{"op", "open"}, {"class", "General"}, {"id", 1}}).response, Ok());
  EXPECT_EQ(driver.Request({{"op", "open"}, {"class", "GeneralDetails"}, {"id", 5}}).response, Ok());
  EXPECT_EQ(driver.Request({{"op", "forms"}}).response["ok"], true);

  driver.CloseInput();
  EXPECT_EQ(driver.Wait(), 0);
}

TEST_F(AutomateTest, MistakesGetAnErrorAndTheDriverGoesOn) {
  DriverProcess driver = Start();
  ASSERT_TRUE(driver.Started());
  for (const char* line : {"{\"op\":", "not json", "[1,2]", "{}", "{\"op\":\"fly\"}",
                           R"({"op":"state","form":"frmMain"})",
                           R"({"op":"state","form":7})",
                           R"({"op":"click","form":"frmMain","control":"cmdOK"})",
                           R"({"op":"answer","button":"ok"})",
                           R"({"op":"login","class":"Outra","user":"u","password":"p"})",
                           R"({"op":"open","class":"General","id":"um"})"}) {
    driver.Send(std::string(line));
    auto reply = driver.ReadReply();
    EXPECT_EQ(reply.response["ok"], false) << line << " -> " << reply.response;
    EXPECT_TRUE(reply.response["error"].is_string()) << line;
  }
  // Nothing registered: the class cannot be created, and the script is told why.
  auto login = driver.Request({{"op", "login"}, {"class", "General"}, {"user", "demo"},
                               {"password", "demo"}});
  EXPECT_EQ(login.response["ok"], false);
  EXPECT_NE(login.response["error"].get<std::string>().find("429"), std::string::npos);
  // Without settings there is no database to query.
  auto sql = driver.Request({{"op", "sql"}, {"query", "SELECT 1 AS um"}});
  EXPECT_EQ(sql.response["ok"], false);
  EXPECT_NE(sql.response["error"].get<std::string>().find("dtSecurityInfo"), std::string::npos);

  EXPECT_EQ(driver.Request({{"op", "forms"}}).response, (Json{{"ok", true}, {"forms", Json::array()}}));
  driver.CloseInput();
  EXPECT_EQ(driver.Wait(), 0);
}

// The shared connection's stored password is wrong, so Login opens only the user's own
// connection, and the first statement of the component finds the shared one closed.
TEST_F(AutomateTest, TheReconnectDialogIsWorkedAsAModalWindow) {
  RegisterComponent();
  CreateDatabaseAndSettings("errada");
  DriverProcess driver = Start();
  ASSERT_TRUE(driver.Started());
  EXPECT_EQ(driver.Request({{"op", "login"}, {"class", "General"}, {"user", "demo"},
                            {"password", "demo"}})
                .response,
            (Json{{"ok", true}, {"result", true}}));

  driver.Send(Json{{"op", "new"}, {"class", "General"}});
  Json first = driver.Read();
  if (first == Ok()) GTEST_SKIP() << "NovoRegisto runs no statement yet";
  EXPECT_EQ(first, (Json{{"event", "modal"}, {"form", "frmSQLServer"}, {"instance", 1}}));
  auto dialog = driver.Request({{"op", "state"}, {"form", "frmSQLServer"}});
  EXPECT_EQ(dialog.response["caption"], "Ligação ao Servidor de Dados (SQL)");
  EXPECT_EQ(dialog.response["controls"]["Command1"]["caption"], "&Ligar ao servidor SQL");
  EXPECT_EQ(dialog.response["controls"]["Label2(0)"]["caption"],
            "Possivelmente o servidor SQL está desligado ou inacessível.");

  // Still refused: the dialog comes back, as a new window of its own.
  driver.Send(Json{{"op", "click"}, {"form", "frmSQLServer"}, {"control", "Command1"}});
  EXPECT_EQ(driver.Read()["ok"], true);
  EXPECT_EQ(driver.Read(), (Json{{"event", "modal"}, {"form", "frmSQLServer"}, {"instance", 2}}));

  // Put right meanwhile: the next try connects and NovoRegisto goes on to its answer.
  registry::Store(Registry()).Update([](registry::Hive& hive) {
    hive.Find("HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\POC")
        ->Set("dtPassword", {registry::REG_SZ, common::EncodePassword("partilhada")});
  });
  driver.Send(Json{{"op", "click"}, {"form", "frmSQLServer"}, {"control", "Command1"}});
  EXPECT_EQ(driver.Read()["ok"], true);
  DriverProcess::Reply rest = driver.ReadReply();
  EXPECT_EQ(rest.response, Ok());
  for (const Json& event : rest.events) EXPECT_NE(event["event"], "modal") << event;

  driver.CloseInput();
  EXPECT_EQ(driver.Wait(), 0);
}

// ---- the stand-in: boxes, modal windows, menus, reports, call-backs ---------------------

TEST_F(AutomateTest, AMessageBoxWaitsForAnAnswerThatItOffers) {
  RegisterStandIn();
  DriverProcess driver = Start();
  ASSERT_TRUE(driver.Started());

  driver.Send(Json{{"op", "login"}, {"class", "General"}, {"user", "box"}, {"password", "x"}});
  EXPECT_EQ(driver.Read(), (Json{{"event", "msgbox"},
                                 {"text", "Entrar como box?"},
                                 {"title", "Sistema de Segurança"},
                                 {"icon", "question"},
                                 {"buttons", "yesnocancel"},
                                 {"system", false}}));
  // Anything but a fitting answer is refused, and the box goes on waiting.
  for (const Json& wrong : {Json{{"op", "forms"}}, Json{{"op", "answer"}, {"button", "ok"}},
                            Json{{"op", "answer"}, {"text", "sim"}}}) {
    driver.Send(wrong);
    EXPECT_EQ(driver.Read()["ok"], false) << wrong;
  }
  driver.Send(std::string("{broken"));
  EXPECT_EQ(driver.Read()["ok"], false);
  driver.Send(Json{{"op", "answer"}, {"button", "yes"}});
  EXPECT_EQ(driver.Read(), Ok());
  EXPECT_EQ(driver.Read(), (Json{{"ok", true}, {"result", true}}));

  // The same class object is asked again; No refuses.
  driver.Send(Json{{"op", "login"}, {"class", "General"}, {"user", "box"}, {"password", "x"}});
  EXPECT_EQ(driver.Read()["event"], "msgbox");
  driver.Send(Json{{"op", "answer"}, {"button", "no"}});
  EXPECT_EQ(driver.Read(), Ok());
  EXPECT_EQ(driver.Read(), (Json{{"ok", true}, {"result", false}}));

  driver.CloseInput();
  EXPECT_EQ(driver.Wait(), 0);
}

TEST_F(AutomateTest, AnInputBoxTakesATextOrCancel) {
  RegisterStandIn();
  DriverProcess driver = Start();
  ASSERT_TRUE(driver.Started());
  const Json login{{"op", "login"}, {"class", "GeneralDetails"}, {"user", "input"}, {"password", "x"}};

  driver.Send(login);
  EXPECT_EQ(driver.Read(), (Json{{"event", "inputbox"},
                                 {"prompt", "Palavra-passe"},
                                 {"title", "Sistema de Segurança"},
                                 {"default", "abc"}}));
  driver.Send(Json{{"op", "answer"}, {"button", "ok"}});
  EXPECT_EQ(driver.Read()["ok"], false);
  driver.Send(Json{{"op", "answer"}, {"text", "segredo"}});
  EXPECT_EQ(driver.Read(), Ok());
  EXPECT_EQ(driver.Read(), (Json{{"ok", true}, {"result", true}}));

  driver.Send(login);
  EXPECT_EQ(driver.Read()["event"], "inputbox");
  driver.Send(Json{{"op", "answer"}, {"cancel", true}});
  EXPECT_EQ(driver.Read(), Ok());
  EXPECT_EQ(driver.Read(), (Json{{"ok", true}, {"result", false}}));

  driver.CloseInput();
  EXPECT_EQ(driver.Wait(), 0);
}

TEST_F(AutomateTest, AModalWindowIsWorkedUntilItClosesThenItsRequestAnswers) {
  RegisterStandIn();
  DriverProcess driver = Start();
  ASSERT_TRUE(driver.Started());

  driver.Send(Json{{"op", "new"}, {"class", "General"}});
  EXPECT_EQ(driver.Read(), (Json{{"event", "modal"}, {"form", "frmFake"}, {"instance", 1}}));

  auto forms = driver.Request({{"op", "forms"}});
  EXPECT_EQ(forms.response["forms"], Json::parse(R"([{"form":"frmFake","instance":1,
                                                       "caption":"Lançamento","visible":true}])"));

  auto typed = driver.Request({{"op", "type"}, {"form", "frmFake"}, {"control", "Text1"},
                               {"text", "Caixa 1"}});
  EXPECT_EQ(typed.response["ok"], true) << typed.response;
  EXPECT_EQ(typed.response["focus"], "Text1");
  auto state = driver.Request({{"op", "state"}, {"form", "frmFake"}, {"instance", 1}});
  EXPECT_EQ(state.response["controls"]["Text1"]["text"], "Caixa 1");
  EXPECT_EQ(state.response["controls"]["cmdOK"]["caption"], "&OK");
  EXPECT_EQ(state.response["focus"], "Text1");
  EXPECT_EQ(state.response["mousePointer"], "default");

  // Windows and controls that are not there.
  EXPECT_EQ(driver.Request({{"op", "state"}, {"form", "frmFake"}, {"instance", 2}}).response["ok"], false);
  EXPECT_EQ(driver.Request({{"op", "click"}, {"form", "frmFake"}, {"control", "cmdNada"}}).response["ok"],
            false);
  EXPECT_EQ(driver.Request({{"op", "key"}, {"form", "frmFake"}, {"control", "Text1"}, {"key", "F13"}})
                .response["ok"],
            false);

  // A right click pops the menu up; the item chosen reports, and the report goes on to
  // the real reporter.
  driver.Send(Json{{"op", "rightclick"}, {"form", "frmFake"}, {"control", "Text1"}});
  Json menu = driver.Read();
  EXPECT_EQ(menu["event"], "menu");
  EXPECT_EQ(menu["menu"], "mnPopup");
  ASSERT_EQ(menu["items"].size(), 2u);
  EXPECT_EQ(menu["items"][1], (Json{{"name", "mnRelatar"}, {"caption", "&Relatar"},
                                    {"enabled", true}, {"visible", true}}));
  driver.Send(Json{{"op", "answer"}, {"item", "mnNada"}});
  EXPECT_EQ(driver.Read()["ok"], false);
  driver.Send(Json{{"op", "answer"}, {"item", "mnRelatar"}});
  EXPECT_EQ(driver.Read(), Ok());
  EXPECT_EQ(driver.Read(), (Json{{"event", "report"}, {"product", "POC Dorvantos"},
                                 {"project", "Dorvantos"}, {"module", "frmFake"},
                                 {"procedure", "mnRelatar_Click"}, {"message", "Caixa 1"}}));
  // The reporter shows it to the person as well, after logging it.
  EXPECT_EQ(driver.Read(), (Json{{"event", "notice"}, {"title", "POC Dorvantos"},
                                 {"text", "frmFake.mnRelatar_Click: Caixa 1"}}));
  EXPECT_EQ(driver.Read()["ok"], true);  // the right click's own response
  std::vector<std::string> logged = ErrorLogLines();
  ASSERT_EQ(logged.size(), 1u);
  EXPECT_NE(logged[0].find("mnRelatar_Click"), std::string::npos);

  // OK asks; No keeps the window.
  driver.Send(Json{{"op", "click"}, {"form", "frmFake"}, {"control", "cmdOK"}});
  EXPECT_EQ(driver.Read(), (Json{{"event", "msgbox"}, {"text", "Gravar Caixa 1?"},
                                 {"title", "Lançamento"}, {"icon", "question"},
                                 {"buttons", "yesno"}, {"system", false}}));
  driver.Send(Json{{"op", "answer"}, {"button", "no"}});
  EXPECT_EQ(driver.Read(), Ok());
  Json clicked = driver.Read();
  EXPECT_EQ(clicked["ok"], true);
  EXPECT_EQ(clicked["focus"], "cmdOK");

  // Enter clicks the default button; Yes unloads the window, which calls the host back,
  // and then the request that showed it answers.
  driver.Send(Json{{"op", "key"}, {"form", "frmFake"}, {"control", "Text1"}, {"key", "Enter"}});
  EXPECT_EQ(driver.Read()["event"], "msgbox");
  driver.Send(Json{{"op", "answer"}, {"button", "yes"}});
  EXPECT_EQ(driver.Read(), Ok());
  EXPECT_EQ(driver.Read(), (Json{{"event", "remotekey"}, {"id", 42}}));
  Json keyed = driver.Read();
  EXPECT_EQ(keyed["ok"], true);
  EXPECT_EQ(keyed["focus"], nullptr);
  EXPECT_EQ(driver.Read(), Ok());  // "new"

  EXPECT_EQ(driver.Request({{"op", "forms"}}).response["forms"], Json::array());
  driver.CloseInput();
  EXPECT_EQ(driver.Wait(), 0);
}

TEST_F(AutomateTest, InputThatEndsWhileABoxAndAWindowWaitClosesThemAndEndsWell) {
  RegisterStandIn();
  DriverProcess driver = Start();
  ASSERT_TRUE(driver.Started());

  driver.Send(Json{{"op", "new"}, {"class", "General"}});
  EXPECT_EQ(driver.Read()["event"], "modal");
  driver.Send(Json{{"op", "click"}, {"form", "frmFake"}, {"control", "cmdOK"}});
  EXPECT_EQ(driver.Read()["event"], "msgbox");
  driver.CloseInput();

  // The box is closed (No, as it offers no Cancel), the click answers, the window is
  // closed by its close box, and the host hears of it before "new" answers.
  EXPECT_EQ(driver.Read()["ok"], true);
  EXPECT_EQ(driver.Read(), (Json{{"event", "remotekey"}, {"id", 42}}));
  EXPECT_EQ(driver.Read(), Ok());
  EXPECT_FALSE(driver.ReadLine());
  EXPECT_EQ(driver.Wait(), 0);
}

TEST_F(AutomateTest, OpenHandsTheClassARecordsetOfTheDriversOwnConnection) {
  RegisterStandIn();
  CreateDatabaseAndSettings();
  DriverProcess driver = Start();
  ASSERT_TRUE(driver.Started());
  for (const char* reference : {"primeiro", "segundo", "terceiro"}) {
    auto insert = driver.Request({{"op", "sql"},
                                  {"query", std::string("INSERT INTO tbPOC_Dorvantos (referencia) "
                                                        "VALUES ('") + reference + "')"}});
    ASSERT_EQ(insert.response["ok"], true) << insert.response;
  }

  EXPECT_EQ(driver.Request({{"op", "open"}, {"class", "General"}, {"id", 2}}).response, Ok());
  auto forms = driver.Request({{"op", "forms"}});
  ASSERT_EQ(forms.response["forms"].size(), 1u);
  EXPECT_EQ(forms.response["forms"][0]["caption"], "segundo 3");

  // The window is worked like any other, and closing it calls the host back.
  auto closed = driver.Request({{"op", "close"}, {"form", "frmFake"}});
  EXPECT_EQ(closed.events, std::vector<Json>{(Json{{"event", "remotekey"}, {"id", 42}})});
  EXPECT_EQ(closed.response["closed"], true);
  EXPECT_EQ(driver.Request({{"op", "close"}, {"form", "frmFake"}}).response["ok"], false);

  driver.CloseInput();
  EXPECT_EQ(driver.Wait(), 0);
}

}  // namespace
