// The component's data access on a live PostgreSQL against the same statements sent
// straight through libpq, in the same run and on the same database:
//
//   SingleRow/*   10,000 account lookups by key. The component sends each through
//                 Connection::Execute with the data environment's handlers on the shared
//                 connection: the probe "SELECT @@TRANCOUNT as flTrans" before every
//                 statement, DoEvents after it. libpq sends the statements as the ODBC
//                 engine translates them (translated once, beforehand), with the probe
//                 before each and without it.
//   Finalize/*    the header editor's DoFinalizar on an entry of 1,000 lines, against a
//                 replay through libpq of the statements it sent, recorded from the
//                 connection's WillExecute during one finalization, translated, and sent
//                 inside BEGIN/COMMIT, with and without the probes.
//
// The server is the one $POC_BENCH_PG_ENV names (an env file of scripts/pg-test-server),
// else a throwaway one this program starts and stops. Between finalizations the entry
// is put back as it was and its tables vacuumed, outside the timing, so every run,
// the component's and the replays, starts from the same rows.

#include <benchmark/benchmark.h>
#include <libpq-fe.h>
#include <spawn.h>
#include <stdlib.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>
#include <tuple>
#include <vector>

#include "common/SqlServer.h"
#include "common/modCode.h"
#include "component/Data.h"
#include "component/LoginState.h"
#include "entry/frmMain.h"
#include "platform/ado/Connection.h"
#include "platform/ado/PostgresDialect.h"
#include "platform/ado/Recordset.h"
#include "platform/forms/ScriptedDesktop.h"
#include "platform/registry/Store.h"
#include "platform/vb/Conversions.h"
#include "support/TestLedger.h"

extern char** environ;

namespace {

constexpr int kStatements = 10000;
constexpr int kAccounts = 200;  // keys cycle over the demo chart, as lookups would
constexpr int kLines = 1000;
constexpr const char* kProbe = "SELECT @@TRANCOUNT as flTrans";
constexpr const char* kUser = "bench";
constexpr const char* kPassword = "bench";
constexpr const char* kEntryDate = "CONVERT(DATETIME,'2024-05-10 09:15:00',102)";

std::string Lookup(int i) {
  return "SELECT * FROM tbPOC_Contas WHERE conta_id = " + std::to_string(1 + i % kAccounts);
}

std::string Text(const std::string& value) { return common::SqlValue(vb::Variant(value), common::kSqlText); }

// Runs scripts/pg-test-server of the source tree; its messages go to standard error,
// away from the benchmark's table.
void ServerScript(const char* command, const std::string& dir) {
  const std::string script = std::string(DV_SOURCE_DIR) + "/scripts/pg-test-server";
  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  posix_spawn_file_actions_adddup2(&actions, STDERR_FILENO, STDOUT_FILENO);
  std::vector<char*> argv{const_cast<char*>(script.c_str()), const_cast<char*>(command),
                          const_cast<char*>(dir.c_str()), nullptr};
  pid_t pid = 0;
  int rc = posix_spawn(&pid, script.c_str(), &actions, nullptr, argv.data(), environ);
  posix_spawn_file_actions_destroy(&actions);
  int status = 0;
  if (rc != 0 || ::waitpid(pid, &status, 0) != pid || !WIFEXITED(status) || WEXITSTATUS(status) != 0)
    throw std::runtime_error(std::string("pg-test-server ") + command + " failed");
}

struct PgConnCloser {
  void operator()(PGconn* c) const { PQfinish(c); }
};
using PgConn = std::unique_ptr<PGconn, PgConnCloser>;

// Sends one statement and reads every value of its rows, as the component's recordsets
// do. Returns the rows, or an error text.
struct Sent {
  int rows = 0;
  std::string error;
};
Sent Send(PGconn* conn, const std::string& sql) {
  PGresult* r = PQexec(conn, sql.c_str());
  Sent sent;
  const ExecStatusType status = PQresultStatus(r);
  if (status == PGRES_TUPLES_OK) {
    sent.rows = PQntuples(r);
    const int columns = PQnfields(r);
    for (int row = 0; row < sent.rows; ++row)
      for (int c = 0; c < columns; ++c) benchmark::DoNotOptimize(PQgetvalue(r, row, c));
  } else if (status != PGRES_COMMAND_OK) {
    sent.error = PQresultErrorMessage(r);
    if (sent.error.empty()) sent.error = PQerrorMessage(conn);
  }
  PQclear(r);
  return sent;
}

// A folder of its own under the temporary folder, removed with this object.
struct TempFolder {
  TempFolder() {
    std::string pattern = (std::filesystem::temp_directory_path() / "dv-bench-pg-XXXXXX").string();
    if (!::mkdtemp(pattern.data())) throw std::runtime_error("cannot make a temporary folder");
    path = pattern;
  }
  ~TempFolder() {
    std::error_code ignored;
    std::filesystem::remove_all(path, ignored);
  }
  std::filesystem::path path;
};

// A server started with scripts/pg-test-server, stopped (and its files removed) with
// this object, also when what follows its start fails.
class ThrowawayServer {
 public:
  explicit ThrowawayServer(std::string dir) : dir_(std::move(dir)) {
    try {
      ServerScript("start", dir_);
    } catch (const std::exception&) {
      Stop();
      throw;
    }
  }
  ~ThrowawayServer() { Stop(); }
  std::string EnvFile() const { return dir_ + "/env"; }

