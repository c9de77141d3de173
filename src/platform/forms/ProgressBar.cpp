#include "platform/forms/ProgressBar.h"

#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace forms {

namespace {

const PropertyTable<ProgressBar>& Properties() {
  static const PropertyTable<ProgressBar> table = {
      {"min",
       {[](ProgressBar& c) { return vb::Variant(c.Min()); },
        [](ProgressBar& c, const vb::Variant& v) { c.SetMin(vb::CDbl(v)); }}},
      {"max",
       {[](ProgressBar& c) { return vb::Variant(c.Max()); },
        [](ProgressBar& c, const vb::Variant& v) { c.SetMax(vb::CDbl(v)); }}},
      {"value",
       {[](ProgressBar& c) { return vb::Variant(c.Value()); },
        [](ProgressBar& c, const vb::Variant& v) { c.SetValue(vb::CDbl(v)); }}},
  };
  return table;
}

[[noreturn]] void Invalid() { throw vb::Error(380, "Invalid property value"); }

}  // namespace

double ProgressBar::Min() const { Touch(); return state_.min; }
double ProgressBar::Max() const { Touch(); return state_.max; }
double ProgressBar::Value() const { Touch(); return state_.value; }

void ProgressBar::SetMin(double min) {
  Touch();
  if (min >= state_.max) Invalid();
  state_.min = min;
  if (state_.value < min) state_.value = min;
  Changed("Min");
}

void ProgressBar::SetMax(double max) {
  Touch();
  if (max <= state_.min) Invalid();
  state_.max = max;
  if (state_.value > max) state_.value = max;
  Changed("Max");
}

void ProgressBar::SetValue(double value) {
  Touch();
  if (value < state_.min || value > state_.max) Invalid();
  if (state_.value == value) return;
  state_.value = value;
  Changed("Value");
}

vb::Variant ProgressBar::Get(const std::string& name) { return GetProperty(Properties(), *this, name); }
void ProgressBar::Let(const std::string& name, const vb::Variant& value) {
  LetProperty(Properties(), *this, name, value);
}

}  // namespace forms
