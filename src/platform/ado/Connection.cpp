#include "platform/ado/Connection.h"

#include <optional>

#include "platform/ado/Recordset.h"
#include "platform/vb/Error.h"

namespace ado {

namespace {

vb::Error ClosedError() { return vb::Error(kErrConnectionClosed, kConnectionClosedText, "ADODB.Connection"); }

}  // namespace

Connection::~Connection() = default;

void Connection::SetConnectionString(std::string text) {
  if (engine_)
    throw vb::Error(kErrObjectOpen, "Operation is not allowed when the object is open.",
                    "ADODB.Connection");
  connectionString_ = std::move(text);
  passwordHidden_ = false;
}

std::string Connection::ConnectionString() const {
  if (!passwordHidden_) return connectionString_;
  ConnectionStringParts parts = ConnectionStringParts::Parse(connectionString_);
  parts.Remove("Password");
  parts.Remove("Pwd");
  return parts.ToString();
}

void Connection::Raise(const EngineFailure& failure) {
  errors_.Set(failure.Item());
  throw vb::Error(failure.Item().Number, failure.Item().Description, failure.Item().Source);
}

void Connection::Open(std::string_view connectionString, std::string_view userId,
                      std::string_view password, long) {
  if (engine_)
    throw vb::Error(kErrObjectOpen, "Operation is not allowed when the object is open.",
                    "ADODB.Connection");
  if (!connectionString.empty()) {
    connectionString_ = std::string(connectionString);
    passwordHidden_ = false;
  }
  ConnectionStringParts parts = ConnectionStringParts::Parse(connectionString_);
  if (!userId.empty()) parts.Set("User ID", userId);
  if (!password.empty()) parts.Set("Password", password);
  try {
    engine_ = OpenEngine(parts);
  } catch (const EngineFailure& failure) {
    Raise(failure);
  }
  passwordHidden_ = !EqualsNoCase(parts.GetOr("Persist Security Info", "False"), "True");
}

void Connection::Close() {
  if (!engine_)
    throw vb::Error(kErrObjectClosed, "Operation is not allowed when the object is closed.",
                    "ADODB.Connection");
  engine_.reset();
}

Engine& Connection::OpenEngineOrThrow() {
  if (!engine_) throw ClosedError();
  return *engine_;
}

ResultTable Connection::Run(std::string source, Recordset* recordset, CursorTypeEnum cursorType,
                            LockTypeEnum lockType, long options) {
  // Handlers may drop the last outside reference to this connection.
  auto keepAlive = weak_from_this().lock();
  EventStatusEnum status = adStatusOK;
  if (WillExecute) {
    WillExecuteEvent event{source, cursorType, lockType, options, status, recordset, this};
    WillExecute(event);
  }
  ResultTable result;
  std::optional<vb::Error> failure;
  if (status == adStatusCancel) {
    failure = vb::Error(kErrOperationCancelled, "Operation has been cancelled by the user.",
                        "ADODB.Connection");
  } else if (!engine_) {
    failure = ClosedError();
  } else {
    try {
      result = engine_->Execute(source);
    } catch (const EngineFailure& f) {
      errors_.Set(f.Item());
      failure = vb::Error(f.Item().Number, f.Item().Description, f.Item().Source);
    }
  }
  if (ExecuteComplete) {
    EventStatusEnum after = failure ? adStatusErrorsOccurred : adStatusOK;
    ExecuteCompleteEvent event{result.recordsAffected, failure ? &*failure : nullptr, after,
                               recordset, this, source};
    ExecuteComplete(event);
  }
  if (failure) throw *failure;
  return result;
}

RecordsetPtr Connection::Execute(std::string_view commandText, int64_t* recordsAffected, long options) {
  ResultTable result = Run(std::string(commandText), nullptr, adOpenForwardOnly, adLockReadOnly, options);
  if (recordsAffected) *recordsAffected = result.recordsAffected;
  auto rs = Recordset::Create();
  if (result.returnsRows) rs->Attach(std::move(result));
  return rs;
}

long Connection::BeginTrans() {
  try {
    OpenEngineOrThrow().BeginTrans();
  } catch (const EngineFailure& failure) {
    Raise(failure);
  }
  return 1;
}

void Connection::CommitTrans() {
  try {
    OpenEngineOrThrow().CommitTrans();
  } catch (const EngineFailure& failure) {
    Raise(failure);
  }
}

void Connection::RollbackTrans() {
  try {
    OpenEngineOrThrow().RollbackTrans();
  } catch (const EngineFailure& failure) {
    Raise(failure);
  }
}

}  // namespace ado
