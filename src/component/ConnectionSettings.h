#pragma once
// Where the database is and who the shared connection logs in as: five string values
// of the settings key, and the connection strings built from them.

#include <optional>
#include <string>

namespace component {

// "HKEY_LOCAL_MACHINE\SOFTWARE\Quorvex\POC".
std::string SettingsKey();

struct ConnectionSettings {
  std::string securityInfo;    // dtSecurityInfo: after "Persist Security Info="
  std::string user;            // dtUser: the shared connection's login
  std::string password;        // dtPassword: its password, encoded
  std::string initialCatalog;  // dtInitialCatalog
  std::string dataSource;      // dtDataSource
};

// Reads the five settings in order and stops at the first that is missing.
std::optional<ConnectionSettings> ReadConnectionSettings();

// The connection string for a login on the configured server. Every value is quoted
// when it could be read as more than a value (";", quotes, "=", blanks at either end),
// so no setting and no password can add or replace a key.
std::string ConnectionString(const ConnectionSettings& settings, const std::string& user,
                             const std::string& plainPassword);

}  // namespace component
