// The account finder's tree for a generated chart of 20,000 accounts (and of 5,000): the query, one
// node per account placed under its parent by key, and the progress bar stepping.
// Dense: every code extends its parent by one character, the first try finds it.
// SkippedLevel: every code below the classes extends its parent by two characters, so
// each account fails its first try and is placed by the second. Both should grow
// linearly with the chart; compare the two for the price of a failed try.

#include <benchmark/benchmark.h>
#include <unistd.h>

#include <deque>
#include <filesystem>
#include <string>
#include <vector>

#include "accounts/AccountFinder.h"
#include "accounts/frmFindConta.h"
#include "common/SqlServer.h"
#include "platform/ado/Connection.h"
#include "platform/ado/Database.h"
#include "platform/forms/ScriptedDesktop.h"

namespace {

// Codes breadth first from the nine classes, each code with ten children that are one
// (or, skipping a level, two) characters longer.
std::vector<std::string> GeneratedCodes(int accounts, bool skipLevel) {
  std::vector<std::string> codes;
  std::deque<std::string> pending;
  for (char c = '1'; c <= '9'; ++c) pending.emplace_back(1, c);
  while (static_cast<int>(codes.size()) < accounts) {
    std::string code = pending.front();
    pending.pop_front();
    codes.push_back(code);
    for (char d = '0'; d <= '9'; ++d) pending.push_back(code + (skipLevel ? "0" : "") + d);
  }
  return codes;
}

std::string CreateChart(int accounts, bool skipLevel) {
  const std::string name = "dv-bench-accounts-" + std::to_string(::getpid()) +
                           (skipLevel ? "-skip" : "") + ".db";
  auto path = std::filesystem::temp_directory_path() / name;
  ado::CreateOptions options;
  options.demoData = false;
  options.replaceExisting = true;
  options.passwordIterations = 1000;
  ado::CreateDatabase(path.string(), {{"bench", "bench"}}, options);

  auto conn = ado::Connection::Create();
  conn->Open(ado::EmbeddedConnectionString(path.string(), "bench", "bench"));
  conn->BeginTrans();
  const std::vector<std::string> codes = GeneratedCodes(accounts, skipLevel);
  for (size_t i = 0; i < codes.size(); ++i) {
    conn->Execute(
        "INSERT INTO tbPOC_Contas (codigo, descrit, conta_activo, atribuicao) VALUES ('" +
        codes[i] + "', 'Conta " + codes[i] + "', " + (i % 7 ? "NULL" : "'21'") + ", " +
        std::to_string(i % 2) + ")");
  }
  conn->CommitTrans();
  conn->Close();
  return path.string();
}

void FillTree(benchmark::State& state, bool skipLevel) {
  const int accounts = static_cast<int>(state.range(0));
  const std::string path = CreateChart(accounts, skipLevel);
  forms::Desktop::Install(std::make_shared<forms::ScriptedDesktop>());
  common::SqlServer()->Open(ado::EmbeddedConnectionString(path, "bench", "bench"));

  std::shared_ptr<forms::Form> finder = accounts::NewAccountFinder();
  auto& tree = dynamic_cast<accounts::frmFindConta&>(*finder).TreeView1;
  for (auto _ : state) {
    finder->Call("DoOpen");
    if (tree.Nodes().Count() != accounts) state.SkipWithError("the tree is incomplete");
  }
  state.SetItemsProcessed(state.iterations() * accounts);

  finder.reset();
  common::SqlServer()->Close();
  forms::Desktop::Install(nullptr);
  std::filesystem::remove(path);
}

void Dense(benchmark::State& state) { FillTree(state, false); }
void SkippedLevel(benchmark::State& state) { FillTree(state, true); }

}  // namespace

// A quarter of the chart beside the whole: the time per account should stay the same.
BENCHMARK(Dense)->Arg(5000)->Arg(20000)->Unit(benchmark::kMillisecond);
BENCHMARK(SkippedLevel)->Arg(5000)->Arg(20000)->Unit(benchmark::kMillisecond);
