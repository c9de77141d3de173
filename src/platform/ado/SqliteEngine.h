#pragma once
// The embedded engine: one SQLite database file, in WAL mode with a busy timeout and
// foreign keys on, speaking the component's SQL Server dialect through the translator.
// Statements are kept prepared by their text, translation included, in a small
// most-recently-used cache.

#include <list>
#include <memory>
#include <string>
#include <unordered_map>

#include "platform/ado/Engine.h"
#include "platform/ado/SqlTranslator.h"

struct sqlite3;
struct sqlite3_stmt;

namespace ado {

class TextCollator;

class SqliteEngine final : public Engine {
 public:
  // Opens an existing database file and checks the login; raises EngineFailure.
  static std::unique_ptr<SqliteEngine> Open(const std::string& path, const std::string& user,
                                            const std::string& password);
  // Opens (creating when asked) without a login check: for the tools that build and
  // administer database files.
  static std::unique_ptr<SqliteEngine> OpenFile(const std::string& path, bool create);
  ~SqliteEngine() override;

  ResultTable Execute(const std::string& sql) override;
  void BeginTrans() override;
  void CommitTrans() override;
  void RollbackTrans() override;
  int TranCount() const override;

  // Runs SQLite's own SQL (the schema), several statements allowed.
  void ExecuteNative(const std::string& sql);
  sqlite3* Handle() const { return db_; }

 private:
  enum class ColumnKind { Auto, Whole, Amount, Text, Date };
  struct Prepared {
    sql::Translation translation;
    sqlite3_stmt* stmt = nullptr;
    std::vector<ColumnKind> kinds;
    std::list<std::string>::iterator recent;
  };

  SqliteEngine() = default;
  Prepared& Prepare(const std::string& sql);
  void Evict();
  [[noreturn]] void Fail(const std::string& message, const std::string& sqlState, int native) const;
  vb::Variant ColumnValue(sqlite3_stmt* stmt, int col, ColumnKind kind) const;

  sqlite3* db_ = nullptr;
  std::unique_ptr<TextCollator> collator_;
  std::unordered_map<std::string, Prepared> cache_;
  std::list<std::string> recent_;  // most recently used first
};

}  // namespace ado
