#include "platform/automation/InprocServer.h"

#include <dlfcn.h>
#include <limits.h>
#include <stdlib.h>

#include <fmt/format.h>

namespace automation {

namespace {

void WriteRegistration(const ServerModule& module, const std::string& path) {
  for (const CoClass& coClass : module.classes) {
    RegisterClass(coClass.entry, module.typeLibrary, path);
  }
  if (!module.typeLibrary.libid.empty()) RegisterTypeLib(module.typeLibrary, path);
}

void RemoveRegistration(const ServerModule& module) {
  for (const CoClass& coClass : module.classes) UnregisterClass(coClass.entry);
  if (!module.typeLibrary.libid.empty()) UnregisterTypeLib(module.typeLibrary);
}

}  // namespace

std::string ModulePathOf(const void* address) {
  Dl_info info{};
  if (dladdr(address, &info) == 0 || info.dli_fname == nullptr || *info.dli_fname == '\0') {
    return {};
  }
  char resolved[PATH_MAX];
  if (realpath(info.dli_fname, resolved) == nullptr) return info.dli_fname;
  return resolved;
}

HRESULT RegisterServer(const ServerModule& module, const void* anchor) noexcept {
  try {
    std::string path = ModulePathOf(anchor);
    if (path.empty() || path.front() != '/') {
      SetErrorInfo("the server cannot tell the path of its own library");
      return SELFREG_E_CLASS;
    }
    WriteRegistration(module, path);
    return S_OK;
  } catch (const std::exception& e) {
    std::string failure = e.what();
    // Leave nothing half-registered: a ProgID that leads nowhere is worse than none.
    try {
      RemoveRegistration(module);
    } catch (const std::exception&) {
    }
    SetErrorInfo(failure);
    return SELFREG_E_CLASS;
  } catch (...) {
    return E_UNEXPECTED;
  }
}

HRESULT UnregisterServer(const ServerModule& module) noexcept {
  try {
    RemoveRegistration(module);
    return S_OK;
  } catch (const std::exception& e) {
    SetErrorInfo(e.what());
    return SELFREG_E_CLASS;
  } catch (...) {
    return E_UNEXPECTED;
  }
}

HRESULT GetClassObject(const ServerModule& module, const char* clsid,
                       IClassFactory** factory) noexcept {
  if (clsid == nullptr || factory == nullptr) return E_POINTER;
  *factory = nullptr;
  for (const CoClass& coClass : module.classes) {
    if (SameGuid(coClass.entry.clsid, clsid)) {
      *factory = coClass.factory;
      return S_OK;
    }
  }
  try {
    SetErrorInfo(fmt::format("the server has no class {}", clsid));
  } catch (...) {
  }
  return CLASS_E_CLASSNOTAVAILABLE;
}

}  // namespace automation
