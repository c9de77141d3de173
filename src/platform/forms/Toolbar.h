#pragma once
// A toolbar: buttons found by key (Buttons("gravar")) or 1-based index, each with a
// caption, Enabled and Visible. A person's click on an enabled button raises
// ButtonClick with that button.

#include <cstdint>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "platform/forms/Control.h"

namespace forms {

class Toolbar;

class ToolbarButton {
 public:
  ToolbarButton(Toolbar& owner, std::string key, std::string caption, int32_t index)
      : owner_(owner), key_(std::move(key)), caption_(std::move(caption)), index_(index) {}

  const std::string& Key() const { return key_; }
  int32_t Index() const { return index_; }
  const std::string& Caption() const { return caption_; }
  void SetCaption(std::string caption);
  bool Enabled() const { return enabled_; }
  void SetEnabled(bool enabled);
  bool Visible() const { return visible_; }
  void SetVisible(bool visible);
  const std::string& Tag() const { return tag_; }
  void SetTag(std::string tag) { tag_ = std::move(tag); }

 private:
  void Changed(std::string_view property);

  Toolbar& owner_;
  std::string key_;
  std::string caption_;
  int32_t index_;
  bool enabled_ = true;
  bool visible_ = true;
  std::string tag_;
};

class ToolbarButtons {
 public:
  explicit ToolbarButtons(Toolbar& owner) : owner_(owner) {}

  // Error 35601 when no button has the key.
  ToolbarButton& operator()(const std::string& key) const;
  // 1-based; error 35600 out of bounds.
  ToolbarButton& operator()(int32_t index) const;
  ToolbarButton* Find(const std::string& key) const;
  int32_t Count() const;
  // Error 35602 when the key is taken.
  ToolbarButton& Add(std::string key, std::string caption);
  void Clear();

 private:
  Toolbar& owner_;
  std::vector<std::unique_ptr<ToolbarButton>> buttons_;
  std::unordered_map<std::string, ToolbarButton*> byKey_;
};

class Toolbar : public Control {
 public:
  Toolbar(Form& form, ControlDesign design) : Control(form, std::move(design)), buttons_(*this) {}

  ToolbarButtons& Buttons() { Touch(); return buttons_; }
  const ToolbarButtons& Buttons() const { Touch(); return buttons_; }

  Event<ToolbarButton&> ButtonClick;

  // What a person's click on a button does: nothing unless the toolbar and the
  // button are visible and enabled on a shown form. False when nothing happened.
  bool ClickButton(ToolbarButton& button);

 protected:
  void ResetState() override { buttons_.Clear(); }
  void ApplyItems(const std::vector<ItemDesign>& items) override;

 private:
  friend class ToolbarButton;
  friend class ToolbarButtons;
  ToolbarButtons buttons_;
};

}  // namespace forms
