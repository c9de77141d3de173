#include "platform/vb/Decimal.h"

#include <fmt/format.h>

#include <cmath>
#include <cstdlib>

namespace vb {
namespace {

// Adds one unit in the last place of a string of decimal digits; returns the carry.
bool Increment(std::string& digits) {
  for (auto it = digits.rbegin(); it != digits.rend(); ++it) {
    if (*it == '9') {
      *it = '0';
    } else {
      ++*it;
      return false;
    }
  }
  return true;
}

}  // namespace

DecimalDigits ToDecimal(double x, int decimals, Rounding rounding) {
  DecimalDigits out;
  if (decimals < 0) decimals = 0;
  if (!std::isfinite(x) || x == 0.0) {
    out.integer = "0";
    out.fraction.assign(static_cast<size_t>(decimals), '0');
    return out;
  }
  // "d.dddddddddddddde+XX": fifteen significant digits and the exponent.
  const std::string sci = fmt::format("{:.14e}", std::fabs(x));
  const size_t e = sci.find('e');
  std::string digits = sci.substr(0, 1) + sci.substr(2, e - 2);
  const int exponent = std::atoi(sci.c_str() + e + 1);
  const int pointPos = exponent + 1;  // digits before the decimal point

  std::string integer, fraction;
  if (pointPos <= 0) {
    integer = "0";
    fraction = std::string(static_cast<size_t>(-pointPos), '0') + digits;
  } else if (pointPos >= static_cast<int>(digits.size())) {
    integer = digits + std::string(static_cast<size_t>(pointPos) - digits.size(), '0');
  } else {
    integer = digits.substr(0, static_cast<size_t>(pointPos));
    fraction = digits.substr(static_cast<size_t>(pointPos));
  }

  if (static_cast<int>(fraction.size()) <= decimals) {
    fraction.append(static_cast<size_t>(decimals) - fraction.size(), '0');
  } else {
    const char next = fraction[static_cast<size_t>(decimals)];
    const bool restNonZero =
        fraction.find_first_not_of('0', static_cast<size_t>(decimals) + 1) != std::string::npos;
    fraction.resize(static_cast<size_t>(decimals));
    bool up;
    if (rounding == Rounding::HalfAwayFromZero) {
      up = next >= '5';
    } else {
      const char last = decimals > 0 ? fraction.back() : integer.back();
      up = next > '5' || (next == '5' && (restNonZero || (last - '0') % 2 == 1));
    }
    if (up) {
      std::string all = integer + fraction;
      if (Increment(all)) all.insert(all.begin(), '1');
      integer = all.substr(0, all.size() - fraction.size());
      fraction = all.substr(all.size() - fraction.size());
    }
  }

  const size_t firstNonZero = integer.find_first_not_of('0');
  integer = firstNonZero == std::string::npos ? "0" : integer.substr(firstNonZero);
  const bool allZero = integer == "0" && fraction.find_first_not_of('0') == std::string::npos;
  out.negative = x < 0 && !allZero;
  out.integer = std::move(integer);
  out.fraction = std::move(fraction);
  return out;
}

}  // namespace vb
