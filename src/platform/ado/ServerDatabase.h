#pragma once
// Server databases: created on a PostgreSQL or SQL Server server with the schema for
// that server, the demo data in the component's own dialect, and the logins, all through
// the same ODBC engine the component uses. An administrator's tool: it connects with a
// login that may create databases and logins.

#include <string>
#include <vector>

#include "platform/ado/Database.h"

namespace ado {

struct ServerSetup {
  std::string dataSource;  // "postgresql://HOST[:PORT]", or a SQL Server name
  std::string adminUser;   // may create databases and logins
  std::string adminPassword;
  std::string catalog;     // the database to create
  std::vector<Login> logins;  // created, or given these passwords when they exist
  bool demoData = true;
  bool replaceExisting = false;  // otherwise an existing database is refused
};

// Throws std::runtime_error with the reason; a database it began is dropped again.
void CreateServerDatabase(const ServerSetup& setup);

// Drops a database made by CreateServerDatabase (tests, and replacing one).
void DropServerDatabase(const ServerSetup& setup);

// A connection string for a login on a server database, every value quoted as needed.
std::string ServerConnectionString(const std::string& dataSource, const std::string& catalog,
                                   const std::string& user, const std::string& password);

// PostgreSQL's stored form of a password ("SCRAM-SHA-256$4096:salt$stored:server"), so
// the plain password never travels in a statement nor lands in a server log.
std::string ScramVerifier(const std::string& password);

// The schema for a server, as compiled into the library.
std::string_view ServerSchema(bool postgres);

}  // namespace ado
