#include "platform/ado/ServerDatabase.h"

#include <openssl/evp.h>
#include <openssl/hmac.h>
#include <openssl/rand.h>
#include <openssl/sha.h>

#include <cstring>
#include <memory>
#include <stdexcept>

#include "platform/ado/OdbcEngine.h"
#include "platform/ado/SqlTokenizer.h"

namespace ado {

namespace embedded {
extern const std::string_view schema_sqlserver;
}  // namespace embedded

namespace {

constexpr int kScramIterations = 4096;

std::string Base64(const unsigned char* data, size_t size) {
  std::string out(4 * ((size + 2) / 3) + 1, '\0');
  int n = EVP_EncodeBlock(reinterpret_cast<unsigned char*>(out.data()), data, static_cast<int>(size));
  out.resize(static_cast<size_t>(n));
  return out;
}

std::string QuoteName(bool postgres, const std::string& name) {
  if (postgres) {
    std::string out = "\"";
    for (char c : name) out += c == '"' ? std::string("\"\"") : std::string(1, c);
    return out + "\"";
  }
  std::string out = "[";
  for (char c : name) out += c == ']' ? std::string("]]") : std::string(1, c);
  return out + "]";
}

// A login's name as the server keeps it, quoted.
std::string LoginName(bool postgres, const Login& login) {
  return QuoteName(postgres, postgres ? FoldLoginName(login.name) : login.name);
}

// SQL Server scripts are batches between lines that say only GO.
std::vector<std::string> SplitBatches(std::string_view script) {
  std::vector<std::string> out;
  std::string current;
  size_t pos = 0;
  while (pos < script.size()) {
    size_t end = script.find('\n', pos);
    std::string_view line = script.substr(pos, end == std::string_view::npos ? std::string_view::npos : end - pos);
    pos = end == std::string_view::npos ? script.size() : end + 1;
    std::string_view bare = line;
    while (!bare.empty() && (bare.back() == '\r' || bare.back() == ' ')) bare.remove_suffix(1);
    if (EqualsNoCase(bare, "GO")) {
      if (current.find_first_not_of(" \t\r\n") != std::string::npos) out.push_back(current);
      current.clear();
    } else {
      current.append(line);
      current += '\n';
    }
  }
  if (current.find_first_not_of(" \t\r\n") != std::string::npos) out.push_back(current);
  return out;
}

ConnectionStringParts AdminParts(const ServerSetup& setup, const std::string& catalog) {
  ConnectionStringParts parts;
  parts.Set("Data Source", setup.dataSource);
  parts.Set("Initial Catalog", catalog);
  parts.Set("User ID", setup.adminUser);
  parts.Set("Password", setup.adminPassword);
  return parts;
}

std::unique_ptr<OdbcEngine> Connect(const ServerSetup& setup, const std::string& catalog) {
  return OdbcEngine::Open(AdminParts(setup, catalog), ReadOdbcDrivers());
}

bool IsPostgres(const ServerSetup& setup) {
  return ParseServerAddress(setup.dataSource).kind == ServerKind::PostgreSQL;
}

std::string ServerDatabaseOf(bool postgres) { return postgres ? "postgres" : "master"; }

bool DatabaseExists(OdbcEngine& server, bool postgres, const std::string& catalog) {
  std::string sql = postgres ? "SELECT 1 FROM pg_database WHERE datname = " + sql::QuoteLiteral(catalog)
                             : "SELECT 1 FROM sys.databases WHERE name = N" + sql::QuoteLiteral(catalog);
  return server.ExecuteNative(sql).RowCount() > 0;
}

void DropDatabase(OdbcEngine& server, bool postgres, const std::string& catalog) {
  if (postgres) {
    server.ExecuteNative("DROP DATABASE IF EXISTS " + QuoteName(true, catalog) + " WITH (FORCE)");
  } else if (DatabaseExists(server, false, catalog)) {
    server.ExecuteNative("ALTER DATABASE " + QuoteName(false, catalog) + " SET SINGLE_USER WITH ROLLBACK IMMEDIATE");
    server.ExecuteNative("DROP DATABASE " + QuoteName(false, catalog));
  }
}

void CreateLogins(OdbcEngine& server, bool postgres, const std::vector<Login>& logins) {
  for (const Login& login : logins) {
    const std::string name = LoginName(postgres, login);
    if (postgres) {
      bool exists = server.ExecuteNative("SELECT 1 FROM pg_roles WHERE rolname = " +
                                         sql::QuoteLiteral(FoldLoginName(login.name)))
                        .RowCount() > 0;
      server.ExecuteNative((exists ? "ALTER ROLE " : "CREATE ROLE ") + name + " LOGIN PASSWORD " +
                           sql::QuoteLiteral(ScramVerifier(login.password)));
    } else {
      bool exists = server.ExecuteNative("SELECT 1 FROM sys.server_principals WHERE name = N" +
                                         sql::QuoteLiteral(login.name))
                        .RowCount() > 0;
      server.ExecuteNative((exists ? "ALTER LOGIN " : "CREATE LOGIN ") + name + " WITH PASSWORD = N" +
                           sql::QuoteLiteral(login.password) + ", CHECK_POLICY = OFF");
    }
  }
}

// The logins work the ledger's tables; they do not own them.
void GrantLogins(OdbcEngine& db, bool postgres, const std::vector<Login>& logins) {
  for (const Login& login : logins) {
    const std::string name = LoginName(postgres, login);
    if (postgres) {
      db.ExecuteNative("GRANT SELECT, INSERT, UPDATE, DELETE ON ALL TABLES IN SCHEMA public TO " + name);
      db.ExecuteNative("GRANT USAGE, SELECT ON ALL SEQUENCES IN SCHEMA public TO " + name);
    } else {
      db.ExecuteNative("CREATE USER " + name + " FOR LOGIN " + name);
      db.ExecuteNative("ALTER ROLE db_datareader ADD MEMBER " + name);
      db.ExecuteNative("ALTER ROLE db_datawriter ADD MEMBER " + name);
    }
  }
}

void Populate(OdbcEngine& db, bool postgres, const ServerSetup& setup) {
  std::string_view schema = ServerSchema(postgres);
  // The PostgreSQL schema quotes its function bodies, so it splits at ";" as any script.
  for (const std::string& statement : postgres ? sql::SplitStatements(schema) : SplitBatches(schema))
    db.ExecuteNative(statement);
  GrantLogins(db, postgres, setup.logins);
  if (!setup.demoData) return;
  // The demo data is in the component's own dialect and goes in as its statements do.
  db.BeginTrans();
  for (std::string_view script : EmbeddedDemoData())
    for (const std::string& statement : sql::SplitStatements(script)) db.Execute(statement);
  db.CommitTrans();
}

std::string Reason(const EngineFailure& e) { return e.Item().Description; }

}  // namespace

std::string_view ServerSchema(bool postgres) { return postgres ? PostgresSchema() : embedded::schema_sqlserver; }

std::string ScramVerifier(const std::string& password) {
  unsigned char salt[16];
  if (RAND_bytes(salt, sizeof salt) != 1) throw std::runtime_error("no random source for a password salt");
  unsigned char salted[SHA256_DIGEST_LENGTH];
  PKCS5_PBKDF2_HMAC(password.data(), static_cast<int>(password.size()), salt, sizeof salt, kScramIterations,
                    EVP_sha256(), sizeof salted, salted);
  auto hmac = [&](const char* text, unsigned char* out) {
    unsigned int length = SHA256_DIGEST_LENGTH;
    HMAC(EVP_sha256(), salted, sizeof salted, reinterpret_cast<const unsigned char*>(text), std::strlen(text), out,
         &length);
  };
  unsigned char clientKey[SHA256_DIGEST_LENGTH], storedKey[SHA256_DIGEST_LENGTH], serverKey[SHA256_DIGEST_LENGTH];
  hmac("Client Key", clientKey);
  SHA256(clientKey, sizeof clientKey, storedKey);
  hmac("Server Key", serverKey);
  OPENSSL_cleanse(salted, sizeof salted);
  return "SCRAM-SHA-256$" + std::to_string(kScramIterations) + ":" + Base64(salt, sizeof salt) + "$" +
         Base64(storedKey, sizeof storedKey) + ":" + Base64(serverKey, sizeof serverKey);
}

void CreateServerDatabase(const ServerSetup& setup) {
  const bool postgres = IsPostgres(setup);
  bool created = false;
  std::unique_ptr<OdbcEngine> server;
  try {
    server = Connect(setup, ServerDatabaseOf(postgres));
    if (DatabaseExists(*server, postgres, setup.catalog)) {
      if (!setup.replaceExisting)
        throw std::runtime_error("the database '" + setup.catalog + "' already exists on the server");
      DropDatabase(*server, postgres, setup.catalog);
    }
    // Compares and sorts as the component expects: ignoring case, keeping accents,
    // in Portuguese order.
    server->ExecuteNative(postgres ? "CREATE DATABASE " + QuoteName(true, setup.catalog) +
                                         " TEMPLATE template0 ENCODING 'UTF8' LOCALE_PROVIDER icu "
                                         "ICU_LOCALE 'pt' LOCALE 'C.UTF-8'"
                                   : "CREATE DATABASE " + QuoteName(false, setup.catalog) +
                                         " COLLATE Latin1_General_CI_AS");
    created = true;
    CreateLogins(*server, postgres, setup.logins);
    Populate(*Connect(setup, setup.catalog), postgres, setup);
  } catch (...) {
    // A database begun here does not stay half made.
    if (created && server) try { DropDatabase(*server, postgres, setup.catalog); } catch (...) {}
    try {
      throw;
    } catch (const EngineFailure& e) {
      throw std::runtime_error("cannot create the database: " + Reason(e));
    }
  }
}

void DropServerDatabase(const ServerSetup& setup) {
  const bool postgres = IsPostgres(setup);
  try {
    DropDatabase(*Connect(setup, ServerDatabaseOf(postgres)), postgres, setup.catalog);
  } catch (const EngineFailure& e) {
    throw std::runtime_error("cannot drop the database: " + Reason(e));
  }
}

std::string ServerConnectionString(const std::string& dataSource, const std::string& catalog,
                                   const std::string& user, const std::string& password) {
  return BuildConnectionString({{"Provider", "SQLOLEDB.1"},
                                {"Persist Security Info", "False"},
                                {"User ID", user},
                                {"Password", password},
                                {"Initial Catalog", catalog},
                                {"Data Source", dataSource}});
}

}  // namespace ado
