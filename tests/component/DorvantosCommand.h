#pragma once
// The dorvantos command as a person types it: run with its arguments, its exit status
// and everything it printed.

#include <sys/wait.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>

namespace dvtest {

// The build's bin/ directory: $POC_TEST_BIN under ctest, else the test's own folder.
inline std::string Dorvantos() {
  if (const char* bin = std::getenv("POC_TEST_BIN"); bin && *bin) return std::string(bin) + "/dorvantos";
  return (std::filesystem::canonical("/proc/self/exe").parent_path() / "dorvantos").string();
}

struct Outcome {
  int status = -1;
  std::string output;
};

inline Outcome Command(const std::string& arguments) {
  Outcome run;
  std::string line = "'" + Dorvantos() + "' " + arguments + " 2>&1";
  FILE* pipe = popen(line.c_str(), "r");
  if (!pipe) return run;
  char buffer[512];
  for (size_t n; (n = fread(buffer, 1, sizeof buffer, pipe)) > 0;) run.output.append(buffer, n);
  int status = pclose(pipe);
  run.status = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  return run;
}

}  // namespace dvtest
