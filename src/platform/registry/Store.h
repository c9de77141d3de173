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
#include <vector>

namespace registry {

// A stored value: its registry type and its data (for strings, UTF-8 without the
// terminating zero; for other types, the raw bytes).
struct Value {
  uint32_t type = 1;
  std::string data;
};

// A key: its values by name, in the order they were written. The default value has
// the empty name.
struct Key {
  std::string path;  // full path with its original letter case
  std::vector<std::pair<std::string, Value>> values;
};

// The whole store: keys by their full path folded to upper case.
struct Hive {
  std::map<std::string, Key> keys;
};

// A store file that cannot be parsed, or cannot be written.
class StoreError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// Folds a key path or value name for comparison (ASCII letters to upper case).
std::string FoldName(std::string_view name);

class Store {
 public:
  explicit Store(std::string path);

  // The store of this process: $POC_REGISTRY_FILE, else
  // $XDG_CONFIG_HOME/poc-dorvantos/registry.reg (~/.config when XDG_CONFIG_HOME is unset).
  static Store& Default();
  // Points the store of this process at another file (the --registry option).
  static void SetDefaultPath(const std::string& path);
  static std::string DefaultPath();

  const std::string& Path() const { return path_; }

  // The current content; a missing file is an empty hive. Throws StoreError when the
  // file exists but is not a store.
  Hive Read();
  // Applies a change under the lock to the freshest content and writes it back; the
  // file is created with mode 0600. Throws StoreError and leaves the file as it was.
  void Update(const std::function<void(Hive&)>& change);

  // ".reg" text of the keys at and below path (all keys for an empty path).
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
// Writes a hive as ".reg" text ("Windows Registry Editor Version 5.00").
std::string WriteRegText(const Hive& hive, const std::string& underPath = {});

}  // namespace registry
