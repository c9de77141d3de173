#include "platform/automation/ClassObjects.h"

#include <mutex>
#include <stdexcept>
#include <unordered_map>

#include "platform/automation/ClassRegistry.h"
#include "platform/registry/Store.h"

namespace automation {

namespace {

struct Table {
  std::mutex mutex;
  // Keyed by the folded ProgID.
  std::unordered_map<std::string, ClassObjectFactory> factories;
};

Table& Classes() {
  static Table table;
  return table;
}

}  // namespace

void RegisterClassObject(const std::string& progId, ClassObjectFactory factory) {
  if (!IsValidProgID(progId)) throw std::invalid_argument("\"" + progId + "\" is no ProgID");
  if (!factory) throw std::invalid_argument("no factory given for " + progId);
  Table& table = Classes();
  std::lock_guard lock(table.mutex);
  table.factories[registry::FoldName(progId)] = std::move(factory);
}

bool RevokeClassObject(const std::string& progId) {
  Table& table = Classes();
  std::lock_guard lock(table.mutex);
  return table.factories.erase(registry::FoldName(progId)) > 0;
}

ClassObjectFactory FindClassObject(const std::string& progId) {
  Table& table = Classes();
  std::lock_guard lock(table.mutex);
  auto found = table.factories.find(registry::FoldName(progId));
  // A copy: the factory runs outside the lock, and may itself create objects.
  return found == table.factories.end() ? ClassObjectFactory{} : found->second;
}

}  // namespace automation
