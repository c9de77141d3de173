#include "setup_settings.h"

#include <random>
#include <string_view>

#include "common/PasswordCodec.h"
#include "host_database.h"
#include "platform/registry/Registry.h"
#include "platform/registry/Store.h"

namespace app {

std::string RandomPassword() {
  static constexpr std::string_view kAlphabet =
      "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789";
  std::random_device random;
  std::uniform_int_distribution<size_t> pick(0, kAlphabet.size() - 1);
  std::string password;
  for (int i = 0; i < 32; ++i) password += kAlphabet[pick(random)];
  return password;
}

void WriteConnectionSettings(const std::string& dataSource, const std::string& catalog,
                             const std::string& sharedPassword) {
  std::string encoded = common::EncodePassword(sharedPassword);
  registry::Store::Default().Update([&](registry::Hive& hive) {
    registry::Key& key = hive.Create(kSettingsKey);
    key.Set("dtSecurityInfo", {registry::REG_SZ, "False"});
    key.Set("dtUser", {registry::REG_SZ, kSharedLogin});
    key.Set("dtPassword", {registry::REG_SZ, encoded});
    key.Set("dtInitialCatalog", {registry::REG_SZ, catalog});
    key.Set("dtDataSource", {registry::REG_SZ, dataSource});
  });
}

}  // namespace app
