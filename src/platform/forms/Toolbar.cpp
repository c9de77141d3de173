#include "platform/forms/Toolbar.h"

#include "platform/forms/Form.h"
#include "platform/vb/Error.h"

namespace forms {

void ToolbarButton::Changed(std::string_view property) { owner_.ItemChanged(key_, property); }

void ToolbarButton::SetCaption(std::string caption) {
  if (caption_ == caption) return;
  caption_ = std::move(caption);
  Changed("Caption");
}

void ToolbarButton::SetEnabled(bool enabled) {
  if (enabled_ == enabled) return;
  enabled_ = enabled;
  Changed("Enabled");
}

void ToolbarButton::SetVisible(bool visible) {
  if (visible_ == visible) return;
  visible_ = visible;
  Changed("Visible");
}

ToolbarButton* ToolbarButtons::Find(const std::string& key) const {
  auto found = byKey_.find(key);
  return found == byKey_.end() ? nullptr : found->second;
}

ToolbarButton& ToolbarButtons::operator()(const std::string& key) const {
  if (ToolbarButton* button = Find(key)) return *button;
  throw vb::Error(vb::kErrElementNotFound, "Element not found");
}

ToolbarButton& ToolbarButtons::operator()(int32_t index) const {
  if (index < 1 || index > Count()) throw vb::Error(35600, "Index out of bounds");
  return *buttons_[static_cast<size_t>(index - 1)];
}

int32_t ToolbarButtons::Count() const { return static_cast<int32_t>(buttons_.size()); }

ToolbarButton& ToolbarButtons::Add(std::string key, std::string caption) {
  if (!key.empty() && byKey_.count(key))
    throw vb::Error(vb::kErrKeyNotUnique, "Key is not unique in collection");
  buttons_.push_back(
      std::make_unique<ToolbarButton>(owner_, std::move(key), std::move(caption), Count() + 1));
  ToolbarButton& added = *buttons_.back();
  if (!added.Key().empty()) byKey_[added.Key()] = &added;
  owner_.Changed("Buttons");
  return added;
}

void ToolbarButtons::Clear() {
  buttons_.clear();
  byKey_.clear();
  owner_.Changed("Buttons");
}

void Toolbar::ApplyItems(const std::vector<ItemDesign>& items) {
  for (const ItemDesign& item : items) buttons_.Add(item.key, item.caption);
}

bool Toolbar::ClickButton(ToolbarButton& button) {
  Touch();
  if (!Visible() || !Enabled() || !Parent().Showing() || !button.Visible() || !button.Enabled())
    return false;
  Raise(ButtonClick, button);
  return true;
}

}  // namespace forms
