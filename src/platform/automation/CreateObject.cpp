#include "platform/automation/CreateObject.h"

#include <optional>

#include <fmt/format.h>

#include "platform/automation/ClassObjects.h"
#include "platform/automation/ClassRegistry.h"
#include "platform/automation/ServerLoader.h"
#include "platform/vb/Error.h"

namespace automation {

namespace {

[[noreturn]] void CannotCreate(const std::string& progId, const std::string& why) {
  throw vb::Error(vb::kErrCannotCreateObject,
                  fmt::format("{}: {}", vb::DefaultDescription(vb::kErrCannotCreateObject), why), progId);
}

std::string Failure(HRESULT hr) {
  std::string info = TakeErrorInfo();
  return info.empty() ? HResultText(hr) : fmt::format("{}: {}", HResultText(hr), info);
}

}  // namespace

vb::ObjectPtr CreateObject(const std::string& progId) {
  if (!IsValidProgID(progId)) CannotCreate(progId, fmt::format("\"{}\" is no ProgID", progId));
  // A class this process serves itself comes before the class registry.
  if (ClassObjectFactory factory = FindClassObject(progId)) {
    vb::ObjectPtr object;
    try {
      object = factory();
    } catch (const std::exception& e) {
      CannotCreate(progId, fmt::format("{} could not make an instance: {}", progId, e.what()));
    }
    if (!object) CannotCreate(progId, fmt::format("{} could not make an instance", progId));
    return object;
  }
  return CreateRegisteredObject(progId);
}

vb::ObjectPtr CreateRegisteredObject(const std::string& progId) {
  if (!IsValidProgID(progId)) CannotCreate(progId, fmt::format("\"{}\" is no ProgID", progId));

  std::optional<std::string> clsid = CLSIDFromProgID(progId);
  if (!clsid) CannotCreate(progId, fmt::format("the class {} is not registered", progId));

  std::optional<std::string> path = InprocServerOf(*clsid);
  if (!path) {
    CannotCreate(progId, fmt::format("the class {} {} has no in-process server registered",
                                     progId, *clsid));
  }

  const LoadedServer* server = nullptr;
  try {
    server = &LoadInprocServer(*path);
  } catch (const ServerLoadError& e) {
    CannotCreate(progId, fmt::format("{}: {}", progId, e.what()));
  }

  TakeErrorInfo();  // whatever an earlier call left there is not about this one
  IClassFactory* factory = nullptr;
  HRESULT hr = server->getClassObject(clsid->c_str(), &factory);
  if (FAILED(hr) || factory == nullptr) {
    CannotCreate(progId, fmt::format("{} gives no class object for {}: {}", *path, *clsid,
                                     Failure(FAILED(hr) ? hr : E_POINTER)));
  }

  vb::ObjectPtr object;
  hr = factory->CreateInstance(&object);
  if (FAILED(hr) || object == nullptr) {
    CannotCreate(progId, fmt::format("{} could not make an instance: {}", progId,
                                     Failure(FAILED(hr) ? hr : E_POINTER)));
  }
  return object;
}

}  // namespace automation
