#include "platform/automation/ServerLoader.h"

#include <dlfcn.h>
#include <limits.h>
#include <stdlib.h>

#include <memory>
#include <mutex>
#include <unordered_map>

#include <fmt/format.h>

namespace automation {

namespace {

struct LoadedServers {
  std::mutex mutex;
  // By the path as asked and by the resolved path, so both find the one load.
  std::unordered_map<std::string, std::shared_ptr<const LoadedServer>> byPath;
};

LoadedServers& Servers() {
  static LoadedServers* servers = new LoadedServers;  // outlives every static destructor
  return *servers;
}

std::string Resolve(const std::string& path) {
  if (path.find('/') == std::string::npos) return path;  // left to the loader's search
  char resolved[PATH_MAX];
  return realpath(path.c_str(), resolved) != nullptr ? std::string(resolved) : path;
}

template <class Fn>
Fn Find(void* handle, const char* name) {
  return reinterpret_cast<Fn>(dlsym(handle, name));
}

std::shared_ptr<const LoadedServer> Load(const std::string& path) {
  dlerror();
  void* handle = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL | RTLD_NODELETE);
  if (handle == nullptr) {
    const char* why = dlerror();
    // The loader's own text already names the file.
    throw ServerLoadError(why ? fmt::format("cannot load {}", why)
                              : fmt::format("cannot load {}: unknown reason", path));
  }
  auto server = std::make_shared<LoadedServer>();
  server->path = path;
  server->registerServer = Find<DllRegisterServerFn>(handle, "DllRegisterServer");
  server->unregisterServer = Find<DllUnregisterServerFn>(handle, "DllUnregisterServer");
  server->getClassObject = Find<DllGetClassObjectFn>(handle, "DllGetClassObject");
  server->canUnloadNow = Find<DllCanUnloadNowFn>(handle, "DllCanUnloadNow");
  if (server->getClassObject == nullptr) {
    // The handle stays open: RTLD_NODELETE keeps the library anyway, and a second
    // attempt finds the same answer in the cache.
    throw ServerLoadError(
        fmt::format("{} is no in-process server: it does not export DllGetClassObject", path));
  }
  // Where the loader found it, for a bare name searched along the library path.
  std::string found = ModulePathOf(reinterpret_cast<const void*>(server->getClassObject));
  if (!found.empty()) server->path = found;
  return server;
}

}  // namespace

const LoadedServer& LoadInprocServer(const std::string& path) {
  LoadedServers& servers = Servers();
  std::lock_guard lock(servers.mutex);
  if (auto found = servers.byPath.find(path); found != servers.byPath.end()) {
    return *found->second;
  }
  std::string resolved = Resolve(path);
  if (auto found = servers.byPath.find(resolved); found != servers.byPath.end()) {
    servers.byPath.emplace(path, found->second);
    return *found->second;
  }
  std::shared_ptr<const LoadedServer> server = Load(resolved);
  servers.byPath.emplace(resolved, server);
  servers.byPath.emplace(path, server);
  return *server;
}

}  // namespace automation
