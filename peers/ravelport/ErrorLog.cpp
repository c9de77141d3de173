#include "ErrorLog.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <stdexcept>

#include <fmt/format.h>

namespace ravelport {

namespace {

std::string Env(const char* name) {
  const char* value = std::getenv(name);
  return value ? value : "";
}

std::string StateHome() {
  std::string state = Env("XDG_STATE_HOME");
  if (!state.empty() && state.front() == '/') return state;
  std::string home = Env("HOME");
  if (home.empty()) throw std::runtime_error("neither XDG_STATE_HOME nor HOME is set");
  return home + "/.local/state";
}

bool IsDefaultPlace() { return Env("POC_ERROR_LOG").empty(); }

// mkdir -p with mode 0700 for what it creates; existing directories are left alone.
void MakeDirectories(const std::string& directory) {
  for (size_t slash = directory.find('/', 1); ; slash = directory.find('/', slash + 1)) {
    std::string prefix = directory.substr(0, slash);
    if (mkdir(prefix.c_str(), 0700) != 0 && errno != EEXIST) {
      throw std::runtime_error(
          fmt::format("cannot create the directory {}: {}", prefix, std::strerror(errno)));
    }
    if (slash == std::string::npos) return;
  }
}

std::string DirectoryOf(const std::string& path) {
  size_t slash = path.find_last_of('/');
  return slash == std::string::npos || slash == 0 ? std::string() : path.substr(0, slash);
}

}  // namespace

std::string ErrorLogPath() {
  std::string explicitPath = Env("POC_ERROR_LOG");
  if (!explicitPath.empty()) return explicitPath;
  return StateHome() + "/poc-dorvantos/errors.log";
}

void AppendLine(const std::string& path, const std::string& line) {
  if (IsDefaultPlace()) {
    std::string directory = DirectoryOf(path);
    if (!directory.empty()) MakeDirectories(directory);
  }
  int fd = open(path.c_str(), O_WRONLY | O_APPEND | O_CREAT | O_CLOEXEC, 0600);
  if (fd < 0) {
    throw std::runtime_error(fmt::format("cannot open {}: {}", path, std::strerror(errno)));
  }
  std::string record = line + "\n";
  ssize_t written = write(fd, record.data(), record.size());
  int writeErrno = errno;
  close(fd);
  if (written != static_cast<ssize_t>(record.size())) {
    throw std::runtime_error(fmt::format(
        "cannot write to {}: {}", path,
        written < 0 ? std::strerror(writeErrno) : "the line was cut short"));
  }
}

}  // namespace ravelport
