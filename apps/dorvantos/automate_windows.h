#pragma once
// The windows a script names: a form's name and its instance, counted from 1 for each
// name in the order the windows of that name first loaded. An instance keeps its number
// while its window lives, across unloads and reloads; numbers of windows that are gone
// are not given again, so a script never reaches a newer window by an old number.

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "platform/forms/Form.h"
#include "platform/forms/FormListener.h"

namespace app::automate {

class WindowIndex : public forms::FormListener {
 public:
  WindowIndex();
  ~WindowIndex() override;
  WindowIndex(const WindowIndex&) = delete;
  WindowIndex& operator=(const WindowIndex&) = delete;

  void FormLoaded(forms::Form& form) override { InstanceOf(form); }

  // The window's instance, numbered now if it has none yet.
  int InstanceOf(forms::Form& form);
  // The loaded window of that name (ignoring letter case) and instance; without an
  // instance, the newest loaded one. Null when there is none.
  forms::Form* Find(std::string_view name, std::optional<int> instance = std::nullopt);

 private:
  struct Entry {
    std::string name;  // folded
    int instance;
    forms::Form* form;
    // Set for windows owned through shared pointers: tells a window that is gone from a
    // new one built at the same address.
    std::weak_ptr<vb::Object> alive;
    bool tracked;
  };
  Entry* Live(forms::Form& form);

  std::vector<Entry> entries_;
  std::map<std::string, int> counts_;
};

}  // namespace app::automate
