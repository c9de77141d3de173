#pragma once
// The password that unlocks a system document in the header editor. The component
// keeps only a salted PBKDF2 hash of it, so the password cannot be read out of the
// library; a typed answer unlocks when it hashes to the same value, which holds only
// for the very same characters (letter case included).

#include <string_view>

namespace entry {

bool IsSystemDocumentPassword(std::string_view typed);

}  // namespace entry
