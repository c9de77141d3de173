#pragma once
// The ".reg" text format inside the store: the changes a text asks for, in order, so
// that an import can be checked whole before anything is applied, and the conversions
// between the UTF-16 of Windows exports and the UTF-8 the store keeps.

#include <string>
#include <string_view>
#include <vector>

#include "platform/registry/Store.h"

namespace registry::regtext {

struct Change {
  enum class Kind { CreateKey, DeleteKey, SetValue, DeleteValue };
  Kind kind;
  std::string path;  // canonical full key path
  std::string name;  // value name, for the value changes
  Value value;       // for SetValue
};

// The changes of a ".reg" text, in order; throws StoreError naming the line at fault.
std::vector<Change> ParseChanges(const std::string& text);
void Apply(Hive& hive, const std::vector<Change>& changes);

// A full key path with its root spelled as Windows spells it ("hkey_local_machine\A"
// gives "HKEY_LOCAL_MACHINE\A"), or "" when the root is unknown or a name is empty or
// holds a control character.
std::string CanonicalKeyPath(std::string_view path);

// Text as UTF-8: a UTF-16 text (little- or big-endian, with its byte-order mark) is
// converted, a UTF-8 byte-order mark dropped, anything else taken as it is.
std::string DecodeText(const std::string& bytes);
std::string Utf16LeToUtf8(std::string_view bytes);
// Bytes that are not UTF-8 are taken as Latin-1 characters, the way an ANSI text would
// come across.
std::string Utf8ToUtf16Le(std::string_view text);

}  // namespace registry::regtext
