#include "platform/forms/Utf8.h"

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
  auto cp = static_cast<unsigned>(codePoint);
  if (cp < 0x80) {
    out += static_cast<char>(cp);
  } else if (cp < 0x800) {
    out += static_cast<char>(0xC0 | (cp >> 6));
    out += static_cast<char>(0x80 | (cp & 0x3F));
  } else if (cp < 0x10000) {
    out += static_cast<char>(0xE0 | (cp >> 12));
    out += static_cast<char>(0x80 | ((cp >> 6) & 0x3F));
    out += static_cast<char>(0x80 | (cp & 0x3F));
  } else {
    out += static_cast<char>(0xF0 | (cp >> 18));
    out += static_cast<char>(0x80 | ((cp >> 12) & 0x3F));
    out += static_cast<char>(0x80 | ((cp >> 6) & 0x3F));
    out += static_cast<char>(0x80 | (cp & 0x3F));
  }
  return out;
}

}  // namespace forms::utf8
