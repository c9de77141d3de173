#include "platform/ado/OdbcEngine.h"

#include <sql.h>
#include <sqlext.h>

#include <cstring>
#include <vector>

#include "platform/ado/PostgresDialect.h"
#include "platform/ado/Utf16.h"
#include "platform/vb/Date.h"

namespace ado {

namespace {

const char* const kSource = "Microsoft OLE DB Provider for SQL Server";
constexpr SQLULEN kLoginTimeoutSeconds = 15;

static_assert(sizeof(SQLWCHAR) == sizeof(char16_t), "unixODBC's wide characters are UTF-16");

SQLWCHAR* Wide(std::u16string& s) { return reinterpret_cast<SQLWCHAR*>(s.data()); }

bool Succeeded(SQLRETURN rc) { return rc == SQL_SUCCESS || rc == SQL_SUCCESS_WITH_INFO; }

// The first diagnostic record of a handle: what the driver said went wrong.
ErrorItem Diagnostic(SQLSMALLINT handleType, SQLHANDLE handle, int32_t number) {
  ErrorItem item{number, {}, kSource, {}, 0};
  SQLWCHAR state[6] = {};
  SQLINTEGER native = 0;
  std::vector<SQLWCHAR> message(1024);
  SQLSMALLINT length = 0;
  SQLRETURN rc = SQLGetDiagRecW(handleType, handle, 1, state, &native, message.data(),
                                static_cast<SQLSMALLINT>(message.size()), &length);
  if (Succeeded(rc)) {
    item.SQLState = ToUtf8(std::u16string_view(reinterpret_cast<const char16_t*>(state), 5));
    // Integrity violations read as SQL Server's driver reports them, whatever the
    // server's finer code.
    if (item.SQLState.rfind("23", 0) == 0) item.SQLState = "23000";
    size_t units = std::min<size_t>(static_cast<size_t>(length), message.size() - 1);
    item.Description = ToUtf8(std::u16string_view(reinterpret_cast<const char16_t*>(message.data()), units));
    item.NativeError = native;
  } else {
    item.SQLState = "HY000";
    item.Description = "The ODBC driver reported a failure without a diagnostic.";
  }
  while (!item.Description.empty() && (item.Description.back() == '\n' || item.Description.back() == '\r'))
    item.Description.pop_back();
  return item;
}

// A refused login reads so whichever driver refused it; anything else that stops a
// connection is a server that cannot be reached.
bool IsLoginRefusal(const ErrorItem& item) {
  return item.SQLState.rfind("28", 0) == 0 || item.NativeError == 18456 ||
         item.Description.find("authentication failed") != std::string::npos;
}

}  // namespace

// The process has one ODBC environment, as it has one driver manager.
struct OdbcEngine::Handles {
  SQLHDBC dbc = SQL_NULL_HDBC;

  static SQLHENV Environment() {
    static SQLHENV env = [] {
      SQLHENV h = SQL_NULL_HENV;
      if (!Succeeded(SQLAllocHandle(SQL_HANDLE_ENV, SQL_NULL_HANDLE, &h))) return SQLHENV{SQL_NULL_HENV};
      SQLSetEnvAttr(h, SQL_ATTR_ODBC_VERSION, reinterpret_cast<SQLPOINTER>(SQL_OV_ODBC3), 0);
      return h;
    }();
    return env;
  }

  ~Handles() {
    if (dbc != SQL_NULL_HDBC) {
      // Leaving with a transaction open rolls it back, as a dropped session does.
      SQLEndTran(SQL_HANDLE_DBC, dbc, SQL_ROLLBACK);
      SQLDisconnect(dbc);
      SQLFreeHandle(SQL_HANDLE_DBC, dbc);
    }
  }
};

// One statement handle for the life of one Execute.
class Statement {
 public:
  explicit Statement(SQLHDBC dbc) {
    if (!Succeeded(SQLAllocHandle(SQL_HANDLE_STMT, dbc, &stmt_)))
      throw EngineFailure(Diagnostic(SQL_HANDLE_DBC, dbc, kErrProviderFailed));
  }
  ~Statement() { SQLFreeHandle(SQL_HANDLE_STMT, stmt_); }
  Statement(const Statement&) = delete;
  Statement& operator=(const Statement&) = delete;

  [[noreturn]] void Fail() const { throw EngineFailure(Diagnostic(SQL_HANDLE_STMT, stmt_, kErrCommandFailed)); }

  ResultTable Run(const std::string& sql) {
    std::u16string text = ToUtf16(sql);
    SQLRETURN rc = SQLExecDirectW(stmt_, Wide(text), static_cast<SQLINTEGER>(text.size()));
    ResultTable result;
    if (rc == SQL_NO_DATA) {
      result.recordsAffected = 0;
      return result;
    }
    if (!Succeeded(rc)) Fail();
    SQLSMALLINT columns = 0;
    SQLNumResultCols(stmt_, &columns);
    // A batch may answer with row counts before its rows.
    while (columns == 0) {
      SQLLEN affected = -1;
      SQLRowCount(stmt_, &affected);
      if (result.recordsAffected < 0) result.recordsAffected = affected;
      rc = SQLMoreResults(stmt_);
      if (rc == SQL_NO_DATA) return result;
      if (!Succeeded(rc)) Fail();
      SQLNumResultCols(stmt_, &columns);
    }
    ReadRows(columns, result);
    return result;
  }

