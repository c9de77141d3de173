#include "platform/ado/Engine.h"

#include "platform/ado/OdbcEngine.h"
#include "platform/ado/SqliteEngine.h"

namespace ado {

namespace {

bool EndsWithNoCase(const std::string& s, std::string_view suffix) {
  return s.size() >= suffix.size() &&
         EqualsNoCase(std::string_view(s).substr(s.size() - suffix.size()), suffix);
}

const char* const kProviderSource = "Microsoft OLE DB Provider for SQL Server";

}  // namespace

std::string EmbeddedDatabasePath(const std::string& dataSource) {
  if (dataSource.size() > 7 && EqualsNoCase(std::string_view(dataSource).substr(0, 7), "sqlite:"))
    return dataSource.substr(7);
  if (EndsWithNoCase(dataSource, ".db") || EndsWithNoCase(dataSource, ".sqlite")) return dataSource;
  return {};
}

std::unique_ptr<Engine> OpenEngine(const ConnectionStringParts& parts) {
  std::string provider = parts.GetOr("Provider", "SQLOLEDB");
  if (!EqualsNoCase(provider, "SQLOLEDB") && !EqualsNoCase(provider, "SQLOLEDB.1"))
    throw EngineFailure({3706, "Provider cannot be found. It may not be properly installed.",
                         "ADODB.Connection", {}, 0});
  std::string source = parts.GetOr("Data Source", "");
  std::string path = EmbeddedDatabasePath(source);
  if (!path.empty()) return SqliteEngine::Open(path, parts.GetOr("User ID", ""), parts.GetOr("Password", ""));
  if (ParseServerAddress(source).host.empty())
    throw EngineFailure({kErrProviderFailed,
                         "[DBNETLIB][ConnectionOpen (Connect()).]SQL Server does not exist or "
                         "access denied.",
                         kProviderSource, "08001", 17});
  return OdbcEngine::Open(parts, ReadOdbcDrivers());
}

}  // namespace ado
