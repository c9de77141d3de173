#include "platform/automation/HResult.h"

#include <fmt/format.h>

namespace automation {

namespace {

const char* Meaning(HRESULT hr) {
  switch (hr) {
    case S_OK: return "success";
    case S_FALSE: return "success, with nothing done";
    case E_UNEXPECTED: return "unexpected failure";
    case E_POINTER: return "invalid pointer";
    case E_FAIL: return "unspecified failure";
    case E_OUTOFMEMORY: return "out of memory";
    case E_INVALIDARG: return "invalid argument";
    case CLASS_E_CLASSNOTAVAILABLE: return "class not available";
    case SELFREG_E_TYPELIB: return "the type library could not be registered";
    case SELFREG_E_CLASS: return "the classes could not be registered";
    default: return "unknown status";
  }
}

thread_local std::string t_errorInfo;

}  // namespace

std::string HResultText(HRESULT hr) {
  return fmt::format("0x{:08X} ({})", static_cast<uint32_t>(hr), Meaning(hr));
}

void SetErrorInfo(std::string description) { t_errorInfo = std::move(description); }

std::string TakeErrorInfo() {
  std::string taken = std::move(t_errorInfo);
  t_errorInfo.clear();
  return taken;
}

}  // namespace automation
