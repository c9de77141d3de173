#pragma once
// UTF-8, the encoding of every text of the system.

#include <cstdint>
#include <string>

namespace vb {

// Appends the UTF-8 form of a Unicode code point.
void AppendUtf8(std::string& out, uint32_t codePoint);

}  // namespace vb