 private:
  enum class Kind { Whole, Amount, Date, Text };

  void ReadRows(SQLSMALLINT columns, ResultTable& result) {
    result.returnsRows = true;
    result.recordsAffected = -1;
    std::vector<Kind> kinds;
    for (SQLUSMALLINT c = 1; c <= columns; ++c) {
      SQLWCHAR name[256] = {};
      SQLSMALLINT nameLength = 0, type = 0, digits = 0, nullable = 0;
      SQLULEN size = 0;
      if (!Succeeded(SQLDescribeColW(stmt_, c, name, 255, &nameLength, &type, &size, &digits, &nullable)))
        Fail();
      result.columns.push_back(ToUtf8(std::u16string_view(reinterpret_cast<const char16_t*>(name),
                                                          std::min<size_t>(static_cast<size_t>(nameLength), 255))));
      kinds.push_back(KindOf(type));
    }
    SQLRETURN rc;
    while ((rc = SQLFetch(stmt_)) != SQL_NO_DATA) {
      if (!Succeeded(rc)) Fail();
      for (SQLUSMALLINT c = 1; c <= columns; ++c) result.cells.push_back(Value(c, kinds[c - 1]));
    }
  }

  static Kind KindOf(SQLSMALLINT type) {
    switch (type) {
      case SQL_BIT: case SQL_TINYINT: case SQL_SMALLINT: case SQL_INTEGER: case SQL_BIGINT:
        return Kind::Whole;
      case SQL_DECIMAL: case SQL_NUMERIC: case SQL_REAL: case SQL_FLOAT: case SQL_DOUBLE:
        return Kind::Amount;
      case SQL_TYPE_DATE: case SQL_TYPE_TIMESTAMP: case SQL_DATETIME:
        return Kind::Date;
      default:
        return Kind::Text;
    }
  }

  vb::Variant Value(SQLUSMALLINT column, Kind kind) {
    SQLLEN indicator = 0;
    switch (kind) {
      case Kind::Whole: {
        SQLBIGINT n = 0;
        if (!Succeeded(SQLGetData(stmt_, column, SQL_C_SBIGINT, &n, sizeof n, &indicator))) Fail();
        return indicator == SQL_NULL_DATA ? vb::Variant::Null() : vb::Variant::FromInt64(n);
      }
      case Kind::Amount: {
        double d = 0;
        if (!Succeeded(SQLGetData(stmt_, column, SQL_C_DOUBLE, &d, sizeof d, &indicator))) Fail();
        return indicator == SQL_NULL_DATA ? vb::Variant::Null() : vb::Variant(d);
      }
      case Kind::Date: {
        SQL_TIMESTAMP_STRUCT ts{};
        if (!Succeeded(SQLGetData(stmt_, column, SQL_C_TYPE_TIMESTAMP, &ts, sizeof ts, &indicator))) Fail();
        if (indicator == SQL_NULL_DATA) return vb::Variant::Null();
        auto date = vb::DateSerial(ts.year, ts.month, ts.day, ts.hour, ts.minute, ts.second);
        return date ? vb::Variant(*date) : vb::Variant::Null();
      }
      case Kind::Text:
        return Text(column);
    }
    return vb::Variant::Null();
  }

  // Texts of any length, read in pieces as the driver hands them out.
  vb::Variant Text(SQLUSMALLINT column) {
    std::u16string text;
    std::vector<char16_t> chunk(2048);
    for (;;) {
      SQLLEN indicator = 0;
      SQLRETURN rc = SQLGetData(stmt_, column, SQL_C_WCHAR, chunk.data(),
                                static_cast<SQLLEN>(chunk.size() * sizeof(char16_t)), &indicator);
      if (rc == SQL_NO_DATA) break;
      if (!Succeeded(rc)) Fail();
      if (indicator == SQL_NULL_DATA) return vb::Variant::Null();
      size_t capacity = chunk.size() - 1;  // room for the terminating zero
      size_t units = indicator == SQL_NO_TOTAL || static_cast<size_t>(indicator) / sizeof(char16_t) > capacity
                         ? capacity
                         : static_cast<size_t>(indicator) / sizeof(char16_t);
      text.append(chunk.data(), units);
      if (rc == SQL_SUCCESS) break;
    }
    return vb::Variant(ToUtf8(text));
  }

