// dorvantos setup-demo: everything a host needs to reach a demo ledger on this machine.
// An embedded database with the schema and the demo data, a login for the component's
// shared connection and one for the demo user, the connection settings the component
// reads, and the registration of the component and its reporter.
//
// dorvantos encode-password TEXT: the form in which hosts pass a password to Login and
// the settings keep it.

#include <fmt/format.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <optional>
#include <string>
#include <system_error>

#include "commands.h"
#include "setup_settings.h"
#include "common/PasswordCodec.h"
#include "platform/ado/Database.h"
#include "platform/registry/Registry.h"
#include "platform/registry/Store.h"

namespace app {

namespace {

constexpr const char* kSetupUsage =
    "usage: dorvantos setup-demo [--db PATH] [--registry PATH] [--user NAME] "
    "[--password TEXT] [--force]\n";
constexpr const char* kEncodeUsage = "usage: dorvantos encode-password TEXT\n";

struct SetupOptions {
  std::string db;
  std::string user = "demo";
  std::string password = "demo";
  bool force = false;
};

int SetupUsage() {
  std::fputs(kSetupUsage, stderr);
  return 2;
}

// $XDG_DATA_HOME/poc-dorvantos/demo.db, ~/.local/share when it is unset.
std::string DefaultDatabasePath() {
  std::filesystem::path base;
  if (const char* data = std::getenv("XDG_DATA_HOME"); data && *data) {
    base = data;
  } else {
    const char* home = std::getenv("HOME");
    base = std::filesystem::path(home && *home ? home : ".") / ".local" / "share";
  }
  return (base / "poc-dorvantos" / "demo.db").string();
}

std::optional<SetupOptions> ParseSetup(const Args& args) {
  SetupOptions options;
  for (size_t i = 0; i < args.size(); ++i) {
    const std::string& arg = args[i];
    if (arg == "--force") {
      options.force = true;
      continue;
    }
    if (i + 1 >= args.size()) return std::nullopt;
    const std::string& value = args[++i];
    if (arg == "--db") options.db = value;
    else if (arg == "--registry") registry::Store::SetDefaultPath(value);
    else if (arg == "--user") options.user = value;
    else if (arg == "--password") options.password = value;
    else return std::nullopt;
  }
  if (options.user.empty() || options.password.empty()) return std::nullopt;
  if (options.db.empty()) options.db = DefaultDatabasePath();
  return options;
}

void CreateDemoDatabase(const SetupOptions& options, const std::string& sharedPassword) {
  namespace fs = std::filesystem;
  fs::path folder = fs::path(options.db).parent_path();
  // A folder made here is private; one that exists is the person's choice.
  if (!folder.empty() && !fs::exists(folder)) {
    fs::create_directories(folder);
    fs::permissions(folder, fs::perms::owner_all, fs::perm_options::replace);
  }
  ado::CreateOptions create;
  create.demoData = true;
  create.replaceExisting = options.force;
  ado::CreateDatabase(options.db,
                      {{kSharedLogin, sharedPassword}, {options.user, options.password}}, create);
  // The ledger and the login hashes are its owner's alone, like the settings file.
  fs::permissions(options.db, fs::perms::owner_read | fs::perms::owner_write,
                  fs::perm_options::replace);
}

}  // namespace

int RunSetupDemo(const Args& args) {
  std::optional<SetupOptions> options = ParseSetup(args);
  if (!options) return SetupUsage();
  if (options->user == kSharedLogin) {
    fmt::print(stderr, "dorvantos setup-demo: the login '{}' is the component's own; choose another\n",
               kSharedLogin);
    return 2;
  }
  std::error_code ignored;
  if (std::filesystem::exists(options->db, ignored) && !options->force) {
    fmt::print(stderr, "dorvantos setup-demo: {} exists; --force replaces it\n", options->db);
    return 1;
  }
  try {
    const std::string sharedPassword = RandomPassword();
    CreateDemoDatabase(*options, sharedPassword);
    WriteConnectionSettings("sqlite:" + options->db, "POC", sharedPassword);
  } catch (const std::exception& e) {
    fmt::print(stderr, "dorvantos setup-demo: {}\n", e.what());
    return 1;
  }
  int registered = RunRegister({});
  fmt::print("database: {}\n", options->db);
  fmt::print("settings: {}\n", registry::Store::Default().Path());
  fmt::print("demo login: {} (Login takes its password encoded: {})\n", options->user,
             common::EncodePassword(options->password));
  return registered;
}

int RunEncodePassword(const Args& args) {
  if (args.size() != 1) {
    std::fputs(kEncodeUsage, stderr);
    return 2;
  }
  try {
    fmt::print("{}\n", common::EncodePassword(args[0]));
  } catch (const std::exception& e) {
    fmt::print(stderr, "dorvantos encode-password: {}\n", e.what());
    return 1;
  }
  return 0;
}

}  // namespace app
