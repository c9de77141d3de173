#pragma once
// An ADO Connection: opened from a connection string, runs statements of the SQL Server
// dialect, keeps the Errors of the last failure and the one transaction, and raises
// WillExecute before and ExecuteComplete after every statement, those of recordsets
// opened on it included.
//
//   state:  Closed --Open--> Open --Close--> Closed
//   A statement on a closed connection still raises WillExecute first (a handler may
//   re-open it), then fails with 3709 if the connection is still closed.

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <string_view>

#include "platform/ado/Engine.h"
#include "platform/ado/Errors.h"
#include "platform/vb/Error.h"

namespace ado {

class Connection;
class Recordset;
using ConnectionPtr = std::shared_ptr<Connection>;
using RecordsetPtr = std::shared_ptr<Recordset>;

enum ObjectStateEnum { adStateClosed = 0, adStateOpen = 1 };
enum EventStatusEnum {
  adStatusOK = 1,
  adStatusErrorsOccurred = 2,
  adStatusCantDeny = 3,
  adStatusCancel = 4,
  adStatusUnwantedEvent = 5
};
enum CursorTypeEnum {
  adOpenUnspecified = -1,
  adOpenForwardOnly = 0,
  adOpenKeyset = 1,
  adOpenDynamic = 2,
  adOpenStatic = 3
};
enum LockTypeEnum {
  adLockUnspecified = -1,
  adLockReadOnly = 1,
  adLockPessimistic = 2,
  adLockOptimistic = 3,
  adLockBatchOptimistic = 4
};
inline constexpr long adOptionUnspecified = -1;

// The arguments of WillExecute. A handler may change Source, the cursor and lock types
// and the options, or set adStatus to adStatusCancel to stop the statement.
struct WillExecuteEvent {
  std::string& Source;
  CursorTypeEnum& CursorType;
  LockTypeEnum& LockType;
  long& Options;
  EventStatusEnum& adStatus;
  Recordset* pRecordset;  // null for Connection::Execute
  Connection* pConnection;
};

struct ExecuteCompleteEvent {
  int64_t RecordsAffected;
  const vb::Error* pError;  // null when the statement succeeded
  EventStatusEnum& adStatus;
  Recordset* pRecordset;
  Connection* pConnection;
  const std::string& Source;
};

class Connection : public std::enable_shared_from_this<Connection> {
 public:
  static ConnectionPtr Create() { return std::make_shared<Connection>(); }
  Connection() = default;
  ~Connection();
  Connection(const Connection&) = delete;
  Connection& operator=(const Connection&) = delete;

  // The property as ADO reads it: once the connection has opened with "Persist
  // Security Info" not True, without the password, which the connection keeps to itself
  // for opening again.
  std::string ConnectionString() const;
  // Raises 3705 while open, as the property is read-only then.
  void SetConnectionString(std::string text);

  // Non-empty arguments take the place of the stored string, User ID and Password.
  void Open(std::string_view connectionString = {}, std::string_view userId = {},
            std::string_view password = {}, long options = adOptionUnspecified);
  void Close();
  ObjectStateEnum State() const { return engine_ ? adStateOpen : adStateClosed; }

  // A statement; a query gives an open recordset, anything else a closed one.
  RecordsetPtr Execute(std::string_view commandText, int64_t* recordsAffected = nullptr,
                       long options = adOptionUnspecified);

  ado::Errors& Errors() { return errors_; }

  // Returns the new nesting level (always 1: transactions do not nest).
  long BeginTrans();
  void CommitTrans();
  void RollbackTrans();

  std::function<void(WillExecuteEvent&)> WillExecute;
  std::function<void(ExecuteCompleteEvent&)> ExecuteComplete;

  // For Recordset::Open: runs a statement with the events around it.
  ResultTable Run(std::string source, Recordset* recordset, CursorTypeEnum cursorType,
                  LockTypeEnum lockType, long options);

 private:
  Engine& OpenEngineOrThrow();
  [[noreturn]] void Raise(const EngineFailure& failure);

  std::string connectionString_;
  bool passwordHidden_ = false;
  std::unique_ptr<Engine> engine_;
  ado::Errors errors_;
};

}  // namespace ado
