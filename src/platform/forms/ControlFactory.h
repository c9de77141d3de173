#pragma once
// Builds the control a design row names.

#include <memory>

#include "platform/forms/Control.h"

namespace forms {

std::shared_ptr<Control> CreateControl(Form& form, const ControlDesign& design);

}  // namespace forms
