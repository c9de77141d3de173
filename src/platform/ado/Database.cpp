#include "platform/ado/Database.h"

#include <unistd.h>

#include <filesystem>
#include <stdexcept>
#include <system_error>

#include "platform/ado/ConnectionString.h"
#include "platform/ado/Logins.h"
#include "platform/ado/SqlTokenizer.h"
#include "platform/ado/SqliteEngine.h"

namespace ado {

namespace embedded {
extern const std::string_view schema_sqlite;
extern const std::string_view schema_postgres;
extern const std::string_view demo_chart;
extern const std::string_view demo_subaccounts;
extern const std::string_view demo_journals;
extern const std::string_view demo_vat;
extern const std::string_view demo_codes;
extern const std::string_view demo_closing;
}  // namespace embedded

std::string_view EmbeddedSchema() { return embedded::schema_sqlite; }
std::string_view PostgresSchema() { return embedded::schema_postgres; }

std::vector<std::string_view> EmbeddedDemoData() {
  return {embedded::demo_chart, embedded::demo_subaccounts, embedded::demo_journals,
          embedded::demo_vat,   embedded::demo_codes,       embedded::demo_closing};
}

namespace {

void RemoveDatabaseFiles(const std::string& path) {
  std::error_code ignored;
  for (const char* suffix : {"", "-wal", "-shm", "-journal"})
    std::filesystem::remove(path + suffix, ignored);
}

// The demo files are in the component's own dialect: they go through the translator
// statement by statement, exactly as the component's statements do.
void RunDialectScript(SqliteEngine& engine, std::string_view script) {
  for (const std::string& statement : sql::SplitStatements(script)) engine.Execute(statement);
}

}  // namespace

void CreateDatabase(const std::string& path, const std::vector<Login>& logins,
                    const CreateOptions& options) {
  namespace fs = std::filesystem;
  if (fs::exists(path) && !options.replaceExisting)
    throw std::runtime_error("the database file '" + path + "' already exists");
  std::string temp = path + ".new-" + std::to_string(::getpid());
  RemoveDatabaseFiles(temp);
  try {
    {
      auto engine = SqliteEngine::OpenFile(temp, true);
      engine->BeginTrans();
      engine->ExecuteNative(std::string(EmbeddedSchema()));
      if (options.demoData)
        for (std::string_view script : EmbeddedDemoData()) RunDialectScript(*engine, script);
      for (const Login& login : logins)
        AddLogin(engine->Handle(), login.name, login.password, options.passwordIterations);
      engine->CommitTrans();
      // Fold the log into the file so the result is one self-contained file.
      engine->ExecuteNative("PRAGMA wal_checkpoint(TRUNCATE);");
    }
    if (options.replaceExisting) RemoveDatabaseFiles(path);
    fs::rename(temp, path);
    RemoveDatabaseFiles(temp);
  } catch (const EngineFailure& e) {
    RemoveDatabaseFiles(temp);
    throw std::runtime_error("cannot create the database: " + e.Item().Description);
  } catch (...) {
    RemoveDatabaseFiles(temp);
    throw;
  }
}

void AddLoginToDatabase(const std::string& path, std::string_view name, std::string_view password,
                        int iterations) {
  if (!std::filesystem::exists(path))
    throw std::runtime_error("the database file '" + path + "' does not exist");
  try {
    auto engine = SqliteEngine::OpenFile(path, false);
    AddLogin(engine->Handle(), name, password, iterations);
  } catch (const EngineFailure& e) {
    throw std::runtime_error(e.Item().Description);
  }
}

std::string EmbeddedConnectionString(const std::string& path, std::string_view user,
                                     std::string_view password) {
  return BuildConnectionString({{"Provider", "SQLOLEDB.1"},
                                {"Persist Security Info", "False"},
                                {"User ID", std::string(user)},
                                {"Password", std::string(password)},
                                {"Data Source", "sqlite:" + path}});
}

}  // namespace ado
