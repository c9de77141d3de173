#pragma once
// A progress bar. Value must lie between Min and Max: anything else is refused with
// "Invalid property value" (380), as on Windows, so a caller learns it went too far.

#include "platform/forms/Control.h"

namespace forms {

class ProgressBar : public Control {
 public:
  using Control::Control;

  double Min() const;
  double Max() const;
  double Value() const;
  void SetMin(double min);
  void SetMax(double max);
  void SetValue(double value);

  vb::Variant Get(const std::string& name) override;
  void Let(const std::string& name, const vb::Variant& value) override;

 protected:
  void ResetState() override { state_ = {}; }

 private:
  struct State {
    double min = 0, max = 100, value = 0;
  } state_;
};

}  // namespace forms