 private:
  void Stop() noexcept {
    try {
      ServerScript("stop", dir_);
    } catch (const std::exception&) {
      // Its folder under /tmp says where it was; nothing more can be done here.
    }
  }
  std::string dir_;
};

// A window or host object that answers every call with Empty.
class Silent : public vb::Object {
 public:
  vb::Variant Invoke(const std::string&, std::vector<vb::Variant>&) override { return {}; }
  void Let(const std::string&, const vb::Variant&) override {}
};

// The server, the benchmark's database on it, the component logged in on the shared
// connection with the data environment's handlers, and an entry of kLines lines.
class Environment {
 public:
  Environment() {
    std::string envFile;
    if (const char* named = std::getenv("POC_BENCH_PG_ENV"); named && *named) {
      envFile = named;
    } else {
      ownServer_.emplace((folder_.path / "pg").string());
      envFile = ownServer_->EnvFile();
    }
    // The tests' ledger helper finds its server through this variable: a fresh
    // database with the demo data on it, dropped again at the end.
    ::setenv("POC_TEST_PG_ENV", envFile.c_str(), 1);
    server_ = *dvtest::PostgresUnderTest();
    ledger_.emplace(folder_.path.string(), std::vector<ado::Login>{{kUser, kPassword}},
                    ado::CreateOptions{.demoData = true});

    registry::Store::SetDefaultPath((folder_.path / "registry.reg").string());
    registry::Store::Default().Update([](registry::Hive& hive) { hive.Create(entry::kPocSettingsKey); });
    desktop = std::make_shared<forms::ScriptedDesktop>();
    forms::Desktop::Install(desktop);
    component::Data();  // the probe and DoEvents on the shared connection
    common::SqlServer()->Open(ledger_->ConnectionString(kUser, kPassword));
    component::RecordLoggedUser(kUser, kPassword);
    component::SetLoggedIn();

    userConn_ = Connect(kUser, kPassword);
    adminConn_ = Connect(server_.user, server_.password);
    MakeEntry();
  }

  // The database is dropped, then the server stopped, as the members go.
  ~Environment() {
    if (common::SqlServer()->State() == ado::adStateOpen) common::SqlServer()->Close();
    userConn_.reset();
    adminConn_.reset();
    registry::Store::SetDefaultPath("");
  }

  PGconn* User() const { return userConn_.get(); }

  // The entry as it was before any finalization, its tables vacuumed so that no run
  // pays for the dead rows of the ones before.
  void ResetEntry() {
    const std::string id = std::to_string(entry_);
    Execute("UPDATE tbPOC_Dorvantos_Details SET reg_no = NULL, ano = NULL, codigo_completo = NULL, conta = NULL, "
            "conta_descrit = NULL, sub_conta = NULL, sub_conta_descrit = NULL WHERE dorvanto_id = " + id);
    Execute(std::string("UPDATE tbPOC_Dorvantos SET finalizado = 0, valor = 0, data = ") + kEntryDate +
            " WHERE dorvanto_id = " + id);
    Execute("UPDATE tbPOC_Contadores SET contador = 1 WHERE nome = 'reg_no'");
    for (const char* table : {"tbpoc_dorvantos_details", "tbpoc_dorvantos", "tbpoc_contadores"}) {
      Sent sent = Send(adminConn_.get(), std::string("VACUUM ANALYZE ") + table);
      if (!sent.error.empty()) throw std::runtime_error(sent.error);
    }
  }

  // A header editor showing the entry, as the host's classes leave it.
  std::shared_ptr<entry::frmMain> OpenEntry() {
    auto form = std::make_shared<entry::frmMain>(entry::HeaderEditorWindows{
        .LineEditor = [] { return std::make_shared<Silent>(); },
        .HeaderEditor = [] { return std::make_shared<Silent>(); },
    });
    form->MainClass = hostObject_;
    form->CallBackClass = hostObject_;
    form->DoOpen(entry_);
    return form;
  }

