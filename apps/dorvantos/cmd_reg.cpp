// dorvantos reg: looking at and changing the settings store by registry path, the way
// reg.exe does on Windows, so setup scripts and people can reach the same settings the
// component reads.

#include <cstdio>
#include <fstream>
#include <iostream>
#include <iterator>
#include <optional>
#include <string>
#include <vector>

#include <fmt/format.h>

#include "commands.h"
#include "platform/registry/Registry.h"
#include "platform/registry/Store.h"

namespace app {

namespace {

using registry::HKEY;

constexpr const char* kRegUsage =
    "usage: dorvantos reg query PATH [NAME]      show a key's values, or one value\n"
    "       dorvantos reg add PATH NAME VALUE    write a string value (creates the key)\n"
    "       dorvantos reg delete PATH [NAME]     delete a value, or a key and all below it\n"
    "       dorvantos reg import FILE            merge a .reg file into the settings store\n"
    "       dorvantos reg export PATH FILE       write a key and all below it to a .reg file\n"
    "PATH is a full key path (HKEY_LOCAL_MACHINE\\SOFTWARE\\...; HKLM, HKCU, HKCR, HKU and\n"
    "HKCC also do); NAME \"\" is the key's default value; FILE \"-\" is the standard input\n"
    "or output.\n";

int Usage() {
  std::fputs(kRegUsage, stderr);
  return 2;
}

int Fail(const std::string& message) {
  fmt::print(stderr, "dorvantos reg: {}\n", message);
  return 1;
}

struct KeyPath {
  HKEY root = 0;
  std::string subKey;
  std::string full;  // as the store spells the root
};

HKEY RootOf(const std::string& name) {
  if (HKEY root = registry::RootHandle(name)) return root;
  static const std::pair<const char*, HKEY> kShortNames[] = {
      {"HKCR", registry::HKEY_CLASSES_ROOT},  {"HKCU", registry::HKEY_CURRENT_USER},
      {"HKLM", registry::HKEY_LOCAL_MACHINE}, {"HKU", registry::HKEY_USERS},
      {"HKCC", registry::HKEY_CURRENT_CONFIG},
  };
  for (const auto& [shortName, root] : kShortNames)
    if (registry::FoldName(name) == shortName) return root;
  return 0;
}

std::optional<KeyPath> ParsePath(std::string text) {
  while (!text.empty() && text.back() == '\\') text.pop_back();
  size_t slash = text.find('\\');
  KeyPath path;
  path.root = RootOf(text.substr(0, slash));
  if (path.root == 0) return std::nullopt;
  if (slash != std::string::npos) path.subKey = text.substr(slash + 1);
  path.full = registry::RootName(path.root) + (path.subKey.empty() ? "" : "\\" + path.subKey);
  return path;
}

// Why a registry call failed, in words; for a broken store file, what is wrong with it.
std::string Problem(long status, const std::string& what) {
  switch (status) {
    case registry::ERROR_FILE_NOT_FOUND: return what + " not found";
    case registry::ERROR_KEY_DELETED: return what + " was deleted meanwhile";
    case registry::ERROR_INVALID_PARAMETER: return "invalid name in " + what;
    case registry::ERROR_ACCESS_DENIED: return "access denied to " + what;
    case registry::ERROR_BADDB:
      try {
        registry::Store::Default().Snapshot();
        return fmt::format("the settings file {} cannot be written", registry::Store::Default().Path());
      } catch (const registry::StoreError& e) {
        return e.what();
      }
    default: return fmt::format("{}: registry error {}", what, status);
  }
}

std::string TypeName(uint32_t type) {
  switch (type) {
    case registry::REG_NONE: return "REG_NONE";
    case registry::REG_SZ: return "REG_SZ";
    case registry::REG_EXPAND_SZ: return "REG_EXPAND_SZ";
    case registry::REG_BINARY: return "REG_BINARY";
    case registry::REG_DWORD: return "REG_DWORD";
    case registry::REG_MULTI_SZ: return "REG_MULTI_SZ";
    case registry::REG_QWORD: return "REG_QWORD";
    default: return fmt::format("REG_TYPE_{}", type);
  }
}

std::string DataText(uint32_t type, std::string data) {
  if (registry::IsStringType(type)) {
    if (!data.empty() && data.back() == '\0') data.pop_back();
    if (type != registry::REG_MULTI_SZ) return data;
    // Strings of a list are shown joined by "\0", as reg.exe shows them.
    if (!data.empty() && data.back() == '\0') data.pop_back();
    std::string joined;
    for (char c : data) joined += c == '\0' ? std::string("\\0") : std::string(1, c);
    return joined;
  }
  if ((type == registry::REG_DWORD && data.size() == 4) || (type == registry::REG_QWORD && data.size() == 8)) {
    uint64_t number = 0;
    for (size_t i = data.size(); i-- > 0;) number = (number << 8) | static_cast<uint8_t>(data[i]);
    return fmt::format("0x{:x}", number);
  }
  std::string hex;
  for (char c : data) hex += fmt::format("{:02X}", static_cast<uint8_t>(c));
  return hex;
}

// One value as a query shows it, added to out; the status of the registry call.
long ValueLine(HKEY key, const std::string& name, std::string& out) {
  uint32_t type = 0, size = 0;
  if (long status = registry::RegQueryValueEx(key, name, &type, nullptr, &size)) return status;
  std::string data(size, '\0');
  if (long status = registry::RegQueryValueEx(key, name, &type, data.data(), &size)) return status;
  data.resize(size);
  out += fmt::format("    {}    {}    {}\n", name.empty() ? "(Default)" : name, TypeName(type),
                     DataText(type, data));
  return registry::ERROR_SUCCESS;
}

// The key's values, then its subkeys, added to out.
long KeyListing(HKEY key, const std::string& full, std::string& out) {
  long status = registry::ERROR_SUCCESS;
  std::string name;
  for (uint32_t i = 0; status == registry::ERROR_SUCCESS; ++i) {
    status = registry::RegEnumValue(key, i, &name, nullptr);
    if (status == registry::ERROR_SUCCESS) status = ValueLine(key, name, out);
  }
  if (status != registry::ERROR_NO_MORE_ITEMS) return status;
  for (uint32_t i = 0; registry::RegEnumKey(key, i, &name) == registry::ERROR_SUCCESS; ++i)
    out += fmt::format("{}{}\\{}\n", i == 0 ? "\n" : "", full, name);
  return registry::ERROR_SUCCESS;
}

int Query(const KeyPath& path, const std::optional<std::string>& name) {
  HKEY key = 0;
  if (long status = registry::RegOpenKeyEx(path.root, path.subKey, 0, registry::KEY_READ, &key))
    return Fail(Problem(status, "key " + path.full));
  // Printed only whole: a failure half way shows no partial listing.
  std::string out = path.full + "\n";
  long status = name ? ValueLine(key, *name, out) : KeyListing(key, path.full, out);
  registry::RegCloseKey(key);
  if (status != registry::ERROR_SUCCESS)
    return Fail(Problem(status, name ? fmt::format("value \"{}\" of {}", *name, path.full) : path.full));
  std::fwrite(out.data(), 1, out.size(), stdout);
  return 0;
}

int Add(const KeyPath& path, const std::string& name, const std::string& value) {
  HKEY key = 0;
  if (long status = registry::RegCreateKeyEx(path.root, path.subKey, &key))
    return Fail(Problem(status, "key " + path.full));
  long status = registry::RegSetValueEx(key, name, registry::REG_SZ, value.c_str(),
                                        static_cast<uint32_t>(value.size() + 1));
  registry::RegCloseKey(key);
  if (status != registry::ERROR_SUCCESS)
    return Fail(Problem(status, fmt::format("value \"{}\" of {}", name, path.full)));
  return 0;
}

int Delete(const KeyPath& path, const std::optional<std::string>& name) {
  if (!name) {
    if (path.subKey.empty()) return Fail(fmt::format("{} is a root key and cannot be deleted", path.full));
    if (long status = registry::RegDeleteTree(path.root, path.subKey))
      return Fail(Problem(status, "key " + path.full));
    return 0;
  }
  HKEY key = 0;
  if (long status = registry::RegOpenKeyEx(path.root, path.subKey, 0, registry::KEY_WRITE, &key))
    return Fail(Problem(status, "key " + path.full));
  long status = registry::RegDeleteValue(key, *name);
  registry::RegCloseKey(key);
  if (status != registry::ERROR_SUCCESS)
    return Fail(Problem(status, fmt::format("value \"{}\" of {}", *name, path.full)));
  return 0;
}

std::optional<std::string> ReadFile(const std::string& file) {
  if (file == "-") return std::string(std::istreambuf_iterator<char>(std::cin), {});
  std::ifstream in(file, std::ios::binary);
  if (!in) return std::nullopt;
  std::string text{std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
  if (in.bad()) return std::nullopt;
  return text;
}

int Import(const std::string& file) {
  auto text = ReadFile(file);
  if (!text) return Fail(fmt::format("cannot read {}", file));
  try {
    registry::Store::Default().Import(*text);
  } catch (const registry::StoreError& e) {
    return Fail(fmt::format("{}: {}", file, e.what()));
  }
  return 0;
}

int Export(const KeyPath& path, const std::string& file) {
  std::string text;
  try {
    text = registry::Store::Default().Export(path.full);
  } catch (const registry::StoreError& e) {
    return Fail(e.what());
  }
  if (file == "-") {
    std::fwrite(text.data(), 1, text.size(), stdout);
    return std::fflush(stdout) == 0 ? 0 : Fail("cannot write the standard output");
  }
  std::ofstream out(file, std::ios::binary | std::ios::trunc);
  out << text;
  out.close();
  if (!out) return Fail(fmt::format("cannot write {}", file));
  return 0;
}

}  // namespace

int RunReg(const Args& args) {
  if (args.empty()) return Usage();
  const std::string& verb = args[0];
  const size_t count = args.size() - 1;
  auto optionalArg = [&](size_t at) {
    return args.size() > at ? std::optional<std::string>(args[at]) : std::nullopt;
  };

  if (verb == "import") return count == 1 ? Import(args[1]) : Usage();

  bool known = (verb == "query" && (count == 1 || count == 2)) || (verb == "add" && count == 3) ||
               (verb == "delete" && (count == 1 || count == 2)) || (verb == "export" && count == 2);
  if (!known) return Usage();
  auto path = ParsePath(args[1]);
  if (!path) {
    fmt::print(stderr, "dorvantos reg: \"{}\" does not begin with a root key\n", args[1]);
    return Usage();
  }
  if (verb == "query") return Query(*path, optionalArg(2));
  if (verb == "add") return Add(*path, args[2], args[3]);
  if (verb == "delete") return Delete(*path, optionalArg(2));
  return Export(*path, args[2]);
}

}  // namespace app
