#include "automate_windows.h"

#include <algorithm>
#include <cctype>

namespace app::automate {

namespace {

std::string Fold(std::string_view name) {
  std::string folded(name);
  for (char& c : folded) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return folded;
}

}  // namespace

WindowIndex::WindowIndex() { forms::AddListener(this); }

WindowIndex::~WindowIndex() { forms::RemoveListener(this); }

WindowIndex::Entry* WindowIndex::Live(forms::Form& form) {
  for (Entry& entry : entries_) {
    if (entry.form != &form) continue;
    if (entry.tracked && entry.alive.expired()) {
      // That window is gone; whatever lives at its address now is another one.
      entry.form = nullptr;
      continue;
    }
    return &entry;
  }
  return nullptr;
}

int WindowIndex::InstanceOf(forms::Form& form) {
  if (Entry* entry = Live(form)) return entry->instance;
  std::weak_ptr<vb::Object> alive = form.weak_from_this();
  Entry entry{Fold(form.Name()), 0, &form, alive, !alive.expired()};
  entry.instance = ++counts_[entry.name];
  entries_.push_back(std::move(entry));
  return entries_.back().instance;
}

forms::Form* WindowIndex::Find(std::string_view name, std::optional<int> instance) {
  const std::string folded = Fold(name);
  forms::Form* newest = nullptr;
  int newestInstance = 0;
  // Windows loaded before anyone listened still get their numbers, in load order.
  for (forms::Form* form : forms::LoadedForms()) {
    if (Fold(form->Name()) != folded) continue;
    int number = InstanceOf(*form);
    if (instance && number == *instance) return form;
    if (!instance && number > newestInstance) {
      newest = form;
      newestInstance = number;
    }
  }
  return instance ? nullptr : newest;
}

}  // namespace app::automate
