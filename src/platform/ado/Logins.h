#pragma once
// The logins of an embedded database: table dv_logins, one row per login name (names
// compare ignoring case, as server logins do), holding the password hash only.

#include <string>
#include <string_view>

struct sqlite3;

namespace ado {

// Adds a login; fails when the name is taken or empty.
void AddLogin(sqlite3* db, std::string_view name, std::string_view password, int iterations);

// True when the name is a login and the password is its password. An unknown name
// costs as much as a wrong password, so timing does not tell which logins exist.
bool CheckLogin(sqlite3* db, std::string_view name, std::string_view password);

}  // namespace ado
