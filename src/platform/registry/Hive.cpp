#include <algorithm>

#include "platform/registry/Registry.h"
#include "platform/registry/Store.h"

namespace registry {

namespace {

// Keys strictly below a folded path start with the path and a backslash.
std::string ChildPrefix(std::string_view folded) { return std::string(folded) + '\\'; }

bool StartsWith(std::string_view text, std::string_view prefix) {
  return text.substr(0, prefix.size()) == prefix;
}

}  // namespace

bool IsStringType(uint32_t type) {
  return type == REG_SZ || type == REG_EXPAND_SZ || type == REG_MULTI_SZ;
}

std::string FoldName(std::string_view name) {
  std::string folded(name);
  for (char& c : folded)
    if (c >= 'a' && c <= 'z') c = static_cast<char>(c - 'a' + 'A');
  return folded;
}

const Value* Key::Find(std::string_view name) const {
  auto it = index_.find(FoldName(name));
  return it == index_.end() ? nullptr : &values_[it->second].second;
}

void Key::Set(std::string_view name, Value value) {
  auto [it, inserted] = index_.try_emplace(FoldName(name), values_.size());
  if (inserted)
    values_.emplace_back(std::string(name), std::move(value));
  else
    values_[it->second].second = std::move(value);
}

bool Key::Erase(std::string_view name) {
  auto it = index_.find(FoldName(name));
  if (it == index_.end()) return false;
  size_t position = it->second;
  index_.erase(it);
  values_.erase(values_.begin() + static_cast<std::ptrdiff_t>(position));
  // The values after the erased one moved down by one.
  for (auto& [folded, at] : index_)
    if (at > position) --at;
  return true;
}

void Key::Clear() {
  values_.clear();
  index_.clear();
}

const Key* Hive::Find(std::string_view path) const {
  auto it = keys.find(FoldName(path));
  return it == keys.end() ? nullptr : &it->second;
}

Key* Hive::Find(std::string_view path) {
  auto it = keys.find(FoldName(path));
  return it == keys.end() ? nullptr : &it->second;
}

bool Hive::Exists(std::string_view path) const {
  // A path of one component is a root key, and root keys always exist.
  return path.find('\\') == std::string_view::npos || Find(path) != nullptr;
}

Key& Hive::Create(std::string_view path) {
  // Ancestors first, below the root, as Windows creates every missing level.
  for (size_t at = path.find('\\'); at != std::string_view::npos;
       at = path.find('\\', at + 1)) {
    std::string_view ancestor = path.substr(0, at);
    if (ancestor.find('\\') == std::string_view::npos) continue;
    auto [it, inserted] = keys.try_emplace(FoldName(ancestor));
    if (inserted) it->second.path = std::string(ancestor);
  }
  auto [it, inserted] = keys.try_emplace(FoldName(path));
  if (inserted) it->second.path = std::string(path);
  return it->second;
}

size_t Hive::EraseTree(std::string_view path) {
  std::string folded = FoldName(path);
  size_t removed = keys.erase(folded);
  std::string prefix = ChildPrefix(folded);
  auto first = keys.lower_bound(prefix);
  auto last = first;
  while (last != keys.end() && StartsWith(last->first, prefix)) ++last;
  removed += static_cast<size_t>(std::distance(first, last));
  keys.erase(first, last);
  return removed;
}

std::vector<std::string> Hive::SubKeyNames(std::string_view path) const {
  std::string prefix = ChildPrefix(FoldName(path));
  std::vector<std::string> names;
  for (auto it = keys.lower_bound(prefix); it != keys.end() && StartsWith(it->first, prefix);
       ++it) {
    std::string_view rest = std::string_view(it->second.path).substr(prefix.size());
    if (rest.find('\\') != std::string_view::npos) continue;  // a grandchild
    names.emplace_back(rest);
  }
  return names;
}

bool Hive::operator==(const Hive& other) const {
  return std::equal(keys.begin(), keys.end(), other.keys.begin(), other.keys.end(),
                    [](const auto& a, const auto& b) {
                      return a.first == b.first && a.second.path == b.second.path &&
                             a.second.Values() == b.second.Values();
                    });
}

}  // namespace registry
