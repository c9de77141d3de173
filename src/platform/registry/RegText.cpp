#include "platform/registry/RegText.h"

#include <fmt/format.h>

#include <cstdint>
#include <optional>

#include "platform/registry/Registry.h"
#include "platform/vb/Utf8.h"

namespace registry::regtext {

namespace {

constexpr std::string_view kHeader5 = "Windows Registry Editor Version 5.00";
constexpr std::string_view kHeader4 = "REGEDIT4";
// Regedit wraps hex data so that no line is longer than 80 characters.
constexpr size_t kHexLineWidth = 77;

[[noreturn]] void Fail(size_t line, std::string_view problem) {
  throw StoreError(fmt::format("line {}: {}", line, problem));
}

bool IsBlank(char c) { return c == ' ' || c == '\t'; }

std::string_view TrimLeft(std::string_view s) {
  while (!s.empty() && IsBlank(s.front())) s.remove_prefix(1);
  return s;
}

std::string_view TrimRight(std::string_view s) {
  while (!s.empty() && (IsBlank(s.back()) || s.back() == '\r')) s.remove_suffix(1);
  return s;
}

std::string_view Trim(std::string_view s) { return TrimRight(TrimLeft(s)); }

bool StartsWithNoCase(std::string_view text, std::string_view prefix) {
  return text.size() >= prefix.size() && FoldName(text.substr(0, prefix.size())) == FoldName(prefix);
}

std::optional<uint32_t> ParseHex(std::string_view digits, size_t maxDigits) {
  if (digits.empty() || digits.size() > maxDigits) return std::nullopt;
  uint32_t value = 0;
  for (char c : digits) {
    int nibble = c >= '0' && c <= '9'   ? c - '0'
                 : c >= 'a' && c <= 'f' ? c - 'a' + 10
                 : c >= 'A' && c <= 'F' ? c - 'A' + 10
                                        : -1;
    if (nibble < 0) return std::nullopt;
    value = value * 16 + static_cast<uint32_t>(nibble);
  }
  return value;
}

void AppendUtf16Le(std::string& out, uint32_t unit) {
  out += static_cast<char>(unit & 0xFF);
  out += static_cast<char>(unit >> 8);
}

// The code point of the UTF-8 sequence at text[at], advancing at; a byte that starts
// no valid sequence is taken alone as a Latin-1 character.
uint32_t NextCodePoint(std::string_view text, size_t& at) {
  auto byte = [&](size_t i) { return static_cast<uint8_t>(text[i]); };
  uint8_t lead = byte(at);
  size_t length = lead < 0x80 ? 1 : (lead >> 5) == 0x6 ? 2 : (lead >> 4) == 0xE ? 3
                                  : (lead >> 3) == 0x1E ? 4 : 0;
  if (length > 1 && at + length <= text.size()) {
    uint32_t cp = lead & (0x7F >> length);
    bool valid = true;
    for (size_t i = 1; i < length && valid; ++i) {
      valid = (byte(at + i) & 0xC0) == 0x80;
      cp = (cp << 6) | (byte(at + i) & 0x3F);
    }
    static constexpr uint32_t kSmallest[] = {0, 0, 0x80, 0x800, 0x10000};
    if (valid && cp >= kSmallest[length] && cp <= 0x10FFFF && (cp < 0xD800 || cp > 0xDFFF)) {
      at += length;
      return cp;
    }
  }
  ++at;
  return lead;
}

// The data of a string type given as hex: UTF-16 text in "5.00" files, bytes in
// "REGEDIT4" ones; the final terminating zero is not kept.
std::string StringFromHex(const std::string& bytes, bool unicode, size_t line) {
  std::string text;
  if (unicode) {
    if (bytes.size() % 2 != 0) Fail(line, "string data of an odd number of bytes");
    text = Utf16LeToUtf8(bytes);
  } else {
    text = bytes;
  }
  if (!text.empty() && text.back() == '\0') text.pop_back();
  return text;
}

class Parser {
 public:
  explicit Parser(const std::string& text) : text_(DecodeText(text)) { SplitLines(); }

