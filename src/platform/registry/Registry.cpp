#include "platform/registry/Registry.h"

#include <array>
#include <cstring>
#include <mutex>
#include <unordered_map>

#include "platform/registry/RegText.h"
#include "platform/registry/Store.h"

namespace registry {

namespace {

constexpr std::array<std::string_view, 7> kRootNames = {
    "HKEY_CLASSES_ROOT",     "HKEY_CURRENT_USER",   "HKEY_LOCAL_MACHINE", "HKEY_USERS",
    "HKEY_PERFORMANCE_DATA", "HKEY_CURRENT_CONFIG", "HKEY_DYN_DATA",
};

bool IsPredefined(HKEY key) { return key >= HKEY_CLASSES_ROOT && key <= HKEY_DYN_DATA; }

// What a handle stands for.
struct OpenKey {
  std::string path;  // canonical full path
  uint32_t access = KEY_ALL_ACCESS;
  // Subkey names for enumeration by index, listed once per version of the store so
  // that walking all the subkeys does not list them again for every index.
  std::shared_ptr<const Hive> listedFrom;
  std::vector<std::string> subKeys;
};

class HandleTable {
 public:
  HandleTable() {
    for (HKEY root = HKEY_CLASSES_ROOT; root <= HKEY_DYN_DATA; ++root)
      open_[root] = OpenKey{RootName(root), KEY_ALL_ACCESS, {}, {}};
  }

  HKEY Add(OpenKey key) {
    std::lock_guard lock(mutex_);
    do next_ += 4;
    while (next_ == 0 || IsPredefined(next_) || open_.contains(next_));
    open_[next_] = std::move(key);
    return next_;
  }

  bool Remove(HKEY key) {
    std::lock_guard lock(mutex_);
    if (IsPredefined(key)) return open_.contains(key);
    return open_.erase(key) > 0;
  }

  // A copy of what the handle stands for; false for a handle that is not open.
  bool Get(HKEY key, OpenKey* out) {
    std::lock_guard lock(mutex_);
    auto it = open_.find(key);
    if (it == open_.end()) return false;
    out->path = it->second.path;
    out->access = it->second.access;
    return true;
  }

  // The subkey names of the key as the given version of the store has them.
  bool SubKey(HKEY key, const std::shared_ptr<const Hive>& hive, uint32_t index, std::string* name,
              bool* found) {
    std::lock_guard lock(mutex_);
    auto it = open_.find(key);
    if (it == open_.end()) return false;
    OpenKey& entry = it->second;
    if (entry.listedFrom != hive) {
      entry.subKeys = hive->SubKeyNames(entry.path);
      entry.listedFrom = hive;
    }
    *found = index < entry.subKeys.size();
    if (*found && name) *name = entry.subKeys[index];
    return true;
  }

