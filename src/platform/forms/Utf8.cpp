#include "platform/forms/Utf8.h"

#include "platform/vb/Utf8.h"

namespace forms::utf8 {

namespace {
bool Continuation(char byte) { return (static_cast<unsigned char>(byte) & 0xC0) == 0x80; }
}  // namespace

size_t Length(std::string_view text) {
  size_t count = 0;
  for (char byte : text)
    if (!Continuation(byte)) ++count;
  return count;
}

size_t Offset(std::string_view text, size_t index) {
  size_t offset = 0;
  while (offset < text.size() && index > 0) {
    ++offset;
    while (offset < text.size() && Continuation(text[offset])) ++offset;
    --index;
  }
  return offset;
}

std::string Encode(int codePoint) {
  std::string out;
  vb::AppendUtf8(out, static_cast<uint32_t>(codePoint));
  return out;
}

}  // namespace forms::utf8
