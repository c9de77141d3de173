#pragma once
// The class registry under HKEY_CLASSES_ROOT of the settings store, laid out as Windows
// self-registration lays it out, so the keys read the same to anyone who knows them:
//
//   HKCR\<ProgID>                       (default) = <ProgID>
//   HKCR\<ProgID>\CLSID                 (default) = {CLSID}
//   HKCR\CLSID\{CLSID}                  (default) = <class name>
//   HKCR\CLSID\{CLSID}\InprocServer32   (default) = <absolute path of the server library>
//                                        ThreadingModel = Apartment
//   HKCR\CLSID\{CLSID}\ProgID           (default) = <ProgID>
//   HKCR\CLSID\{CLSID}\TypeLib          (default) = {LIBID}
//   HKCR\CLSID\{CLSID}\VERSION          (default) = <type library version>
//   HKCR\TypeLib\{LIBID}\<version>      (default) = <type library name>
//   HKCR\TypeLib\{LIBID}\<version>\0\win64 (default) = <server path>, and FLAGS, HELPDIR
//
// Writers raise RegistrationError naming the key at fault; readers answer nothing
// rather than fail, because "not registered" is what their callers report.

#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace automation {

class RegistrationError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

struct TypeLibrary {
  std::string name;     // "POC_Dorvantos"
  std::string libid;    // "{...}"
  std::string version;  // "1.0"
};

struct ClassEntry {
  std::string className;  // "General"
  std::string progId;     // "POC_Dorvantos.General"
  std::string clsid;      // "{...}"
};

// A ProgID is a plain dotted name: letters, digits, "_" and ".", at most 39 characters,
// not starting with a digit. Anything else could address another key of the store.
bool IsValidProgID(std::string_view progId);
// "{XXXXXXXX-XXXX-XXXX-XXXX-XXXXXXXXXXXX}" with hexadecimal digits.
bool IsValidGuid(std::string_view guid);
// GUIDs compare ignoring the letter case of their hexadecimal digits.
bool SameGuid(std::string_view a, std::string_view b);

void RegisterClass(const ClassEntry& entry, const TypeLibrary& library,
                   const std::string& serverPath);
// Removes the class's CLSID key, and its ProgID key when that still names this CLSID
// (another server may have taken the ProgID over since).
void UnregisterClass(const ClassEntry& entry);
void RegisterTypeLib(const TypeLibrary& library, const std::string& serverPath);
void UnregisterTypeLib(const TypeLibrary& library);

std::optional<std::string> CLSIDFromProgID(std::string_view progId);
// The library registered as the class's in-process server.
std::optional<std::string> InprocServerOf(std::string_view clsid);

// The classes whose in-process server is the given library, as the registry says.
std::vector<ClassEntry> ClassesServedBy(const std::string& serverPath);

}  // namespace automation
