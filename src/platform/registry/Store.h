#pragma once
// The settings store: one text file in the Windows ".reg" export format, so settings
// move between systems with ordinary tools. Every read sees what any process last
// wrote; every write re-reads the file under an advisory lock, changes it and replaces
// it atomically (temporary file, fsync, rename), so concurrent writers lose nothing.

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace registry {

// A stored value: its registry type and its data. For the string types (REG_SZ,
// REG_EXPAND_SZ, REG_MULTI_SZ) the data is UTF-8 without the final terminating zero;
// for the other types, the raw bytes.
struct Value {
  uint32_t type = 1;
  std::string data;

  bool operator==(const Value&) const = default;
};

// Whether a type's data is text that RegQueryValueEx hands out with a terminating zero.
bool IsStringType(uint32_t type);

// Folds a key path or value name for comparison (ASCII letters to upper case).
std::string FoldName(std::string_view name);

// A key: its values by name, in the order they were first written. The default value
// has the empty name. Names are found through an index of folded names.
class Key {
 public:
  using Entry = std::pair<std::string, Value>;

  std::string path;  // full path with its original letter case

  const std::vector<Entry>& Values() const { return values_; }
  const Value* Find(std::string_view name) const;
  // Replaces the data of a value of that name (keeping its place and the letter case
  // it was first written with), or appends a new one.
  void Set(std::string_view name, Value value);
  bool Erase(std::string_view name);
  void Clear();

 private:
  std::vector<Entry> values_;
  std::unordered_map<std::string, size_t> index_;  // folded name -> position in values_
};

// The whole store: keys by their full path folded to upper case. A key's ancestors
// are keys too (as on Windows); root keys ("HKEY_LOCAL_MACHINE") always exist and are
// only kept here when they hold values.
struct Hive {
  std::map<std::string, Key> keys;

  // Paths are full registry paths with no empty component.
  const Key* Find(std::string_view path) const;
  Key* Find(std::string_view path);
  bool Exists(std::string_view path) const;
  // The key, created with its missing ancestors.
  Key& Create(std::string_view path);
  // Removes the key and everything below it; the number of keys removed.
  size_t EraseTree(std::string_view path);
  // Names of the direct subkeys, in folded order, with their original letter case.
  std::vector<std::string> SubKeyNames(std::string_view path) const;

  bool operator==(const Hive& other) const;
};

// A store file that cannot be parsed, or cannot be written.
class StoreError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

class Store {
 public:
  explicit Store(std::string path);

  // The store of this process: the path given to SetDefaultPath, else
  // $POC_REGISTRY_FILE, else $XDG_CONFIG_HOME/poc-dorvantos/registry.reg (~/.config
  // when XDG_CONFIG_HOME is unset). The environment is looked at on every call, so a
  // changed variable takes effect at once.
  static Store& Default();
  // Points the store of this process at another file (the --registry option); an
  // empty path goes back to the environment.
  static void SetDefaultPath(const std::string& path);
  static std::string DefaultPath();

  const std::string& Path() const { return path_; }

  // The current content, shared and immutable; a missing file is an empty hive. While
  // the file is unchanged this costs one stat. Throws StoreError when the file exists
  // but is not a store.
  std::shared_ptr<const Hive> Snapshot();
  Hive Read() { return *Snapshot(); }
  // Applies a change under the lock to the freshest content and writes it back; the
  // file (and its folder) are created private. Throws StoreError, or whatever the change
  // throws, and then leaves the file as it was.
  void Update(const std::function<void(Hive&)>& change);

  // ".reg" text of the key at path and the keys below it (all keys for an empty path).
  // Throws StoreError when no such key exists.
  std::string Export(const std::string& path);
  // Merges ".reg" text (UTF-8, or UTF-16 with its byte-order mark), with "[-KEY]" and
  // "name"=- deletions. Throws StoreError on malformed text, changing nothing.
  void Import(const std::string& text);

 private:
  std::string path_;
  // Parsed content cached against the file's identity, so repeated reads cost a stat.
  struct Cache;
  std::shared_ptr<Cache> cache_;
};

// Parses ".reg" text into a hive; throws StoreError naming the line at fault.
Hive ParseRegText(const std::string& text);
// Writes a hive as ".reg" text ("Windows Registry Editor Version 5.00"): the key at
// underPath and the keys below it, or every key when underPath is empty.
std::string WriteRegText(const Hive& hive, const std::string& underPath = {});

}  // namespace registry