  bool EntryIsFinal() {
    return vb::CLng(Scalar("SELECT finalizado FROM tbPOC_Dorvantos WHERE dorvanto_id = " + std::to_string(entry_))) ==
           1;
  }

  // The statements one finalization sends, in the order the server sees them (each
  // probe before its statement), in the component's dialect.
  const std::vector<std::string>& FinalizationStatements() {
    if (!recorded_.empty()) return recorded_;
    ResetEntry();
    auto form = OpenEntry();
    const ado::ConnectionPtr& conn = common::SqlServer();
    auto probing = conn->WillExecute;
    conn->WillExecute = [&](ado::WillExecuteEvent& event) {
      probing(event);
      recorded_.push_back(event.Source);
    };
    const bool finalized = form->DoFinalizar();
    conn->WillExecute = probing;
    form.reset();
    if (!finalized || !EntryIsFinal()) throw std::runtime_error("the recorded finalization did not finalize");
    return recorded_;
  }

  std::shared_ptr<forms::ScriptedDesktop> desktop;

 private:
  PgConn Connect(const std::string& user, const std::string& password) {
    const char* keys[] = {"host", "port", "dbname", "user", "password", nullptr};
    const char* values[] = {server_.host.c_str(), server_.port.c_str(), ledger_->Catalog().c_str(), user.c_str(),
                            password.c_str(), nullptr};
    PgConn conn(PQconnectdbParams(keys, values, 0));
    if (PQstatus(conn.get()) != CONNECTION_OK)
      throw std::runtime_error(std::string("libpq: ") + PQerrorMessage(conn.get()));
    return conn;
  }

  void Execute(const std::string& sql) { common::SqlServer()->Execute(sql); }
  vb::Variant Scalar(const std::string& sql) {
    auto rs = ado::Recordset::Create();
    rs->Open(sql, common::SqlServer());
    return rs->Eof() ? vb::Variant::Null() : rs->Fields(0).Value();
  }

  // An open entry of the journal "Vendas" made by the logged user, with kLines balanced
  // lines over two sub-accounts, and both counters present, so that numbering takes the
  // path every finalization but a database's first one takes.
  void MakeEntry() {
    const std::string journal = std::to_string(
        vb::CLng(Scalar("SELECT tipo_diario_id FROM tbPOC_Diario_Tipos WHERE descrit = " + Text("Vendas"))));
    Execute(std::string("INSERT INTO tbPOC_Dorvantos (data, created_by, valor, tipo_diario_id) VALUES (") +
            kEntryDate + ", " + Text(kUser) + ", 0, " + journal + ")");
    entry_ = vb::CLng(Scalar("SELECT @@Identity as last"));
    struct Side {
      std::string account, sub, debito, credito;
    };
    std::vector<Side> sides;
    for (auto [code, debito, credito] : {std::tuple{"11001", "10", "0"}, std::tuple{"12002", "0", "10"}}) {
      const std::string sub = std::to_string(
          vb::CLng(Scalar("SELECT sub_conta_id FROM vwPOC_SubContas WHERE codigo_completo = " + Text(code))));
      const std::string account = std::to_string(
          vb::CLng(Scalar("SELECT conta_id FROM vwPOC_SubContas WHERE sub_conta_id = " + sub)));
      sides.push_back({account, sub, debito, credito});
    }
    for (int i = 0; i < kLines; ++i) {
      const Side& side = sides[i % 2];
      Execute("INSERT INTO tbPOC_Dorvantos_Details (dorvanto_id, debito, credito, conta_id, sub_conta_id) VALUES (" +
              std::to_string(entry_) + ", " + side.debito + ", " + side.credito + ", " + side.account + ", " +
              side.sub + ")");
    }
    Execute("INSERT INTO tbPOC_Contadores (nome, contador) VALUES ('reg_no', 1)");
    Execute("INSERT INTO tbPOC_Contadores (nome, contador) VALUES ('ano', 2024)");
  }

