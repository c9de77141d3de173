#pragma once
// Basic's Format for the pictures the component shows values with: sections split by
// ";" (positive; negative; zero), "0" and "#" digit placeholders, "," grouping, "."
// decimal point, "%" (multiplies by 100), literal text, and the date and time parts
// "dd", "mm", "yyyy", "Hh", "Nn", "Ss". Symbols shown are the regional ones.

#include <string>
#include <string_view>

#include "platform/vb/Variant.h"

namespace vb {

std::string Format(const Variant& value, std::string_view picture = {});

}  // namespace vb
