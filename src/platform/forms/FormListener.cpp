#include "platform/forms/FormListener.h"

#include <algorithm>
#include <vector>

namespace forms {

namespace {
std::vector<FormListener*>& Registered() {
  static std::vector<FormListener*> listeners;
  return listeners;
}
}  // namespace

void AddListener(FormListener* listener) {
  auto& listeners = Registered();
  if (std::find(listeners.begin(), listeners.end(), listener) == listeners.end())
    listeners.push_back(listener);
}

void RemoveListener(FormListener* listener) { std::erase(Registered(), listener); }

namespace detail {

bool Listened() { return !Registered().empty(); }

void Notify(const std::function<void(FormListener&)>& fn) {
  // A listener may unregister itself (or another) while being told.
  std::vector<FormListener*> listeners = Registered();
  for (FormListener* listener : listeners) {
    if (std::find(Registered().begin(), Registered().end(), listener) != Registered().end())
      fn(*listener);
  }
}

}  // namespace detail
}  // namespace forms