  TempFolder folder_;
  std::optional<ThrowawayServer> ownServer_;
  dvtest::PgServer server_;
  std::optional<dvtest::TestLedger> ledger_;
  PgConn userConn_, adminConn_;
  int32_t entry_ = 0;
  vb::ObjectPtr hostObject_ = std::make_shared<Silent>();
  std::vector<std::string> recorded_;
};

// Made by the first benchmark that runs; a setup that fails skips them all with its
// reason.
Environment* Env(benchmark::State& state) {
  static std::string failure;
  static std::unique_ptr<Environment> env = [] {
    try {
      return std::make_unique<Environment>();
    } catch (const std::exception& e) {
      failure = e.what();
      return std::unique_ptr<Environment>();
    }
  }();
  if (!env) state.SkipWithError(failure.c_str());
  return env.get();
}

std::vector<std::string> Translated(const std::vector<std::string>& statements, int tranCount, bool withProbe) {
  std::vector<std::string> out;
  for (const auto& sql : statements)
    if (withProbe || sql != kProbe) out.push_back(ado::sql::TranslateToPostgres(sql, tranCount).sql);
  return out;
}

// ---- 10,000 single-row statements ----

void SingleRow_Component(benchmark::State& state) {
  if (!Env(state)) return;
  const ado::ConnectionPtr& conn = common::SqlServer();
  for (auto _ : state) {
    for (int i = 0; i < kStatements; ++i) {
      auto rs = conn->Execute(Lookup(i));
      benchmark::DoNotOptimize(rs->Fields("descrit").Value());
    }
  }
  state.SetItemsProcessed(state.iterations() * kStatements);
}

void SingleRow_Libpq(benchmark::State& state, bool withProbe) {
  Environment* env = Env(state);
  if (!env) return;
  std::vector<std::string> lookups;
  for (int i = 0; i < kAccounts; ++i) lookups.push_back(Lookup(i));
  lookups = Translated(lookups, 0, false);
  const std::string probe = ado::sql::TranslateToPostgres(kProbe, 0).sql;
  for (int i = 0; i < kAccounts; ++i) {
    Sent sent = Send(env->User(), lookups[i]);
    if (sent.rows != 1) return state.SkipWithError(("the lookup found no single row: " + sent.error).c_str());
  }
  for (auto _ : state) {
    for (int i = 0; i < kStatements; ++i) {
      if (withProbe) Send(env->User(), probe);
      Send(env->User(), lookups[i % kAccounts]);
    }
  }
  state.SetItemsProcessed(state.iterations() * kStatements);
}

// ---- one finalization of 1,000 lines ----

void Finalize_Component(benchmark::State& state) {
  Environment* env = Env(state);
  if (!env) return;
  const size_t statements = env->FinalizationStatements().size();
  for (auto _ : state) {
    state.PauseTiming();
    env->ResetEntry();
    auto form = env->OpenEntry();
    env->desktop->messages.clear();
    state.ResumeTiming();
    const bool finalized = form->DoFinalizar();
    state.PauseTiming();
    form.reset();
    if (!finalized || !env->desktop->messages.empty() || !env->EntryIsFinal())
      return state.SkipWithError("the finalization did not finalize the entry");
    state.ResumeTiming();
  }
  state.counters["statements"] = static_cast<double>(statements);
}

// The recorded statements, those before the component's BeginTrans included, all in
// one transaction: the replay's best case.
void Finalize_Libpq(benchmark::State& state, bool withProbe) {
  Environment* env = Env(state);
  if (!env) return;
  const std::vector<std::string> replay = Translated(env->FinalizationStatements(), 1, withProbe);
  for (auto _ : state) {
    state.PauseTiming();
    env->ResetEntry();
    state.ResumeTiming();
    std::string error = Send(env->User(), "BEGIN").error;
    for (size_t i = 0; i < replay.size() && error.empty(); ++i) error = Send(env->User(), replay[i]).error;
    if (error.empty()) error = Send(env->User(), "COMMIT").error;
    if (!error.empty()) {
      Send(env->User(), "ROLLBACK");
      return state.SkipWithError(("the replay failed: " + error).c_str());
    }
  }
  state.counters["statements"] = static_cast<double>(replay.size());
}

BENCHMARK(SingleRow_Component)->Unit(benchmark::kMillisecond)->UseRealTime();
BENCHMARK_CAPTURE(SingleRow_Libpq, WithProbe, true)->Unit(benchmark::kMillisecond)->UseRealTime();
BENCHMARK_CAPTURE(SingleRow_Libpq, NoProbe, false)->Unit(benchmark::kMillisecond)->UseRealTime();
BENCHMARK(Finalize_Component)->Unit(benchmark::kMillisecond)->UseRealTime()->Iterations(3);
BENCHMARK_CAPTURE(Finalize_Libpq, WithProbe, true)->Unit(benchmark::kMillisecond)->UseRealTime()->Iterations(3);
BENCHMARK_CAPTURE(Finalize_Libpq, NoProbe, false)->Unit(benchmark::kMillisecond)->UseRealTime()->Iterations(3);

}  // namespace
