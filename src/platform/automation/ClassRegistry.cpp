#include "platform/automation/ClassRegistry.h"

#include <cctype>

#include <fmt/format.h>

#include "platform/registry/Registry.h"

namespace automation {

namespace {

using registry::HKEY;
using registry::HKEY_CLASSES_ROOT;

// Where a type library's server path goes: the platform subkey of a 64-bit server.
constexpr const char* kTypeLibPlatform = sizeof(void*) == 8 ? "win64" : "win32";

class OpenKey {
 public:
  OpenKey() = default;
  OpenKey(const OpenKey&) = delete;
  OpenKey& operator=(const OpenKey&) = delete;
  ~OpenKey() {
    if (handle_) registry::RegCloseKey(handle_);
  }
  HKEY* Out() { return &handle_; }
  HKEY Get() const { return handle_; }

 private:
  HKEY handle_ = 0;
};

std::string ClassKey(std::string_view clsid) { return fmt::format("CLSID\\{}", clsid); }
std::string TypeLibKey(const TypeLibrary& library) {
  return fmt::format("TypeLib\\{}", library.libid);
}

void SetString(const std::string& path, std::string_view name, const std::string& value) {
  OpenKey key;
  long rc = registry::RegCreateKeyEx(HKEY_CLASSES_ROOT, path, key.Out());
  if (rc == registry::ERROR_SUCCESS) {
    // String data carries its terminating zero, as RegSetValueEx expects.
    rc = registry::RegSetValueEx(key.Get(), name, registry::REG_SZ, value.c_str(),
                                 static_cast<uint32_t>(value.size() + 1));
  }
  if (rc != registry::ERROR_SUCCESS) {
    throw RegistrationError(
        fmt::format("cannot write HKEY_CLASSES_ROOT\\{} (error {})", path, rc));
  }
}

void SetDefault(const std::string& path, const std::string& value) { SetString(path, "", value); }

void DeleteTree(const std::string& path) {
  long rc = registry::RegDeleteTree(HKEY_CLASSES_ROOT, path);
  if (rc != registry::ERROR_SUCCESS && rc != registry::ERROR_FILE_NOT_FOUND) {
    throw RegistrationError(
        fmt::format("cannot delete HKEY_CLASSES_ROOT\\{} (error {})", path, rc));
  }
}

std::optional<std::string> ReadString(const std::string& path, std::string_view name = {}) {
  OpenKey key;
  if (registry::RegOpenKeyEx(HKEY_CLASSES_ROOT, path, 0, registry::KEY_READ, key.Out()) !=
      registry::ERROR_SUCCESS) {
    return std::nullopt;
  }
  uint32_t type = 0;
  uint32_t size = 0;
  if (registry::RegQueryValueEx(key.Get(), name, &type, nullptr, &size) !=
          registry::ERROR_SUCCESS ||
      (type != registry::REG_SZ && type != registry::REG_EXPAND_SZ)) {
    return std::nullopt;
  }
  std::string data(size, '\0');
  if (registry::RegQueryValueEx(key.Get(), name, &type, data.data(), &size) !=
      registry::ERROR_SUCCESS) {
    return std::nullopt;
  }
  data.resize(size);
  while (!data.empty() && data.back() == '\0') data.pop_back();
  return data;
}

std::string DirectoryOf(const std::string& path) {
  size_t slash = path.find_last_of('/');
  return slash == std::string::npos ? std::string() : path.substr(0, slash);
}

void RequireValid(const ClassEntry& entry) {
  if (!IsValidProgID(entry.progId)) {
    throw RegistrationError(fmt::format("invalid ProgID \"{}\"", entry.progId));
  }
  if (!IsValidGuid(entry.clsid)) {
    throw RegistrationError(fmt::format("invalid CLSID \"{}\"", entry.clsid));
  }
}

}  // namespace

bool IsValidProgID(std::string_view progId) {
  if (progId.empty() || progId.size() > 39) return false;
  if (std::isdigit(static_cast<unsigned char>(progId.front()))) return false;
  for (char c : progId) {
    if (!std::isalnum(static_cast<unsigned char>(c)) && c != '_' && c != '.') return false;
  }
  return true;
}

bool IsValidGuid(std::string_view guid) {
  static constexpr std::string_view kShape = "{XXXXXXXX-XXXX-XXXX-XXXX-XXXXXXXXXXXX}";
  if (guid.size() != kShape.size()) return false;
  for (size_t i = 0; i < guid.size(); ++i) {
    bool ok = kShape[i] == 'X' ? std::isxdigit(static_cast<unsigned char>(guid[i])) != 0
                               : guid[i] == kShape[i];
    if (!ok) return false;
  }
  return true;
}

bool SameGuid(std::string_view a, std::string_view b) {
  if (a.size() != b.size()) return false;
  for (size_t i = 0; i < a.size(); ++i) {
    if (std::toupper(static_cast<unsigned char>(a[i])) !=
        std::toupper(static_cast<unsigned char>(b[i]))) {
      return false;
    }
  }
  return true;
}

void RegisterClass(const ClassEntry& entry, const TypeLibrary& library,
                   const std::string& serverPath) {
  RequireValid(entry);
  SetDefault(entry.progId, entry.progId);
  SetDefault(entry.progId + "\\CLSID", entry.clsid);

  const std::string key = ClassKey(entry.clsid);
  SetDefault(key, entry.className);
  SetDefault(key + "\\InprocServer32", serverPath);
  SetString(key + "\\InprocServer32", "ThreadingModel", "Apartment");
  SetDefault(key + "\\ProgID", entry.progId);
  if (!library.libid.empty()) {
    SetDefault(key + "\\TypeLib", library.libid);
    SetDefault(key + "\\VERSION", library.version);
  }
}

void UnregisterClass(const ClassEntry& entry) {
  RequireValid(entry);
  std::optional<std::string> registered = CLSIDFromProgID(entry.progId);
  if (registered && SameGuid(*registered, entry.clsid)) DeleteTree(entry.progId);
  DeleteTree(ClassKey(entry.clsid));
}

void RegisterTypeLib(const TypeLibrary& library, const std::string& serverPath) {
  if (!IsValidGuid(library.libid)) {
    throw RegistrationError(fmt::format("invalid LIBID \"{}\"", library.libid));
  }
  const std::string key = TypeLibKey(library) + "\\" + library.version;
  SetDefault(key, library.name);
  SetDefault(fmt::format("{}\\0\\{}", key, kTypeLibPlatform), serverPath);
  SetDefault(key + "\\FLAGS", "0");
  SetDefault(key + "\\HELPDIR", DirectoryOf(serverPath));
}

void UnregisterTypeLib(const TypeLibrary& library) {
  if (!IsValidGuid(library.libid)) {
    throw RegistrationError(fmt::format("invalid LIBID \"{}\"", library.libid));
  }
  DeleteTree(TypeLibKey(library));
}

std::optional<std::string> CLSIDFromProgID(std::string_view progId) {
  if (!IsValidProgID(progId)) return std::nullopt;
  std::optional<std::string> clsid = ReadString(std::string(progId) + "\\CLSID");
  if (!clsid || !IsValidGuid(*clsid)) return std::nullopt;
  return clsid;
}

std::optional<std::string> InprocServerOf(std::string_view clsid) {
  if (!IsValidGuid(clsid)) return std::nullopt;
  std::optional<std::string> path = ReadString(ClassKey(clsid) + "\\InprocServer32");
  if (!path || path->empty()) return std::nullopt;
  return path;
}

std::vector<ClassEntry> ClassesServedBy(const std::string& serverPath) {
  std::vector<std::string> clsids;
  {
    OpenKey classes;
    if (registry::RegOpenKeyEx(HKEY_CLASSES_ROOT, "CLSID", 0, registry::KEY_READ,
                               classes.Out()) != registry::ERROR_SUCCESS) {
      return {};
    }
    std::string name;
    for (uint32_t i = 0; registry::RegEnumKey(classes.Get(), i, &name) == registry::ERROR_SUCCESS;
         ++i) {
      if (IsValidGuid(name)) clsids.push_back(name);
    }
  }
  std::vector<ClassEntry> served;
  for (const std::string& clsid : clsids) {
    if (InprocServerOf(clsid) != serverPath) continue;
    served.push_back(ClassEntry{ReadString(ClassKey(clsid)).value_or(""),
                                ReadString(ClassKey(clsid) + "\\ProgID").value_or(""), clsid});
  }
  return served;
}

}  // namespace automation
