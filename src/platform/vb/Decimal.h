#pragma once
// Decimal rounding of doubles. A double such as 1.005 is stored a hair below its
// decimal value; reading it back to 15 significant digits first, as Basic does, makes
// rounding act on the digits the person typed, so amounts round as on paper.

#include <string>

namespace vb {

struct DecimalDigits {
  bool negative = false;   // set only when some kept digit is not zero
  std::string integer;     // at least "0", no leading zeros
  std::string fraction;    // exactly the requested number of decimals
};

enum class Rounding { HalfAwayFromZero, HalfEven };

DecimalDigits ToDecimal(double x, int decimals, Rounding rounding);

}  // namespace vb
