#include "FinderConnection.h"

#include <optional>
#include <vector>

#include "common/PasswordCodec.h"
#include "common/modRegistry.h"
#include "platform/ado/ConnectionString.h"

namespace recordfinder {

namespace {

constexpr const char* kSettingsKey = "HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\POC";

std::optional<std::string> Setting(const char* name) {
  vb::Variant value = common::ObterValorString(kSettingsKey, name);
  if (!value.IsString()) return std::nullopt;
  return value.AsString();
}

}  // namespace

ado::ConnectionPtr OpenFinderConnection(const std::string& user, const std::string& encodedPassword) {
  std::optional<std::string> securityInfo = Setting("dtSecurityInfo");
  std::optional<std::string> catalog = Setting("dtInitialCatalog");
  std::optional<std::string> server = Setting("dtDataSource");
  if (!securityInfo || !catalog || !server) return nullptr;
  std::optional<std::string> password = common::DecodePassword(encodedPassword);
  if (!password) return nullptr;

  // Every value quoted as it needs, so no setting or password can add keys.
  const std::string connectionString = ado::BuildConnectionString({
      {"Provider", "SQLOLEDB.1"},
      {"Persist Security Info", *securityInfo},
      {"User ID", user},
      {"Password", *password},
      {"Initial Catalog", *catalog},
      {"Data Source", *server},
      {"Connect Timeout", "15"},
  });
  ado::ConnectionPtr connection = ado::Connection::Create();
  try {
    connection->Open(connectionString);
  } catch (const std::exception&) {
    return nullptr;
  }
  return connection;
}

}  // namespace recordfinder
