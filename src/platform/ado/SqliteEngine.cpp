#include "platform/ado/SqliteEngine.h"

#include <sqlite3.h>

#include <cctype>

#include "platform/ado/Collation.h"
#include "platform/ado/Logins.h"
#include "platform/ado/ServerDate.h"
#include "platform/ado/SqliteFunctions.h"

namespace ado {

namespace {

constexpr size_t kCacheSize = 128;
constexpr int kBusyTimeoutMs = 10000;
const char* const kSource = "Microsoft OLE DB Provider for SQL Server";

bool Contains(const std::string& upper, const char* part) { return upper.find(part) != std::string::npos; }

}  // namespace

std::unique_ptr<SqliteEngine> SqliteEngine::OpenFile(const std::string& path, bool create) {
  std::unique_ptr<SqliteEngine> engine(new SqliteEngine());
  int flags = SQLITE_OPEN_READWRITE | SQLITE_OPEN_NOMUTEX | (create ? SQLITE_OPEN_CREATE : 0);
  if (sqlite3_open_v2(path.c_str(), &engine->db_, flags, nullptr) != SQLITE_OK) {
    std::string why = engine->db_ ? sqlite3_errmsg(engine->db_) : "out of memory";
    throw EngineFailure({kErrProviderFailed,
                         "Cannot open database \"" + path + "\" requested by the login. The "
                         "login failed. (" + why + ")",
                         kSource, "42000", 4060});
  }
  engine->collator_ = std::make_unique<TextCollator>();
  RegisterDialectFunctions(engine->db_, engine->collator_.get());
  sqlite3_busy_timeout(engine->db_, kBusyTimeoutMs);
  engine->ExecuteNative("PRAGMA journal_mode=WAL; PRAGMA foreign_keys=ON;");
  return engine;
}

std::unique_ptr<SqliteEngine> SqliteEngine::Open(const std::string& path, const std::string& user,
                                                 const std::string& password) {
  auto engine = OpenFile(path, false);
  bool accepted = false;
  try {
    accepted = CheckLogin(engine->db_, user, password);
  } catch (const std::exception&) {
    accepted = false;  // no login table: nobody may log in
  }
  if (!accepted)
    throw EngineFailure({kErrLoginFailed, "Login failed for user '" + user + "'.", kSource,
                         "28000", 18456});
  return engine;
}

SqliteEngine::~SqliteEngine() {
  for (auto& [text, p] : cache_) sqlite3_finalize(p.stmt);
  // Closing with a transaction open rolls it back, as a dropped server session does.
  sqlite3_close_v2(db_);
}

void SqliteEngine::Fail(const std::string& message, const std::string& sqlState, int native) const {
  throw EngineFailure({kErrCommandFailed, message, kSource, sqlState, native});
}

void SqliteEngine::ExecuteNative(const std::string& sql) {
  char* err = nullptr;
  if (sqlite3_exec(db_, sql.c_str(), nullptr, nullptr, &err) != SQLITE_OK) {
    std::string message = err ? err : sqlite3_errmsg(db_);
    sqlite3_free(err);
    Fail(message, "42000", sqlite3_extended_errcode(db_));
  }
}

void SqliteEngine::Evict() {
  while (cache_.size() >= kCacheSize) {
    auto it = cache_.find(recent_.back());
    sqlite3_finalize(it->second.stmt);
    cache_.erase(it);
    recent_.pop_back();
  }
}

SqliteEngine::Prepared& SqliteEngine::Prepare(const std::string& sql) {
  if (auto it = cache_.find(sql); it != cache_.end()) {
    recent_.splice(recent_.begin(), recent_, it->second.recent);
    return it->second;
  }
  Prepared p;
  try {
    p.translation = sql::TranslateToSqlite(sql);
  } catch (const sql::TranslateError& e) {
    Fail(e.what(), "42000", 0);
  }
  if (!p.translation.tranCountColumn) {
    const char* tail = nullptr;
    const std::string& text = p.translation.sql;
    if (sqlite3_prepare_v3(db_, text.c_str(), static_cast<int>(text.size()),
                           SQLITE_PREPARE_PERSISTENT, &p.stmt, &tail) != SQLITE_OK)
      Fail(sqlite3_errmsg(db_), "42000", sqlite3_extended_errcode(db_));
    if (!p.stmt) Fail("The statement is empty.", "42000", 0);
    for (int c = 0; c < sqlite3_column_count(p.stmt); ++c) {
      const char* decl = sqlite3_column_decltype(p.stmt, c);
      std::string t;
      for (const char* q = decl; q && *q; ++q) t += static_cast<char>(std::toupper(static_cast<unsigned char>(*q)));
      ColumnKind kind = ColumnKind::Auto;
      if (decl == nullptr) kind = ColumnKind::Auto;
      else if (Contains(t, "DATE") || Contains(t, "TIME")) kind = ColumnKind::Date;
      else if (Contains(t, "INT") || Contains(t, "BIT")) kind = ColumnKind::Whole;
      else if (Contains(t, "CHAR") || Contains(t, "TEXT") || Contains(t, "CLOB")) kind = ColumnKind::Text;
      else if (Contains(t, "REAL") || Contains(t, "FLOA") || Contains(t, "DOUB") || Contains(t, "DEC") ||
               Contains(t, "NUM") || Contains(t, "MONEY"))
        kind = ColumnKind::Amount;
      p.kinds.push_back(kind);
    }
  }
  Evict();
  recent_.push_front(sql);
  p.recent = recent_.begin();
  return cache_.emplace(sql, std::move(p)).first->second;
}

vb::Variant SqliteEngine::ColumnValue(sqlite3_stmt* stmt, int col, ColumnKind kind) const {
  switch (sqlite3_column_type(stmt, col)) {
    case SQLITE_NULL:
      return vb::Variant::Null();
    case SQLITE_INTEGER:
      if (kind == ColumnKind::Amount) return vb::Variant(sqlite3_column_double(stmt, col));
      return vb::Variant::FromInt64(sqlite3_column_int64(stmt, col));
    case SQLITE_FLOAT:
      return vb::Variant(sqlite3_column_double(stmt, col));
    default: {
      std::string_view text(reinterpret_cast<const char*>(sqlite3_column_text(stmt, col)),
                            static_cast<size_t>(sqlite3_column_bytes(stmt, col)));
      // Expressions (MAX(data), GETDATE()) carry no declared type; a value in exactly
      // the stored date form is taken for a date there.
      if (kind == ColumnKind::Date || (kind == ColumnKind::Auto && LooksLikeStoredDateTime(text)))
        if (auto d = DateFromStoredText(text)) return vb::Variant(*d);
      return vb::Variant(text);
    }
  }
}

ResultTable SqliteEngine::Execute(const std::string& sql) {
  Prepared& p = Prepare(sql);
  ResultTable result;
  if (p.translation.tranCountColumn) {
    result.returnsRows = true;
    result.columns.push_back(*p.translation.tranCountColumn);
    result.cells.emplace_back(static_cast<int32_t>(TranCount()));
    return result;
  }
  sqlite3_stmt* stmt = p.stmt;
  int columns = sqlite3_column_count(stmt);
  result.returnsRows = columns > 0;
  for (int c = 0; c < columns; ++c) result.columns.emplace_back(sqlite3_column_name(stmt, c));
  int rc;
  while ((rc = sqlite3_step(stmt)) == SQLITE_ROW)
    for (int c = 0; c < columns; ++c)
      result.cells.push_back(ColumnValue(stmt, c, p.kinds[static_cast<size_t>(c)]));
  if (rc != SQLITE_DONE) {
    std::string message = sqlite3_errmsg(db_);
    int code = sqlite3_extended_errcode(db_);
    sqlite3_reset(stmt);
    std::string state = (code & 0xFF) == SQLITE_CONSTRAINT ? "23000" : "42000";
    Fail(message, state, code);
  }
  sqlite3_reset(stmt);
  if (!result.returnsRows) result.recordsAffected = sqlite3_changes64(db_);
  return result;
}

void SqliteEngine::BeginTrans() {
  if (TranCount() > 0)
    throw EngineFailure({kErrNoNestedTransactions, "Cannot start more transactions on this session.",
                         kSource, "25000", 0});
  // IMMEDIATE takes the write lock now: a counter read and then raised inside the
  // transaction cannot interleave with another process doing the same.
  ExecuteNative("BEGIN IMMEDIATE");
}

void SqliteEngine::CommitTrans() {
  if (TranCount() == 0)
    throw EngineFailure({kErrNoTransaction,
                         "The COMMIT TRANSACTION request has no corresponding BEGIN TRANSACTION.",
                         kSource, "25000", 3902});
  ExecuteNative("COMMIT");
}

void SqliteEngine::RollbackTrans() {
  if (TranCount() == 0)
    throw EngineFailure({kErrNoTransaction,
                         "The ROLLBACK TRANSACTION request has no corresponding BEGIN TRANSACTION.",
                         kSource, "25000", 3903});
  ExecuteNative("ROLLBACK");
}

int SqliteEngine::TranCount() const { return sqlite3_get_autocommit(db_) ? 0 : 1; }

}  // namespace ado
