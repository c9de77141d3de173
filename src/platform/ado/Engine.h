#pragma once
// What a Connection needs of a database engine: run one statement of the SQL Server
// dialect and hand back all its rows, and keep the one transaction. Engines raise
// EngineFailure with an ADO-style error; the Connection files it in Errors.

#include <cstdint>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "platform/ado/ConnectionString.h"
#include "platform/ado/Errors.h"
#include "platform/vb/Variant.h"

namespace ado {

// All rows of one statement, read at once: our result sets are small, and a static
// copy lets handlers run other statements on the same connection while it is walked.
struct ResultTable {
  bool returnsRows = false;
  std::vector<std::string> columns;
  std::vector<vb::Variant> cells;  // row after row
  int64_t recordsAffected = -1;    // -1 for a query

  size_t RowCount() const { return columns.empty() ? 0 : cells.size() / columns.size(); }
};

class EngineFailure : public std::runtime_error {
 public:
  explicit EngineFailure(ErrorItem item) : std::runtime_error(item.Description), item_(std::move(item)) {}
  const ErrorItem& Item() const { return item_; }

 private:
  ErrorItem item_;
};

class Engine {
 public:
  virtual ~Engine() = default;
  virtual ResultTable Execute(const std::string& sql) = 0;
  // One level only: the component never nests transactions.
  virtual void BeginTrans() = 0;
  virtual void CommitTrans() = 0;
  virtual void RollbackTrans() = 0;
  virtual int TranCount() const = 0;
};

// Chooses and opens the engine a connection string names, checking its login.
std::unique_ptr<Engine> OpenEngine(const ConnectionStringParts& parts);

// The file path of an embedded database named by a Data Source ("sqlite:PATH", or a
// path ending in .db or .sqlite); empty when the source is not an embedded database.
std::string EmbeddedDatabasePath(const std::string& dataSource);

}  // namespace ado
