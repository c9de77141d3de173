#pragma once
// Character positions in UTF-8 text: SelStart, SelLength and MaxLength count
// characters, as a person sees them, not bytes.

#include <cstddef>
#include <string>
#include <string_view>

namespace forms::utf8 {

// Number of characters.
size_t Length(std::string_view text);
// Byte offset of the character at `index` (the end of the text past the last one).
size_t Offset(std::string_view text, size_t index);
// The UTF-8 form of a code point.
std::string Encode(int codePoint);

}  // namespace forms::utf8