  std::vector<Change> Run() {
    for (line_ = 0; line_ < lines_.size(); ++line_) {
      std::string_view line = Trim(lines_[line_]);
      if (line.empty()) continue;
      if (!headerSeen_) {
        ReadHeader(line);
      } else if (line.front() == ';') {
        continue;
      } else if (line.front() == '[') {
        ReadKeyLine(line);
      } else if (line.front() == '"' || line.front() == '@') {
        ReadValueLine(TrimLeft(lines_[line_]));
      } else {
        Fail(LineNumber(), "unexpected text (a key in [brackets] or a \"name\"=value was expected)");
      }
    }
    return std::move(changes_);
  }

 private:
  void SplitLines() {
    std::string_view rest = text_;
    while (!rest.empty()) {
      size_t end = rest.find('\n');
      lines_.push_back(rest.substr(0, end));
      if (end == std::string_view::npos) break;
      rest.remove_prefix(end + 1);
    }
  }

  size_t LineNumber() const { return line_ + 1; }

  void ReadHeader(std::string_view line) {
    if (line == kHeader5) {
      unicode_ = true;
    } else if (line == kHeader4) {
      unicode_ = false;
    } else {
      Fail(LineNumber(), fmt::format("not a registry file (\"{}\" expected)", kHeader5));
    }
    headerSeen_ = true;
  }

  void ReadKeyLine(std::string_view line) {
    if (line.back() != ']') Fail(LineNumber(), "key name without its closing \"]\"");
    std::string_view inner = line.substr(1, line.size() - 2);
    bool deletion = !inner.empty() && inner.front() == '-';
    if (deletion) inner.remove_prefix(1);
    std::string path = CanonicalKeyPath(inner);
    if (path.empty()) Fail(LineNumber(), fmt::format("\"{}\" is not a registry key path", inner));
    if (deletion) {
      changes_.push_back({Change::Kind::DeleteKey, path, {}, {}});
      key_.clear();
    } else {
      changes_.push_back({Change::Kind::CreateKey, path, {}, {}});
      key_ = std::move(path);
    }
  }

  // A quoted text with the escapes \\ and \"; pos is just after the opening quote and
  // ends just after the closing one.
  std::string ReadQuoted(std::string_view line, size_t& pos) {
    std::string out;
    while (pos < line.size()) {
      char c = line[pos++];
      if (c == '"') return out;
      if (c == '\\') {
        if (pos >= line.size() || (line[pos] != '\\' && line[pos] != '"'))
          Fail(LineNumber(), "a backslash in quotes must be written \\\\");
        c = line[pos++];
      }
      out += c;
    }
    Fail(LineNumber(), "text in quotes without its closing quote");
  }

  void ReadValueLine(std::string_view line) {
    if (key_.empty()) Fail(LineNumber(), "a value outside a key");
    size_t pos = 1;
    std::string name = line.front() == '@' ? std::string() : ReadQuoted(line, pos);
    std::string_view rest = TrimLeft(line.substr(pos));
    if (rest.empty() || rest.front() != '=') Fail(LineNumber(), "\"=\" expected after the value name");
    rest = Trim(rest.substr(1));

    if (rest == "-") {
      changes_.push_back({Change::Kind::DeleteValue, key_, std::move(name), {}});
      return;
    }
    changes_.push_back({Change::Kind::SetValue, key_, std::move(name), ReadData(rest)});
  }

  Value ReadData(std::string_view rest) {
    if (!rest.empty() && rest.front() == '"') {
      size_t pos = 1;
      std::string text = ReadQuoted(rest, pos);
      if (!Trim(rest.substr(pos)).empty()) Fail(LineNumber(), "text after the closing quote");
      return {REG_SZ, std::move(text)};
    }
    if (StartsWithNoCase(rest, "dword:")) {
      auto number = ParseHex(rest.substr(6), 8);
      if (!number) Fail(LineNumber(), "dword: needs up to 8 hexadecimal digits");
      std::string bytes;
      for (int shift = 0; shift < 32; shift += 8) bytes += static_cast<char>((*number >> shift) & 0xFF);
      return {REG_DWORD, std::move(bytes)};
    }
    if (StartsWithNoCase(rest, "hex:")) return {REG_BINARY, ReadHexBytes(rest.substr(4))};
    if (StartsWithNoCase(rest, "hex(")) {
      size_t close = rest.find("):");
      auto type = close == std::string_view::npos ? std::nullopt : ParseHex(rest.substr(4, close - 4), 8);
      if (!type) Fail(LineNumber(), "hex(N): needs a hexadecimal type number");
      size_t first = LineNumber();
      std::string bytes = ReadHexBytes(rest.substr(close + 2));
      if (IsStringType(*type)) return {*type, StringFromHex(bytes, unicode_, first)};
      return {*type, std::move(bytes)};
    }
    Fail(LineNumber(), "unknown kind of value (\"text\", dword:, hex: or hex(N): expected)");
  }

