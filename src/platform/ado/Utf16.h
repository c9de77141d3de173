#pragma once
// UTF-16, the encoding ICU and the ODBC wide-character calls speak; our texts are UTF-8.
// Malformed input becomes U+FFFD rather than failing.

#include <string>
#include <string_view>

namespace ado {

std::u16string ToUtf16(std::string_view utf8);
std::string ToUtf8(std::u16string_view utf16);

}  // namespace ado
