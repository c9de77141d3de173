#pragma once
// The Windows registry API, kept by name and semantics, over the settings store of
// Store.h. Keys are addressed from a predefined root handle; names of keys and values
// compare ignoring (ASCII) case as Windows does. Data of string values is the UTF-8
// text followed by its terminating zero, as RegQueryValueEx returns it.

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace registry {

using HKEY = uint32_t;

inline constexpr HKEY HKEY_CLASSES_ROOT = 0x80000000u;
inline constexpr HKEY HKEY_CURRENT_USER = 0x80000001u;
inline constexpr HKEY HKEY_LOCAL_MACHINE = 0x80000002u;
inline constexpr HKEY HKEY_USERS = 0x80000003u;
inline constexpr HKEY HKEY_PERFORMANCE_DATA = 0x80000004u;
inline constexpr HKEY HKEY_CURRENT_CONFIG = 0x80000005u;
inline constexpr HKEY HKEY_DYN_DATA = 0x80000006u;

inline constexpr long ERROR_SUCCESS = 0;
inline constexpr long ERROR_FILE_NOT_FOUND = 2;
inline constexpr long ERROR_ACCESS_DENIED = 5;
inline constexpr long ERROR_INVALID_HANDLE = 6;
inline constexpr long ERROR_INVALID_PARAMETER = 87;
inline constexpr long ERROR_MORE_DATA = 234;
inline constexpr long ERROR_NO_MORE_ITEMS = 259;
inline constexpr long ERROR_BADDB = 1009;  // the store file cannot be read or written
inline constexpr long ERROR_KEY_DELETED = 1018;  // the open key was deleted meanwhile

inline constexpr uint32_t REG_NONE = 0;
inline constexpr uint32_t REG_SZ = 1;
inline constexpr uint32_t REG_EXPAND_SZ = 2;
inline constexpr uint32_t REG_BINARY = 3;
inline constexpr uint32_t REG_DWORD = 4;
inline constexpr uint32_t REG_MULTI_SZ = 7;
inline constexpr uint32_t REG_QWORD = 11;

inline constexpr uint32_t KEY_QUERY_VALUE = 0x0001;
inline constexpr uint32_t KEY_SET_VALUE = 0x0002;
inline constexpr uint32_t KEY_READ = 0x20019;
inline constexpr uint32_t KEY_WRITE = 0x20006;
inline constexpr uint32_t KEY_ALL_ACCESS = 0xF003F;

// The root name ("HKEY_LOCAL_MACHINE") of a predefined handle, "" for any other.
std::string RootName(HKEY root);
// The predefined handle of a root name, ignoring case; 0 for any other name.
HKEY RootHandle(std::string_view name);

// Handles are process-wide; every call may come from any thread. A failure of the
// store file (unreadable, malformed, not writable) comes back as ERROR_BADDB.

long RegOpenKeyEx(HKEY root, std::string_view subKey, uint32_t options, uint32_t samDesired,
                  HKEY* result);
// Creates the key and its missing ancestors; an existing key is simply opened.
long RegCreateKeyEx(HKEY root, std::string_view subKey, HKEY* result);
long RegCloseKey(HKEY key);
// With data null, reports the size in cbData. A buffer too small gives ERROR_MORE_DATA.
long RegQueryValueEx(HKEY key, std::string_view valueName, uint32_t* type, char* data,
                     uint32_t* cbData);
// Data of the string types comes with its terminating zero, counted in cbData.
long RegSetValueEx(HKEY key, std::string_view valueName, uint32_t type, const char* data,
                   uint32_t cbData);
long RegDeleteValue(HKEY key, std::string_view valueName);
// Deletes a key and everything below it; with an empty subKey, empties the key.
long RegDeleteTree(HKEY root, std::string_view subKey);
long RegEnumKey(HKEY key, uint32_t index, std::string* name);
long RegEnumValue(HKEY key, uint32_t index, std::string* name, uint32_t* type);

}  // namespace registry
