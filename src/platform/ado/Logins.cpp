#include "platform/ado/Logins.h"

#include <sqlite3.h>

#include <stdexcept>

#include "platform/ado/PasswordHash.h"

namespace ado {

namespace {

struct Statement {
  Statement(sqlite3* db, const char* sql) {
    if (sqlite3_prepare_v2(db, sql, -1, &stmt, nullptr) != SQLITE_OK)
      throw std::runtime_error(sqlite3_errmsg(db));
  }
  ~Statement() { sqlite3_finalize(stmt); }
  Statement(const Statement&) = delete;
  Statement& operator=(const Statement&) = delete;
  void BindText(int i, std::string_view s) {
    sqlite3_bind_text(stmt, i, s.data(), static_cast<int>(s.size()), SQLITE_TRANSIENT);
  }
  void BindBlob(int i, const std::string& s) {
    sqlite3_bind_blob(stmt, i, s.data(), static_cast<int>(s.size()), SQLITE_TRANSIENT);
  }
  std::string ColumnBytes(int i) {
    const void* p = sqlite3_column_blob(stmt, i);
    return p ? std::string(static_cast<const char*>(p), static_cast<size_t>(sqlite3_column_bytes(stmt, i)))
             : std::string();
  }
  sqlite3_stmt* stmt = nullptr;
};

}  // namespace

void AddLogin(sqlite3* db, std::string_view name, std::string_view password, int iterations) {
  if (name.empty()) throw std::invalid_argument("a login needs a name");
  PasswordHash h = HashPassword(password, iterations);
  Statement st(db,
               "INSERT INTO dv_logins (login_name, algorithm, iterations, salt, hash) "
               "VALUES (?, ?, ?, ?, ?)");
  st.BindText(1, name);
  st.BindText(2, h.algorithm);
  sqlite3_bind_int(st.stmt, 3, h.iterations);
  st.BindBlob(4, h.salt);
  st.BindBlob(5, h.hash);
  int rc = sqlite3_step(st.stmt);
  if (rc == SQLITE_CONSTRAINT)
    throw std::runtime_error("the login '" + std::string(name) + "' already exists");
  if (rc != SQLITE_DONE) throw std::runtime_error(sqlite3_errmsg(db));
}

bool CheckLogin(sqlite3* db, std::string_view name, std::string_view password) {
  PasswordHash stored;
  bool found = false;
  {
    Statement st(db,
                 "SELECT algorithm, iterations, salt, hash FROM dv_logins WHERE login_name = ?");
    st.BindText(1, name);
    if (sqlite3_step(st.stmt) == SQLITE_ROW) {
      found = true;
      stored.algorithm = st.ColumnBytes(0);
      stored.iterations = sqlite3_column_int(st.stmt, 1);
      stored.salt = st.ColumnBytes(2);
      stored.hash = st.ColumnBytes(3);
    }
  }
  if (!found) {
    // Spend the same effort on a name that does not exist as on a wrong password.
    Statement st(db, "SELECT MAX(iterations) FROM dv_logins");
    PasswordHash decoy;
    decoy.salt.assign(16, '\0');
    decoy.hash.assign(32, '\0');
    if (sqlite3_step(st.stmt) == SQLITE_ROW && sqlite3_column_type(st.stmt, 0) == SQLITE_INTEGER)
      decoy.iterations = sqlite3_column_int(st.stmt, 0);
    VerifyPassword(password, decoy);
    return false;
  }
  return VerifyPassword(password, stored);
}

}  // namespace ado
