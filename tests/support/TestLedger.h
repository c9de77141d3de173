#pragma once
// The database a test keeps its ledger in: an embedded database file in the test's
// folder, or, when $POC_TEST_PG_ENV names the environment file of a throwaway
// PostgreSQL server (scripts/pg-test-server), a fresh database on that server. The same
// tests thus run on both engines; a server database is dropped again at the end.

#include <unistd.h>

#include <atomic>
#include <cstdlib>
#include <fstream>
#include <map>
#include <optional>
#include <random>
#include <stdexcept>
#include <string>
#include <vector>

#include "platform/ado/Database.h"
#include "platform/ado/ServerDatabase.h"

namespace dvtest {

struct PgServer {
  std::string host, port, user, password;
  std::string DataSource() const { return "postgresql://" + host + ":" + port; }
};

// The server named by $POC_TEST_PG_ENV; nullopt when tests run on the embedded engine.
// A named file that cannot be read is a broken test setup, not a reason to fall back.
inline std::optional<PgServer> PostgresUnderTest() {
  const char* path = std::getenv("POC_TEST_PG_ENV");
  if (!path || !*path) return std::nullopt;
  std::ifstream in(path);
  if (!in) throw std::runtime_error(std::string("cannot read the PostgreSQL test server's settings: ") + path);
  std::map<std::string, std::string> values;
  for (std::string line; std::getline(in, line);) {
    size_t eq = line.find('=');
    if (eq == std::string::npos) continue;
    std::string value = line.substr(eq + 1);
    if (value.size() >= 2 && (value.front() == '\'' || value.front() == '"')) value = value.substr(1, value.size() - 2);
    values[line.substr(0, eq)] = value;
  }
  return PgServer{values["POC_TEST_PG_HOST"], values["POC_TEST_PG_PORT"], values["POC_TEST_PG_USER"],
                  values["POC_TEST_PG_PASSWORD"]};
}

inline bool OnPostgres() { return PostgresUnderTest().has_value(); }

class TestLedger {
 public:
  TestLedger(const std::string& folder, std::vector<ado::Login> logins, ado::CreateOptions options = {})
      : server_(PostgresUnderTest()) {
    if (!server_) {
      path_ = folder + "/poc.db";
      ado::CreateDatabase(path_, logins, options);
      dataSource_ = "sqlite:" + path_;
      catalog_ = "POC";
      return;
    }
    static std::atomic<int> counter{0};
    std::random_device random;
    catalog_ = "dvt_" + std::to_string(::getpid()) + "_" + std::to_string(counter++) + "_" +
               std::to_string(random() % 100000);
    dataSource_ = server_->DataSource();
    ado::ServerSetup setup = Setup();
    setup.logins = std::move(logins);
    setup.demoData = options.demoData;
    ado::CreateServerDatabase(setup);
  }

  ~TestLedger() {
    if (!server_) return;
    try {
      ado::DropServerDatabase(Setup());
    } catch (const std::exception&) {
      // A database left behind goes with the throwaway server.
    }
  }

  TestLedger(const TestLedger&) = delete;
  TestLedger& operator=(const TestLedger&) = delete;

  bool OnServer() const { return server_.has_value(); }
  // The values of the dtDataSource and dtInitialCatalog settings that reach it.
  const std::string& DataSource() const { return dataSource_; }
  const std::string& Catalog() const { return catalog_; }
  // The embedded database's file; empty on a server.
  const std::string& Path() const { return path_; }

  std::string ConnectionString(const std::string& user, const std::string& password) const {
    if (!server_) return ado::EmbeddedConnectionString(path_, user, password);
    return ado::ServerConnectionString(dataSource_, catalog_, user, password);
  }

 private:
  ado::ServerSetup Setup() const {
    ado::ServerSetup setup;
    setup.dataSource = dataSource_;
    setup.adminUser = server_->user;
    setup.adminPassword = server_->password;
    setup.catalog = catalog_;
    setup.replaceExisting = true;
    return setup;
  }

  std::optional<PgServer> server_;
  std::string path_, dataSource_, catalog_;
};

}  // namespace dvtest
