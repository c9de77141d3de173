// dorvantos setup-server: a ledger on a database server, for an office where several
// people on several computers keep the same books. Creates the database on the server
// (PostgreSQL, "postgresql://HOST[:PORT]", or SQL Server, "HOST", "HOST,PORT" or
// "HOST\INSTANCE") with the schema, the demo data and the logins, writes the
// component's connection settings, and registers the component.
//
// The administrator's password is read from $POC_ADMIN_PASSWORD when --admin-password
// is not given, so it need not show in the list of processes.

#include <fmt/format.h>

#include <cstdlib>
#include <optional>
#include <string>

#include "commands.h"
#include "common/PasswordCodec.h"
#include "platform/ado/ServerDatabase.h"
#include "platform/registry/Store.h"
#include "setup_settings.h"

namespace app {

namespace {

constexpr const char* kUsage =
    "usage: dorvantos setup-server --server SOURCE --admin-user NAME [--admin-password TEXT]\n"
    "                              [--catalog NAME] [--user NAME] [--password TEXT]\n"
    "                              [--registry PATH] [--no-demo-data] [--force]\n"
    "  SOURCE: postgresql://HOST[:PORT], or a SQL Server: HOST, HOST,PORT or HOST\\INSTANCE\n"
    "  the administrator's password may come from $POC_ADMIN_PASSWORD instead\n";

int Usage() {
  std::fputs(kUsage, stderr);
  return 2;
}

struct ServerOptions {
  ado::ServerSetup setup;
  std::string user = "demo";
  std::string password = "demo";
};

std::optional<ServerOptions> Parse(const Args& args) {
  ServerOptions options;
  options.setup.catalog = "POC";
  for (size_t i = 0; i < args.size(); ++i) {
    const std::string& arg = args[i];
    if (arg == "--force") { options.setup.replaceExisting = true; continue; }
    if (arg == "--no-demo-data") { options.setup.demoData = false; continue; }
    if (i + 1 >= args.size()) return std::nullopt;
    const std::string& value = args[++i];
    if (arg == "--server") options.setup.dataSource = value;
    else if (arg == "--admin-user") options.setup.adminUser = value;
    else if (arg == "--admin-password") options.setup.adminPassword = value;
    else if (arg == "--catalog") options.setup.catalog = value;
    else if (arg == "--user") options.user = value;
    else if (arg == "--password") options.password = value;
    else if (arg == "--registry") registry::Store::SetDefaultPath(value);
    else return std::nullopt;
  }
  if (options.setup.adminPassword.empty())
    if (const char* env = std::getenv("POC_ADMIN_PASSWORD")) options.setup.adminPassword = env;
  if (options.setup.dataSource.empty() || options.setup.adminUser.empty() || options.setup.catalog.empty() ||
      options.user.empty() || options.password.empty())
    return std::nullopt;
  return options;
}

}  // namespace

int RunSetupServer(const Args& args) {
  std::optional<ServerOptions> options = Parse(args);
  if (!options) return Usage();
  if (options->user == kSharedLogin) {
    fmt::print(stderr, "dorvantos setup-server: the login '{}' is the component's own; choose another\n",
               kSharedLogin);
    return 2;
  }
  const std::string sharedPassword = RandomPassword();
  options->setup.logins = {{kSharedLogin, sharedPassword}, {options->user, options->password}};
  try {
    fmt::print("creating the database {} on {}...\n", options->setup.catalog, options->setup.dataSource);
    std::fflush(stdout);
    ado::CreateServerDatabase(options->setup);
    WriteConnectionSettings(options->setup.dataSource, options->setup.catalog, sharedPassword);
  } catch (const std::exception& e) {
    fmt::print(stderr, "dorvantos setup-server: {}\n", e.what());
    return 1;
  }
  int registered = RunRegister({});
  fmt::print("server: {}\ndatabase: {}\n", options->setup.dataSource, options->setup.catalog);
  fmt::print("settings: {}\n", registry::Store::Default().Path());
  fmt::print("login: {} (Login takes its password encoded: {})\n", options->user,
             common::EncodePassword(options->password));
  return registered;
}

}  // namespace app