  // Comma-separated bytes, continued on the next lines while a line ends with "\".
  std::string ReadHexBytes(std::string_view data) {
    std::string all(Trim(data));
    while (!all.empty() && all.back() == '\\') {
      all.pop_back();
      if (line_ + 1 >= lines_.size()) Fail(LineNumber(), "hex data continued past the end of the text");
      ++line_;
      all += Trim(lines_[line_]);
    }
    std::string bytes;
    std::string_view rest = all;
    while (!rest.empty()) {
      size_t comma = rest.find(',');
      std::string_view piece = Trim(rest.substr(0, comma));
      auto byte = ParseHex(piece, 2);
      if (!byte) Fail(LineNumber(), fmt::format("\"{}\" is not a hexadecimal byte", piece));
      bytes += static_cast<char>(*byte);
      if (comma == std::string_view::npos) break;
      rest = TrimLeft(rest.substr(comma + 1));
    }
    return bytes;
  }

  std::string text_;
  std::vector<std::string_view> lines_;
  size_t line_ = 0;
  bool headerSeen_ = false;
  bool unicode_ = true;
  std::string key_;  // the key the value lines belong to; "" before any, or after [-KEY]
  std::vector<Change> changes_;
};

void AppendQuoted(std::string& out, std::string_view text) {
  out += '"';
  for (char c : text) {
    if (c == '\\' || c == '"') out += '\\';
    out += c;
  }
  out += '"';
}

void AppendHex(std::string& out, size_t lineStart, std::string_view bytes) {
  for (size_t i = 0; i < bytes.size(); ++i) {
    out += fmt::format("{:02x}", static_cast<uint8_t>(bytes[i]));
    if (i + 1 == bytes.size()) break;
    out += ',';
    if (out.size() - lineStart >= kHexLineWidth) {
      out += "\\\n  ";
      lineStart = out.size() - 2;
    }
  }
}

// A text that fits between quotes on one line.
bool FitsInQuotes(std::string_view text) {
  return text.find_first_of(std::string_view("\r\n\0", 3)) == std::string_view::npos;
}

void AppendValueLine(std::string& out, const std::string& name, const Value& value) {
  size_t lineStart = out.size();
  if (name.empty())
    out += '@';
  else
    AppendQuoted(out, name);
  out += '=';
  if (value.type == REG_SZ && FitsInQuotes(value.data)) {
    AppendQuoted(out, value.data);
  } else if (value.type == REG_DWORD && value.data.size() == 4) {
    uint32_t number = 0;
    for (int i = 3; i >= 0; --i) number = (number << 8) | static_cast<uint8_t>(value.data[static_cast<size_t>(i)]);
    out += fmt::format("dword:{:08x}", number);
  } else if (value.type == REG_BINARY) {
    out += "hex:";
    AppendHex(out, lineStart, value.data);
  } else {
    out += fmt::format("hex({:x}):", value.type);
    if (IsStringType(value.type))
      AppendHex(out, lineStart, Utf8ToUtf16Le(value.data + '\0'));
    else
      AppendHex(out, lineStart, value.data);
  }
  out += '\n';
}

void AppendKey(std::string& out, const Key& key) {
  out += "\n[";
  out += key.path;
  out += "]\n";
  for (const auto& [name, value] : key.Values()) AppendValueLine(out, name, value);
}

}  // namespace

std::string CanonicalKeyPath(std::string_view path) {
  size_t slash = path.find('\\');
  HKEY root = RootHandle(path.substr(0, slash));
  if (root == 0) return {};
  std::string canonical = RootName(root);
  if (slash == std::string_view::npos) return canonical;
  std::string_view rest = path.substr(slash + 1);
  while (true) {
    size_t next = rest.find('\\');
    std::string_view name = rest.substr(0, next);
    if (name.empty()) return {};
    for (char c : name)
      if (static_cast<uint8_t>(c) < 0x20 || c == 0x7F) return {};
    canonical += '\\';
    canonical += name;
    if (next == std::string_view::npos) return canonical;
    rest.remove_prefix(next + 1);
  }
}

std::string Utf16LeToUtf8(std::string_view bytes) {
  std::string out;
  out.reserve(bytes.size());
  auto unit = [&](size_t i) {
    return static_cast<uint32_t>(static_cast<uint8_t>(bytes[i])) |
           static_cast<uint32_t>(static_cast<uint8_t>(bytes[i + 1])) << 8;
  };
  for (size_t i = 0; i + 1 < bytes.size(); i += 2) {
    uint32_t cp = unit(i);
    if (cp >= 0xD800 && cp <= 0xDBFF && i + 3 < bytes.size() && unit(i + 2) >= 0xDC00 &&
        unit(i + 2) <= 0xDFFF) {
      cp = 0x10000 + ((cp - 0xD800) << 10) + (unit(i + 2) - 0xDC00);
      i += 2;
    } else if (cp >= 0xD800 && cp <= 0xDFFF) {
      cp = 0xFFFD;  // half of a pair
    }
    vb::AppendUtf8(out, cp);
  }
  return out;
}

std::string Utf8ToUtf16Le(std::string_view text) {
  std::string out;
  out.reserve(text.size() * 2);
  for (size_t at = 0; at < text.size();) {
    uint32_t cp = NextCodePoint(text, at);
    if (cp >= 0x10000) {
      AppendUtf16Le(out, 0xD800 + ((cp - 0x10000) >> 10));
      AppendUtf16Le(out, 0xDC00 + ((cp - 0x10000) & 0x3FF));
    } else {
      AppendUtf16Le(out, cp);
    }
  }
  return out;
}

std::string DecodeText(const std::string& bytes) {
  std::string_view view = bytes;
  if (view.starts_with("\xFF\xFE")) {
    view.remove_prefix(2);
    if (view.size() % 2 != 0) throw StoreError("UTF-16 text of an odd number of bytes");
    return Utf16LeToUtf8(view);
  }
  if (view.starts_with("\xFE\xFF")) {
    view.remove_prefix(2);
    if (view.size() % 2 != 0) throw StoreError("UTF-16 text of an odd number of bytes");
    std::string swapped(view);
    for (size_t i = 0; i + 1 < swapped.size(); i += 2) std::swap(swapped[i], swapped[i + 1]);
    return Utf16LeToUtf8(swapped);
  }
  if (view.starts_with("\xEF\xBB\xBF")) view.remove_prefix(3);
  return std::string(view);
}

std::vector<Change> ParseChanges(const std::string& text) { return Parser(text).Run(); }

void Apply(Hive& hive, const std::vector<Change>& changes) {
  for (const Change& change : changes) {
    switch (change.kind) {
      case Change::Kind::CreateKey:
        hive.Create(change.path);
        break;
      case Change::Kind::DeleteKey:
        hive.EraseTree(change.path);
        break;
      case Change::Kind::SetValue:
        hive.Create(change.path).Set(change.name, change.value);
        break;
      case Change::Kind::DeleteValue:
        if (Key* key = hive.Find(change.path)) key->Erase(change.name);
        break;
    }
  }
}

}  // namespace registry::regtext

namespace registry {

Hive ParseRegText(const std::string& text) {
  Hive hive;
  regtext::Apply(hive, regtext::ParseChanges(text));
  return hive;
}

std::string WriteRegText(const Hive& hive, const std::string& underPath) {
  std::string out(regtext::kHeader5);
  out += '\n';
  std::string folded = FoldName(underPath);
  for (auto it = hive.keys.lower_bound(folded); it != hive.keys.end(); ++it) {
    std::string_view path = it->first;
    if (!folded.empty()) {
      if (!path.starts_with(folded)) break;
      // "...\POC" is not below "...\PO".
      if (path.size() > folded.size() && path[folded.size()] != '\\') continue;
    }
    regtext::AppendKey(out, it->second);
  }
  out += '\n';
  return out;
}

}  // namespace registry
