#pragma once
// A date picker. It always holds a date; 1 January 1900 stands for "no date".
// Setting Value to another date raises Change, by code as by a person's choice.

#include "platform/forms/Control.h"
#include "platform/vb/Date.h"

namespace forms {

class DTPicker : public Control {
 public:
  using Control::Control;

  vb::Date Value() const;
  void SetValue(vb::Date value);

  Event<> Change;

  vb::Variant Get(const std::string& name) override;
  void Let(const std::string& name, const vb::Variant& value) override;
  bool Focusable() const override { return true; }

 protected:
  void ResetState() override { value_ = vb::kEmptyDate; }
  int32_t DefaultBackColor() const override { return vbWindowBackground; }

 private:
  vb::Date value_ = vb::kEmptyDate;
};

}  // namespace forms
