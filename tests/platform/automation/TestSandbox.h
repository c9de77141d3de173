#pragma once
// A private settings store and error log for one test, and the places of the server
// libraries the build made.

#include <stdlib.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include "platform/registry/Store.h"

namespace dvtest {

class Sandbox {
 public:
  Sandbox() {
    char pattern[] = "/tmp/dv-automation-XXXXXX";
    directory_ = mkdtemp(pattern);
    registry::Store::SetDefaultPath(directory_ + "/registry.reg");
    setenv("POC_ERROR_LOG", ErrorLog().c_str(), 1);
  }
  ~Sandbox() {
    unsetenv("POC_ERROR_LOG");
    std::error_code ignored;
    std::filesystem::remove_all(directory_, ignored);
  }
  Sandbox(const Sandbox&) = delete;
  Sandbox& operator=(const Sandbox&) = delete;

  const std::string& Directory() const { return directory_; }
  std::string ErrorLog() const { return directory_ + "/errors.log"; }

  std::vector<std::string> ErrorLogLines() const {
    std::vector<std::string> lines;
    std::ifstream in(ErrorLog());
    for (std::string line; std::getline(in, line);) lines.push_back(line);
    return lines;
  }

 private:
  std::string directory_;
};

// The build's lib/ directory: $POC_TEST_LIB under ctest, else ../lib beside the test.
inline std::string LibDirectory() {
  if (const char* lib = std::getenv("POC_TEST_LIB"); lib && *lib) return lib;
  return std::filesystem::canonical("/proc/self/exe").parent_path().parent_path() / "lib";
}

inline std::string LibraryPath(const std::string& name) {
  return std::filesystem::canonical(std::filesystem::path(LibDirectory()) / name);
}

}  // namespace dvtest
