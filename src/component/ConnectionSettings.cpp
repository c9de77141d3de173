#include "component/ConnectionSettings.h"

#include <string_view>

#include "common/modRegistry.h"

namespace component {

namespace {

bool IsBlank(char c) { return c == ' ' || c == '\t' || c == '\r' || c == '\n'; }

bool NeedsQuotes(std::string_view value) {
  return value.find_first_of(";\"'=") != std::string_view::npos ||
         (!value.empty() && (IsBlank(value.front()) || IsBlank(value.back())));
}

// "key=value", the value in quotes when it needs them: the quote it does not contain,
// or, holding both, double quotes with each one inside doubled.
std::string Element(std::string_view key, std::string_view value) {
  std::string out = std::string(key) + "=";
  if (!NeedsQuotes(value)) return out + std::string(value);
  bool hasDouble = value.find('"') != std::string_view::npos;
  bool hasSingle = value.find('\'') != std::string_view::npos;
  char quote = hasDouble && !hasSingle ? '\'' : '"';
  out += quote;
  for (char c : value) {
    out += c;
    if (c == quote) out += quote;
  }
  out += quote;
  return out;
}

// One setting's text, or nullopt when the value (or the key) is missing.
std::optional<std::string> Setting(const char* name) {
  vb::Variant value = common::ObterValorString(SettingsKey(), name);
  if (!value.IsString()) return std::nullopt;
  return value.AsString();
}

}  // namespace

std::string SettingsKey() { return std::string("HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\") + "POC"; }

std::optional<ConnectionSettings> ReadConnectionSettings() {
  ConnectionSettings settings;
  // In this order, and no further than the first one missing.
  std::optional<std::string> value;
  if (!(value = Setting("dtSecurityInfo"))) return std::nullopt;
  settings.securityInfo = *value;
  if (!(value = Setting("dtUser"))) return std::nullopt;
  settings.user = *value;
  if (!(value = Setting("dtPassword"))) return std::nullopt;
  settings.password = *value;
  if (!(value = Setting("dtInitialCatalog"))) return std::nullopt;
  settings.initialCatalog = *value;
  if (!(value = Setting("dtDataSource"))) return std::nullopt;
  settings.dataSource = *value;
  return settings;
}

std::string ConnectionString(const ConnectionSettings& settings, const std::string& user,
                             const std::string& plainPassword) {
  return "Provider=SQLOLEDB.1;" + Element("Persist Security Info", settings.securityInfo) + ";" +
         Element("User ID", user) + ";" + Element("Password", plainPassword) + ";" +
         Element("Initial Catalog", settings.initialCatalog) + ";" +
         Element("Data Source", settings.dataSource) + ";" + "Connect Timeout=15";
}

}  // namespace component
