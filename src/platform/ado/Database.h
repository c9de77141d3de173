#pragma once
// Embedded database files: created with the schema (and the demo data when asked) and
// their logins, all from SQL compiled into this library.

#include <string>
#include <string_view>
#include <vector>

#include "platform/ado/PasswordHash.h"

namespace ado {

struct Login {
  std::string name;
  std::string password;
};

struct CreateOptions {
  bool demoData = true;
  bool replaceExisting = false;  // otherwise an existing file is refused
  int passwordIterations = kDefaultPasswordIterations;
};

// Builds the database in a temporary file beside path and moves it into place only
// when complete, so a failure never leaves a half-made database. Throws
// std::runtime_error with the reason.
void CreateDatabase(const std::string& path, const std::vector<Login>& logins,
                    const CreateOptions& options = {});

// Adds a login to an existing database file (an administrator's tool: no login needed,
// only access to the file).
void AddLoginToDatabase(const std::string& path, std::string_view name, std::string_view password,
                        int iterations = kDefaultPasswordIterations);

// A connection string for an embedded database, every value quoted as needed.
std::string EmbeddedConnectionString(const std::string& path, std::string_view user,
                                     std::string_view password);

// The SQL compiled into the library: the schema, then the demo data files in order.
std::string_view EmbeddedSchema();
// The schema for a PostgreSQL database (db/postgresql/schema.sql), run natively.
std::string_view PostgresSchema();
std::vector<std::string_view> EmbeddedDemoData();

}  // namespace ado