  SQLHSTMT stmt_ = SQL_NULL_HSTMT;
};

OdbcEngine::OdbcEngine() : handles_(std::make_unique<Handles>()) {}
OdbcEngine::~OdbcEngine() = default;

std::unique_ptr<OdbcEngine> OdbcEngine::Open(const ConnectionStringParts& parts, const OdbcDrivers& drivers) {
  SQLHENV env = Handles::Environment();
  if (env == SQL_NULL_HENV)
    throw EngineFailure({kErrProviderFailed, "The ODBC driver manager could not be started.", kSource, "IM004", 0});
  std::unique_ptr<OdbcEngine> engine(new OdbcEngine());
  engine->kind_ = ParseServerAddress(parts.GetOr("Data Source", "")).kind;
  SQLHDBC& dbc = engine->handles_->dbc;
  if (!Succeeded(SQLAllocHandle(SQL_HANDLE_DBC, env, &dbc)))
    throw EngineFailure({kErrProviderFailed, "The ODBC driver manager has no room for a connection.", kSource,
                         "HY001", 0});
  SQLSetConnectAttr(dbc, SQL_ATTR_LOGIN_TIMEOUT, reinterpret_cast<SQLPOINTER>(kLoginTimeoutSeconds), 0);
  std::u16string text;
  try {
    text = ToUtf16(OdbcConnectionString(parts, drivers));
  } catch (const std::invalid_argument& e) {
    throw EngineFailure({kErrProviderFailed, e.what(), kSource, "08001", 0});
  }
  SQLSMALLINT outLength = 0;
  SQLRETURN rc = SQLDriverConnectW(dbc, nullptr, Wide(text), static_cast<SQLSMALLINT>(text.size()), nullptr, 0,
                                   &outLength, SQL_DRIVER_NOPROMPT);
  // The string held the password: it does not outlive the attempt.
  std::fill(text.begin(), text.end(), u'\0');
  if (!Succeeded(rc)) {
    ErrorItem item = Diagnostic(SQL_HANDLE_DBC, dbc, kErrProviderFailed);
    SQLFreeHandle(SQL_HANDLE_DBC, dbc);
    dbc = SQL_NULL_HDBC;
    if (IsLoginRefusal(item)) {
      item.Number = kErrLoginFailed;
      // As the server says it: the driver's detail would only tell an intruder more.
      item.Description = "Login failed for user '" + parts.GetOr("User ID", "") + "'.";
    }
    throw EngineFailure(item);
  }
  return engine;
}

ResultTable OdbcEngine::ExecuteNative(const std::string& sql) { return Statement(handles_->dbc).Run(sql); }

ResultTable OdbcEngine::Execute(const std::string& sql) {
  if (kind_ == ServerKind::SqlServer) return ExecuteNative(sql);
  std::string translated;
  try {
    translated = sql::TranslateToPostgres(sql, tranCount_).sql;
  } catch (const sql::TranslateError& e) {
    throw EngineFailure({kErrCommandFailed, e.what(), kSource, "42000", 0});
  }
  return ExecuteNative(translated);
}

void OdbcEngine::BeginTrans() {
  if (tranCount_ > 0)
    throw EngineFailure({kErrNoNestedTransactions, "Cannot start more transactions on this session.", kSource,
                         "25000", 0});
  SQLRETURN rc = SQLSetConnectAttr(handles_->dbc, SQL_ATTR_AUTOCOMMIT,
                                   reinterpret_cast<SQLPOINTER>(SQL_AUTOCOMMIT_OFF), 0);
  if (!Succeeded(rc)) throw EngineFailure(Diagnostic(SQL_HANDLE_DBC, handles_->dbc, kErrProviderFailed));
  tranCount_ = 1;
}

void OdbcEngine::EndTransaction(bool commit) {
  if (tranCount_ == 0)
    throw EngineFailure({kErrNoTransaction,
                         commit ? "The COMMIT TRANSACTION request has no corresponding BEGIN TRANSACTION."
                                : "The ROLLBACK TRANSACTION request has no corresponding BEGIN TRANSACTION.",
                         kSource, "25000", commit ? 3902 : 3903});
  SQLRETURN rc = SQLEndTran(SQL_HANDLE_DBC, handles_->dbc, commit ? SQL_COMMIT : SQL_ROLLBACK);
  if (!Succeeded(rc)) {
    ErrorItem item = Diagnostic(SQL_HANDLE_DBC, handles_->dbc, kErrProviderFailed);
    // A commit that failed leaves the transaction for the caller to roll back; a
    // rollback that failed has lost it with the session anyway.
    if (!commit) tranCount_ = 0;
    throw EngineFailure(item);
  }
  tranCount_ = 0;
  SQLSetConnectAttr(handles_->dbc, SQL_ATTR_AUTOCOMMIT, reinterpret_cast<SQLPOINTER>(SQL_AUTOCOMMIT_ON), 0);
}

void OdbcEngine::CommitTrans() { EndTransaction(true); }
void OdbcEngine::RollbackTrans() { EndTransaction(false); }

}  // namespace ado
