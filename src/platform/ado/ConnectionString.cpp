#include "platform/ado/ConnectionString.h"

#include <algorithm>
#include <cctype>

namespace ado {

bool EqualsNoCase(std::string_view a, std::string_view b) {
  return a.size() == b.size() &&
         std::equal(a.begin(), a.end(), b.begin(), [](unsigned char x, unsigned char y) {
           return std::tolower(x) == std::tolower(y);
         });
}

namespace {

bool IsBlank(char c) { return c == ' ' || c == '\t' || c == '\r' || c == '\n'; }

}  // namespace

std::string_view Trim(std::string_view s) {
  while (!s.empty() && IsBlank(s.front())) s.remove_prefix(1);
  while (!s.empty() && IsBlank(s.back())) s.remove_suffix(1);
  return s;
}

namespace {

// Reads a key up to its "=", where "==" stands for an "=" inside the key.
std::string ReadKey(std::string_view text, size_t& pos) {
  std::string key;
  while (pos < text.size()) {
    char c = text[pos];
    if (c == '=') {
      if (pos + 1 < text.size() && text[pos + 1] == '=') {
        key += '=';
        pos += 2;
        continue;
      }
      break;
    }
    if (c == ';') break;
    key += c;
    ++pos;
  }
  return std::string(Trim(key));
}

// Reads a value after "=": quoted (closing quote, doubled quotes inside) or bare up to
// the next ";". Text between a closing quote and the ";" is ignored.
std::string ReadValue(std::string_view text, size_t& pos) {
  while (pos < text.size() && IsBlank(text[pos])) ++pos;
  std::string value;
  if (pos < text.size() && (text[pos] == '"' || text[pos] == '\'')) {
    char quote = text[pos++];
    while (pos < text.size()) {
      if (text[pos] == quote) {
        if (pos + 1 < text.size() && text[pos + 1] == quote) {
          value += quote;
          pos += 2;
          continue;
        }
        ++pos;
        break;
      }
      value += text[pos++];
    }
    while (pos < text.size() && text[pos] != ';') ++pos;
    return value;
  }
  size_t start = pos;
  while (pos < text.size() && text[pos] != ';') ++pos;
  return std::string(Trim(text.substr(start, pos - start)));
}

std::string EscapeKey(std::string_view key) {
  std::string out;
  for (char c : key) {
    out += c;
    if (c == '=') out += '=';
  }
  return out;
}

}  // namespace

ConnectionStringParts ConnectionStringParts::Parse(std::string_view text) {
  ConnectionStringParts cs;
  size_t pos = 0;
  while (pos < text.size()) {
    std::string key = ReadKey(text, pos);
    std::string value;
    if (pos < text.size() && text[pos] == '=') {
      ++pos;
      value = ReadValue(text, pos);
    }
    if (pos < text.size() && text[pos] == ';') ++pos;
    if (!key.empty()) cs.Set(key, value);
  }
  return cs;
}

std::optional<std::string> ConnectionStringParts::Get(std::string_view key) const {
  for (const auto& [k, v] : pairs_)
    if (EqualsNoCase(k, key)) return v;
  return std::nullopt;
}

std::string ConnectionStringParts::GetOr(std::string_view key, std::string_view fallback) const {
  auto v = Get(key);
  return v ? *v : std::string(fallback);
}

void ConnectionStringParts::Set(std::string_view key, std::string_view value) {
  for (auto& [k, v] : pairs_) {
    if (EqualsNoCase(k, key)) {
      v = value;
      return;
    }
  }
  pairs_.emplace_back(std::string(key), std::string(value));
}

void ConnectionStringParts::Remove(std::string_view key) {
  std::erase_if(pairs_, [&](const Pair& pair) { return EqualsNoCase(pair.first, key); });
}

std::string ConnectionStringParts::ToString() const { return BuildConnectionString(pairs_); }

std::string ConnectionStringElement(std::string_view key, std::string_view value) {
  bool needsQuotes = value.find_first_of(";\"'") != std::string_view::npos ||
                     (!value.empty() && (IsBlank(value.front()) || IsBlank(value.back())));
  std::string out = EscapeKey(key) + "=";
  if (!needsQuotes) return out + std::string(value);
  // Prefer the quote the value does not contain; double it when it holds both.
  char quote = value.find('"') == std::string_view::npos ? '"' : '\'';
  out += quote;
  for (char c : value) {
    out += c;
    if (c == quote) out += quote;
  }
  out += quote;
  return out;
}

std::string BuildConnectionString(const std::vector<ConnectionStringParts::Pair>& pairs) {
  std::string out;
  for (const auto& [k, v] : pairs) {
    if (!out.empty()) out += ';';
    out += ConnectionStringElement(k, v);
  }
  return out;
}

}  // namespace ado
