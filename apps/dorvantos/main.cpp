// dorvantos: the reference host of the component. With no verb it opens the journal
// editor; the verbs set up and look after what the component needs on this machine.

#include <fmt/format.h>

#include <cstdio>
#include <functional>
#include <map>
#include <string>

#include "commands.h"
#include "platform/registry/Store.h"

namespace {

constexpr const char* kUsage =
    "usage: dorvantos [--registry FILE] [--user NAME] [--password TEXT] [--open ID | --line ID]\n"
    "       dorvantos [--registry FILE] VERB [ARGS...]\n"
    "\n"
    "Without a verb, opens the list of the journal's entries (--open: an entry; --line: the\n"
    "entry of a line, in the editor at once), logged in as NAME (default: the demo login).\n"
    "\n"
    "verbs:\n"
    "  --version                  print the version\n"
    "  register [LIBRARY...]      register the component and its peers in the settings store\n"
    "  unregister [LIBRARY...]    remove their registration\n"
    "  reg query PATH [NAME]      show a key's values, or one value\n"
    "  reg add PATH NAME VALUE    write a string value (creates the key)\n"
    "  reg delete PATH [NAME]     delete a value, or a key with everything below it\n"
    "  reg import FILE            merge a .reg file into the settings store\n"
    "  reg export PATH FILE       write a key and everything below it to a .reg file\n"
    "  user add NAME [--password TEXT] [--db PATH]\n"
    "                             add or change a database login of the embedded engine\n"
    "  setup-demo [--db PATH] [--registry PATH] [--user NAME] [--password TEXT] [--force]\n"
    "                             create the demo database, its logins and the settings,\n"
    "                             and register the component\n"
    "  setup-server --server SOURCE --admin-user NAME [--admin-password TEXT] [--catalog NAME]\n"
    "               [--user NAME] [--password TEXT] [--no-demo-data] [--force]\n"
    "                             create the ledger on a PostgreSQL or SQL Server server, its\n"
    "                             logins and the settings, and register the component\n"
    "  encode-password TEXT       print a password in the form Login and the settings take\n"
    "  automate [--registry PATH] drive the component with JSON lines on stdin and stdout\n"
    "  demo [--user NAME] [--password TEXT]\n"
    "                             keep one entry through the windows without a display and\n"
    "                             print each step and the journal\n";

int Usage() {
  std::fputs(kUsage, stderr);
  return 2;
}

}  // namespace

int main(int argc, char** argv) {
  app::Args args(argv + 1, argv + argc);
  // A settings file named on the command line wins over the environment.
  if (args.size() >= 2 && args[0] == "--registry") {
    registry::Store::SetDefaultPath(args[1]);
    args.erase(args.begin(), args.begin() + 2);
  }
  // No verb, or only the editor's options: the journal editor in real windows.
  const bool editorOption = !args.empty() && args[0].rfind("--", 0) == 0 &&
                            args[0] != "--version" && args[0] != "--help";
  if (args.empty() || editorOption) return app::RunEditor(args);

  const std::string verb = args[0];
  const app::Args rest(args.begin() + 1, args.end());
  if (verb == "--version") {
    fmt::print("dorvantos {}\n", DV_VERSION);
    return 0;
  }
  static const std::map<std::string, std::function<int(const app::Args&)>> verbs = {
      {"register", app::RunRegister},
      {"unregister", app::RunUnregister},
      {"reg", app::RunReg},
      {"user", app::RunUser},
      {"setup-demo", app::RunSetupDemo},
      {"setup-server", app::RunSetupServer},
      {"encode-password", app::RunEncodePassword},
      {"automate", app::RunAutomate},
      {"demo", app::RunDemo},
  };
  const auto it = verbs.find(verb);
  if (it == verbs.end()) return Usage();
  return it->second(rest);
}
