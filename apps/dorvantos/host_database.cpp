#include "host_database.h"

#include <fmt/format.h>

#include <optional>
#include <string>

#include "common/PasswordCodec.h"
#include "common/modRegistry.h"
#include "platform/ado/ConnectionString.h"

namespace app {

ado::ConnectionPtr OpenSettingsDatabase() {
  auto setting = [](const char* name) {
    vb::Variant value = common::ObterValorString(kSettingsKey, name);
    if (!value.IsString())
      throw SettingsError(fmt::format("the setting {} is missing under {}", name, kSettingsKey));
    return value.AsString();
  };
  std::string securityInfo = setting("dtSecurityInfo");
  std::string user = setting("dtUser");
  std::optional<std::string> password = common::DecodePassword(setting("dtPassword"));
  if (!password) throw SettingsError("the setting dtPassword is not an encoded password");
  std::string catalog = setting("dtInitialCatalog");
  std::string server = setting("dtDataSource");
  auto connection = ado::Connection::Create();
  // Every value quoted as needed: a setting must not add keys of its own.
  connection->Open(ado::BuildConnectionString({{"Provider", "SQLOLEDB.1"},
                                               {"Persist Security Info", securityInfo},
                                               {"User ID", user},
                                               {"Password", *password},
                                               {"Initial Catalog", catalog},
                                               {"Data Source", server},
                                               {"Connect Timeout", "15"}}));
  return connection;
}

}  // namespace app
