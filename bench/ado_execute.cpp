// 10,000 single-row statements through Connection::Execute, each preceded by the
// reconnect probe the data environment runs in WillExecute ("SELECT @@TRANCOUNT as
// flTrans"), against the same lookups on bare SQLite (prepare, step, read, finalize).
// The ratio of the two is the price of the ADO layer: translation, events, the probe
// and Variant rows.

#include <benchmark/benchmark.h>
#include <sqlite3.h>
#include <unistd.h>

#include <filesystem>
#include <string>

#include "platform/ado/Connection.h"
#include "platform/ado/Database.h"
#include "platform/ado/Recordset.h"

namespace {

constexpr int kStatements = 10000;
constexpr int kAccounts = 200;  // keys cycle over the demo chart, as lookups would

const std::string& DatabasePath() {
  static const std::string path = [] {
    auto p = std::filesystem::temp_directory_path() / ("dv-bench-ado-" + std::to_string(::getpid()) + ".db");
    ado::CreateOptions options;
    options.passwordIterations = 1000;
    options.replaceExisting = true;
    ado::CreateDatabase(p.string(), {{"bench", "bench"}}, options);
    return p.string();
  }();
  return path;
}

std::string Lookup(int i) {
  return "SELECT * FROM tbPOC_Contas WHERE conta_id = " + std::to_string(1 + i % kAccounts);
}

void ThroughConnection(benchmark::State& state) {
  auto conn = ado::Connection::Create();
  conn->Open(ado::EmbeddedConnectionString(DatabasePath(), "bench", "bench"));
  bool probing = false;
  conn->WillExecute = [&](ado::WillExecuteEvent&) {
    if (probing) return;
    probing = true;
    conn->Execute("SELECT @@TRANCOUNT as flTrans");
    probing = false;
  };
  for (auto _ : state) {
    for (int i = 0; i < kStatements; ++i) {
      auto rs = conn->Execute(Lookup(i));
      benchmark::DoNotOptimize(rs->Fields("descrit").Value());
    }
  }
  state.SetItemsProcessed(state.iterations() * kStatements);
}

void BareSqlite(benchmark::State& state) {
  sqlite3* db = nullptr;
  sqlite3_open_v2(DatabasePath().c_str(), &db, SQLITE_OPEN_READWRITE, nullptr);
  for (auto _ : state) {
    for (int i = 0; i < kStatements; ++i) {
      std::string sql = Lookup(i);
      sqlite3_stmt* stmt = nullptr;
      sqlite3_prepare_v2(db, sql.c_str(), static_cast<int>(sql.size()), &stmt, nullptr);
      while (sqlite3_step(stmt) == SQLITE_ROW)
        for (int c = 0; c < sqlite3_column_count(stmt); ++c) benchmark::DoNotOptimize(sqlite3_column_text(stmt, c));
      sqlite3_finalize(stmt);
    }
  }
  state.SetItemsProcessed(state.iterations() * kStatements);
  sqlite3_close(db);
}

BENCHMARK(ThroughConnection)->Unit(benchmark::kMillisecond);
BENCHMARK(BareSqlite)->Unit(benchmark::kMillisecond);

}  // namespace
