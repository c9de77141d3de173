#pragma once
// Where a server database is and how ODBC reaches it. The component names its server
// by the Data Source of an ADO connection string; here that name becomes the ODBC
// connection string of the driver that serves it:
//
//   "postgresql://HOST[:PORT]"        PostgreSQL through psqlODBC
//   "HOST", "HOST,PORT", "HOST\INST"  SQL Server through the FreeTDS driver
//
// Every value goes in braces with "}" doubled, ODBC's own quoting, so no server name,
// catalog, user or password can end its value early and add keys of its own. psqlODBC
// reads braces only around the password: there the other values go in bare, and one
// holding ";", "{", "}" or blanks at either end is refused (std::invalid_argument).

#include <string>
#include <string_view>

#include "platform/ado/ConnectionString.h"

namespace ado {

enum class ServerKind { SqlServer, PostgreSQL };

struct ServerAddress {
  ServerKind kind = ServerKind::SqlServer;
  std::string host;
  std::string port;      // empty: the driver's default
  std::string instance;  // SQL Server named instance, found by the browser service
};

// Reads a Data Source that names a server (not an embedded database file).
ServerAddress ParseServerAddress(std::string_view dataSource);

// The ODBC drivers, by the names unixODBC knows them under (odbcinst.ini). A site
// with another driver for SQL Server names it in the settings store.
struct OdbcDrivers {
  std::string sqlServer = "FreeTDS";
  std::string postgreSQL = "PostgreSQL Unicode";
};

// "HKEY_LOCAL_MACHINE\SOFTWARE\Quorvex\ODBC", values "SQL Server" and "PostgreSQL".
extern const char* const kOdbcDriversKey;

// The driver names from the settings store, the defaults where it names none.
OdbcDrivers ReadOdbcDrivers();

// PostgreSQL role names are kept in lower case, so that logins compare ignoring case as
// they do on SQL Server: the name a person types is folded before it reaches the server.
std::string FoldLoginName(std::string_view name);

// "key={value};" with "}" doubled inside.
std::string OdbcElement(std::string_view key, std::string_view value);
// "key=value;" for a driver that reads no braces; refuses a value that needs them.
std::string BareElement(std::string_view key, const std::string& value);

// The ODBC connection string for the server, catalog and login that an ADO connection
// string names.
std::string OdbcConnectionString(const ConnectionStringParts& parts, const OdbcDrivers& drivers);

}  // namespace ado
