#include "platform/forms/DesktopLoader.h"

#include <dlfcn.h>

#include <cstdlib>
#include <string>

#include "platform/forms/Desktop.h"

namespace forms {

namespace {

constexpr const char* kLibrary = "libdv_qt.so";

bool DisplayPresent() {
  for (const char* name : {"DISPLAY", "WAYLAND_DISPLAY", "QT_QPA_PLATFORM"}) {
    const char* value = std::getenv(name);
    if (value && *value) return true;
  }
  return false;
}

// The Qt library sits in the same lib/ directory as the library this function is in.
std::string SiblingLibrary() {
  Dl_info info{};
  if (dladdr(reinterpret_cast<void*>(&LoadGraphicalDesktop), &info) == 0 || !info.dli_fname)
    return {};
  std::string self = info.dli_fname;
  auto slash = self.rfind('/');
  return slash == std::string::npos ? std::string(kLibrary) : self.substr(0, slash + 1) + kLibrary;
}

// The Qt library once loaded; it stays, as Qt does not survive being unloaded.
void*& LoadedLibrary() {
  static void* library = nullptr;
  return library;
}

}  // namespace

bool LoadGraphicalDesktop() {
  if (Desktop::Installed() || !DisplayPresent()) return false;
  void*& library = LoadedLibrary();
  if (!library) {
    std::string path = SiblingLibrary();
    if (!path.empty()) library = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL);
  }
  if (!library) return false;
  using InstallFn = Desktop* (*)();
  auto install = reinterpret_cast<InstallFn>(dlsym(library, "dv_qt_install_desktop"));
  return install && install() != nullptr;
}

bool RunGraphicalDesktop() {
  void* library = Desktop::Installed() ? LoadedLibrary() : nullptr;
  if (!library) return false;
  using RunFn = int (*)();
  auto run = reinterpret_cast<RunFn>(dlsym(library, "dv_qt_run_while_forms_show"));
  return run && run() != 0;
}

}  // namespace forms
