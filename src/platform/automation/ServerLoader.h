#pragma once
// Loading in-process server libraries. A library is loaded once per process and never
// unloaded, as a COM host keeps its servers: objects it made may outlive any count we
// could keep of them.

#include <stdexcept>
#include <string>

#include "platform/automation/InprocServer.h"

namespace automation {

// A library that could not be loaded, or that is no in-process server.
class ServerLoadError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

struct LoadedServer {
  std::string path;  // where the loader found it, absolute
  DllRegisterServerFn registerServer = nullptr;
  DllUnregisterServerFn unregisterServer = nullptr;
  DllGetClassObjectFn getClassObject = nullptr;
  DllCanUnloadNowFn canUnloadNow = nullptr;
};

// Loads the library (a path, or a bare name searched as the dynamic loader searches)
// and finds its entry points. DllGetClassObject is required; the others may be absent.
// Raises ServerLoadError with the loader's own explanation.
const LoadedServer& LoadInprocServer(const std::string& path);

}  // namespace automation