 private:
  std::mutex mutex_;
  std::unordered_map<HKEY, OpenKey> open_;
  HKEY next_ = 0x100;
};

HandleTable& Handles() {
  static HandleTable table;
  return table;
}

// Leaves a change to the store early with a registry status; nothing is written.
struct Refusal {
  long status;
};

// Runs a registry call; failures of the store file become ERROR_BADDB.
template <class Call>
long Guarded(Call call) {
  try {
    return call();
  } catch (const Refusal& refusal) {
    return refusal.status;
  } catch (const StoreError&) {
    return ERROR_BADDB;
  }
}

// The full path of a subkey of an open key; "" when it cannot name a key.
std::string JoinPath(const std::string& base, std::string_view subKey) {
  if (subKey.empty()) return base;
  return regtext::CanonicalKeyPath(base + '\\' + std::string(subKey));
}

bool IsRootPath(std::string_view path) { return path.find('\\') == std::string_view::npos; }

// A value name that fits the store's one-line "name"=value form.
bool IsStorableName(std::string_view name) {
  return name.find_first_of(std::string_view("\r\n\0", 3)) == std::string_view::npos;
}

// The key of an open handle in the current store; refused when another process has
// deleted it since it was opened.
const Key* KeyOf(const Hive& hive, const OpenKey& open) {
  if (!hive.Exists(open.path)) throw Refusal{ERROR_KEY_DELETED};
  return hive.Find(open.path);  // null for a root key that holds no values
}

OpenKey Resolve(HKEY key) {
  OpenKey open;
  if (!Handles().Get(key, &open)) throw Refusal{ERROR_INVALID_HANDLE};
  return open;
}

}  // namespace

std::string RootName(HKEY root) {
  return IsPredefined(root) ? std::string(kRootNames[root - HKEY_CLASSES_ROOT]) : std::string();
}

HKEY RootHandle(std::string_view name) {
  std::string folded = FoldName(name);
  for (size_t i = 0; i < kRootNames.size(); ++i)
    if (folded == kRootNames[i]) return HKEY_CLASSES_ROOT + static_cast<HKEY>(i);
  return 0;
}

long RegOpenKeyEx(HKEY root, std::string_view subKey, uint32_t /*options*/, uint32_t samDesired,
                  HKEY* result) {
  if (!result) return ERROR_INVALID_PARAMETER;
  *result = 0;
  return Guarded([&] {
    std::string path = JoinPath(Resolve(root).path, subKey);
    if (path.empty()) return ERROR_FILE_NOT_FOUND;
    // Opening never creates: a key that is not there is simply not found.
    if (!Store::Default().Snapshot()->Exists(path)) return ERROR_FILE_NOT_FOUND;
    *result = Handles().Add(OpenKey{path, samDesired, {}, {}});
    return ERROR_SUCCESS;
  });
}

long RegCreateKeyEx(HKEY root, std::string_view subKey, HKEY* result) {
  if (!result) return ERROR_INVALID_PARAMETER;
  *result = 0;
  return Guarded([&] {
    std::string path = JoinPath(Resolve(root).path, subKey);
    if (path.empty()) return ERROR_INVALID_PARAMETER;
    if (!Store::Default().Snapshot()->Exists(path))
      Store::Default().Update([&](Hive& hive) {
        if (!hive.Exists(path)) hive.Create(path);
      });
    *result = Handles().Add(OpenKey{path, KEY_ALL_ACCESS, {}, {}});
    return ERROR_SUCCESS;
  });
}

long RegCloseKey(HKEY key) {
  return Handles().Remove(key) ? ERROR_SUCCESS : ERROR_INVALID_HANDLE;
}

long RegQueryValueEx(HKEY key, std::string_view valueName, uint32_t* type, char* data,
                     uint32_t* cbData) {
  return Guarded([&] {
    OpenKey open = Resolve(key);
    if (!(open.access & KEY_QUERY_VALUE)) return ERROR_ACCESS_DENIED;
    if (data && !cbData) return ERROR_INVALID_PARAMETER;
    auto hive = Store::Default().Snapshot();
    const Key* found = KeyOf(*hive, open);
    const Value* value = found ? found->Find(valueName) : nullptr;
    if (!value) return ERROR_FILE_NOT_FOUND;

    bool text = IsStringType(value->type);
    auto size = static_cast<uint32_t>(value->data.size() + (text ? 1 : 0));
    if (type) *type = value->type;
    if (!data) {
      if (cbData) *cbData = size;
      return ERROR_SUCCESS;
    }
    if (*cbData < size) {
      *cbData = size;
      return ERROR_MORE_DATA;
    }
    std::memcpy(data, value->data.data(), value->data.size());
    if (text) data[size - 1] = '\0';
    *cbData = size;
    return ERROR_SUCCESS;
  });
}

long RegSetValueEx(HKEY key, std::string_view valueName, uint32_t type, const char* data,
                   uint32_t cbData) {
  return Guarded([&] {
    OpenKey open = Resolve(key);
    if (!(open.access & KEY_SET_VALUE)) return ERROR_ACCESS_DENIED;
    if ((!data && cbData > 0) || !IsStorableName(valueName)) return ERROR_INVALID_PARAMETER;
    Value value{type, std::string(data ? data : "", cbData)};
    // Text arrives with its terminating zero, which the store does not keep.
    if (IsStringType(type) && !value.data.empty() && value.data.back() == '\0')
      value.data.pop_back();
    Store::Default().Update([&](Hive& hive) {
      Key* target = hive.Find(open.path);
      if (!target && !IsRootPath(open.path)) throw Refusal{ERROR_KEY_DELETED};
      if (!target) target = &hive.Create(open.path);
      target->Set(valueName, value);
    });
    return ERROR_SUCCESS;
  });
}

long RegDeleteValue(HKEY key, std::string_view valueName) {
  return Guarded([&] {
    OpenKey open = Resolve(key);
    if (!(open.access & KEY_SET_VALUE)) return ERROR_ACCESS_DENIED;
    Store::Default().Update([&](Hive& hive) {
      Key* target = hive.Find(open.path);
      if (!hive.Exists(open.path)) throw Refusal{ERROR_KEY_DELETED};
      if (!target || !target->Erase(valueName)) throw Refusal{ERROR_FILE_NOT_FOUND};
    });
    return ERROR_SUCCESS;
  });
}

long RegDeleteTree(HKEY root, std::string_view subKey) {
  return Guarded([&] {
    std::string path = JoinPath(Resolve(root).path, subKey);
    if (path.empty() || !Store::Default().Snapshot()->Exists(path)) return ERROR_FILE_NOT_FOUND;
    Store::Default().Update([&](Hive& hive) {
      if (!hive.Exists(path)) throw Refusal{ERROR_FILE_NOT_FOUND};
      const Key* key = hive.Find(path);
      std::string spelled = key ? key->path : path;
      hive.EraseTree(path);
      // Without a subkey the key itself stays, emptied, as on Windows.
      if (subKey.empty() && !IsRootPath(path)) hive.Create(spelled);
    });
    return ERROR_SUCCESS;
  });
}

long RegEnumKey(HKEY key, uint32_t index, std::string* name) {
  return Guarded([&] {
    OpenKey open = Resolve(key);
    auto hive = Store::Default().Snapshot();
    KeyOf(*hive, open);
    bool found = false;
    if (!Handles().SubKey(key, hive, index, name, &found)) return ERROR_INVALID_HANDLE;
    return found ? ERROR_SUCCESS : ERROR_NO_MORE_ITEMS;
  });
}

long RegEnumValue(HKEY key, uint32_t index, std::string* name, uint32_t* type) {
  return Guarded([&] {
    OpenKey open = Resolve(key);
    if (!(open.access & KEY_QUERY_VALUE)) return ERROR_ACCESS_DENIED;
    auto hive = Store::Default().Snapshot();
    const Key* found = KeyOf(*hive, open);
    if (!found || index >= found->Values().size()) return ERROR_NO_MORE_ITEMS;
    const auto& [valueName, value] = found->Values()[index];
    if (name) *name = valueName;
    if (type) *type = value.type;
    return ERROR_SUCCESS;
  });
}

}  // namespace registry
