#pragma once
// Connection strings as ADO reads them: "key=value;" pairs, keys compared ignoring case,
// a value optionally quoted with "..." or '...' (the quote doubled inside), so that a
// quoted value may hold ";" without adding keys of its own.

#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace ado {

class ConnectionStringParts {
 public:
  using Pair = std::pair<std::string, std::string>;

  ConnectionStringParts() = default;
  // Reads a connection string; a key given twice keeps its last value.
  static ConnectionStringParts Parse(std::string_view text);

  // The value of a key, or nullopt when the string does not name it.
  std::optional<std::string> Get(std::string_view key) const;
  std::string GetOr(std::string_view key, std::string_view fallback) const;
  // Sets (or replaces) a key's value, keeping the order of first appearance.
  void Set(std::string_view key, std::string_view value);
  void Remove(std::string_view key);

  const std::vector<Pair>& Pairs() const { return pairs_; }
  // The string again, every value quoted when it needs to be.
  std::string ToString() const;

 private:
  std::vector<Pair> pairs_;
};

// One "key=value" element, the value quoted when it holds ";", a quote, or blanks at
// either end: the way to put user-supplied text into a connection string.
std::string ConnectionStringElement(std::string_view key, std::string_view value);

// A whole connection string from pairs, in order, each element as above.
std::string BuildConnectionString(const std::vector<ConnectionStringParts::Pair>& pairs);

// Text without the blanks (spaces, tabs, line ends) at either end.
std::string_view Trim(std::string_view s);

// ASCII case-insensitive equality, as keys and identifiers compare.
bool EqualsNoCase(std::string_view a, std::string_view b);

}  // namespace ado
