// dorvantos register / unregister: what regsvr32 does for an in-process server. Each
// library is loaded and its own DllRegisterServer or DllUnregisterServer writes or
// removes its classes in the class registry.

#include <limits.h>
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <string>
#include <vector>

#include <fmt/format.h>

#include "commands.h"
#include "platform/automation/ClassRegistry.h"
#include "platform/automation/HResult.h"
#include "platform/automation/ServerLoader.h"

namespace app {

namespace {

// The servers that ship beside the executable, in ../lib.
const char* const kDefaultServers[] = {"libpoc_dorvantos.so", "libravelport.so", "librecordfinder.so"};

std::string ExecutableDirectory() {
  char path[PATH_MAX];
  ssize_t length = readlink("/proc/self/exe", path, sizeof path - 1);
  if (length <= 0) return ".";
  std::string executable(path, static_cast<size_t>(length));
  size_t slash = executable.find_last_of('/');
  return slash == std::string::npos ? std::string(".") : executable.substr(0, slash);
}

std::vector<std::string> Libraries(const Args& args) {
  if (!args.empty()) return args;
  std::vector<std::string> libraries;
  std::string libDirectory = ExecutableDirectory() + "/../lib/";
  for (const char* name : kDefaultServers) libraries.push_back(libDirectory + name);
  return libraries;
}

std::string ProgIdList(const std::vector<automation::ClassEntry>& classes) {
  std::vector<std::string> names;
  for (const auto& entry : classes) names.push_back(entry.progId.empty() ? entry.clsid : entry.progId);
  std::sort(names.begin(), names.end());
  std::string list;
  for (const std::string& name : names) {
    if (!list.empty()) list += ", ";
    list += name;
  }
  return list.empty() ? std::string("no classes") : list;
}

std::string Failure(automation::HRESULT hr) {
  std::string info = automation::TakeErrorInfo();
  std::string text = automation::HResultText(hr);
  return info.empty() ? text : fmt::format("{}: {}", text, info);
}

bool WrongArguments(const Args& args, const char* verb) {
  for (const std::string& arg : args) {
    if (!arg.empty() && arg.front() == '-') {
      std::fprintf(stderr, "usage: dorvantos %s [LIBRARY...]\n", verb);
      return true;
    }
  }
  return false;
}

bool Register(const std::string& library) {
  const automation::LoadedServer& server = automation::LoadInprocServer(library);
  if (server.registerServer == nullptr) {
    std::fprintf(stderr, "dorvantos register: %s does not export DllRegisterServer\n",
                 server.path.c_str());
    return false;
  }
  automation::TakeErrorInfo();
  automation::HRESULT hr = server.registerServer();
  if (automation::FAILED(hr)) {
    std::fprintf(stderr, "dorvantos register: DllRegisterServer of %s failed: %s\n",
                 server.path.c_str(), Failure(hr).c_str());
    return false;
  }
  std::printf("registered %s (%s)\n",
              ProgIdList(automation::ClassesServedBy(server.path)).c_str(), server.path.c_str());
  return true;
}

bool Unregister(const std::string& library) {
  const automation::LoadedServer& server = automation::LoadInprocServer(library);
  if (server.unregisterServer == nullptr) {
    std::fprintf(stderr, "dorvantos unregister: %s does not export DllUnregisterServer\n",
                 server.path.c_str());
    return false;
  }
  // Asked before: afterwards the registry no longer knows them.
  std::vector<automation::ClassEntry> classes = automation::ClassesServedBy(server.path);
  automation::TakeErrorInfo();
  automation::HRESULT hr = server.unregisterServer();
  if (automation::FAILED(hr)) {
    std::fprintf(stderr, "dorvantos unregister: DllUnregisterServer of %s failed: %s\n",
                 server.path.c_str(), Failure(hr).c_str());
    return false;
  }
  std::printf("unregistered %s (%s)\n", ProgIdList(classes).c_str(), server.path.c_str());
  return true;
}

// Runs one verb over every library; a library that fails does not stop the others.
int ForEachLibrary(const Args& args, const char* verb, bool (*action)(const std::string&)) {
  if (WrongArguments(args, verb)) return 2;
  int status = 0;
  for (const std::string& library : Libraries(args)) {
    try {
      if (!action(library)) status = 1;
    } catch (const std::exception& e) {
      std::fprintf(stderr, "dorvantos %s: %s\n", verb, e.what());
      status = 1;
    }
  }
  return status;
}

}  // namespace

int RunRegister(const Args& args) { return ForEachLibrary(args, "register", Register); }

int RunUnregister(const Args& args) { return ForEachLibrary(args, "unregister", Unregister); }

}  // namespace app
