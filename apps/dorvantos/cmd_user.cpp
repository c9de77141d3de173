// dorvantos user add NAME [--password TEXT] [--db PATH]: adds a login to an embedded
// database. Without --password the password is asked for on the terminal, twice, with
// echo off. Without --db the database is the one the component's settings name.

#include <fmt/format.h>
#include <termios.h>
#include <unistd.h>

#include <cstdio>
#include <optional>
#include <string>

#include "commands.h"
#include "platform/ado/Database.h"
#include "platform/ado/Engine.h"
#include "platform/registry/Registry.h"

namespace app {

namespace {

constexpr const char* kUserUsage = "usage: dorvantos user add NAME [--password TEXT] [--db PATH]\n";
constexpr const char* kSettingsKey = "SOFTWARE\\Quorvex\\POC";

int UserUsage() {
  std::fputs(kUserUsage, stderr);
  return 2;
}

// The embedded database the component's "dtDataSource" setting names, if any.
std::optional<std::string> DatabaseFromSettings() {
  registry::HKEY key = 0;
  if (registry::RegOpenKeyEx(registry::HKEY_LOCAL_MACHINE, kSettingsKey, 0, registry::KEY_READ, &key) !=
      registry::ERROR_SUCCESS)
    return std::nullopt;
  uint32_t type = 0, size = 0;
  std::string data;
  if (registry::RegQueryValueEx(key, "dtDataSource", &type, nullptr, &size) == registry::ERROR_SUCCESS &&
      type == registry::REG_SZ) {
    data.resize(size);
    registry::RegQueryValueEx(key, "dtDataSource", &type, data.data(), &size);
    data.resize(data.find('\0') == std::string::npos ? size : data.find('\0'));
  }
  registry::RegCloseKey(key);
  std::string path = ado::EmbeddedDatabasePath(data);
  if (path.empty()) return std::nullopt;
  return path;
}

// Reads one line from the terminal with echo off; nullopt when there is no terminal.
std::optional<std::string> ReadHidden(const char* prompt) {
  FILE* tty = std::fopen("/dev/tty", "r+");
  if (!tty) return std::nullopt;
  int fd = fileno(tty);
  termios saved{};
  bool restore = tcgetattr(fd, &saved) == 0;
  if (restore) {
    termios quiet = saved;
    quiet.c_lflag &= ~static_cast<tcflag_t>(ECHO);
    tcsetattr(fd, TCSAFLUSH, &quiet);
  }
  std::fputs(prompt, tty);
  std::fflush(tty);
  std::string line;
  for (int c; (c = std::fgetc(tty)) != EOF && c != '\n';) line += static_cast<char>(c);
  if (restore) tcsetattr(fd, TCSAFLUSH, &saved);
  std::fputs("\n", tty);
  std::fclose(tty);
  return line;
}

std::optional<std::string> AskPassword() {
  auto first = ReadHidden("Password: ");
  if (!first) return std::nullopt;
  auto again = ReadHidden("Password (again): ");
  if (!again || *again != *first) {
    std::fputs("dorvantos: the passwords differ\n", stderr);
    return std::nullopt;
  }
  return first;
}

}  // namespace

int RunUser(const std::vector<std::string>& args) {
  if (args.size() < 2 || args[0] != "add") return UserUsage();
  const std::string name = args[1];
  std::optional<std::string> password, db;
  for (size_t i = 2; i < args.size(); i += 2) {
    if (i + 1 >= args.size()) return UserUsage();
    if (args[i] == "--password") password = args[i + 1];
    else if (args[i] == "--db") db = args[i + 1];
    else return UserUsage();
  }
  if (name.empty()) return UserUsage();
  if (!db) db = DatabaseFromSettings();
  if (!db) {
    std::fputs("dorvantos: no database: give --db PATH, or set dtDataSource in the settings\n", stderr);
    return 1;
  }
  if (!password) password = AskPassword();
  if (!password) {
    std::fputs("dorvantos: no password: give --password TEXT or run on a terminal\n", stderr);
    return 1;
  }
  try {
    ado::AddLoginToDatabase(*db, name, *password);
  } catch (const std::exception& e) {
    fmt::print(stderr, "dorvantos: {}\n", e.what());
    return 1;
  }
  fmt::print("login '{}' added to {}\n", name, *db);
  return 0;
}

}  // namespace app
