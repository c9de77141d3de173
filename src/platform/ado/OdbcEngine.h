#pragma once
// Server databases through ODBC (unixODBC): SQL Server through the FreeTDS driver, which
// takes the component's statements as they are, and PostgreSQL through psqlODBC, which
// takes them translated into its dialect. One ODBC connection per engine, autocommit
// outside BeginTrans, every result read whole, as the embedded engine does.
//
// A statement that fails because the server is gone leaves an error of class 08
// (communication link failure) in the connection's Errors; the data environment's probe
// then finds the connection broken and offers to reconnect.

#include <memory>
#include <string>

#include "platform/ado/Engine.h"
#include "platform/ado/OdbcConnectionString.h"

namespace ado {

class OdbcEngine final : public Engine {
 public:
  // Connects and logs in; raises EngineFailure: 18456-style for a refused login, a
  // provider failure for a server that cannot be reached.
  static std::unique_ptr<OdbcEngine> Open(const ConnectionStringParts& parts, const OdbcDrivers& drivers);
  ~OdbcEngine() override;

  ResultTable Execute(const std::string& sql) override;
  void BeginTrans() override;
  void CommitTrans() override;
  void RollbackTrans() override;
  int TranCount() const override { return tranCount_; }

  ServerKind Kind() const { return kind_; }
  // Runs the server's own SQL unchanged (schema scripts, administration).
  ResultTable ExecuteNative(const std::string& sql);

 private:
  struct Handles;
  OdbcEngine();
  void EndTransaction(bool commit);

  std::unique_ptr<Handles> handles_;
  ServerKind kind_ = ServerKind::SqlServer;
  int tranCount_ = 0;
};

}  // namespace ado
