#pragma once
// Regional settings as the user's control panel would hold them. The defaults are the
// Portuguese ones; tests pin them so that formats never depend on the machine.

#include <string>

namespace vb {

struct Locale {
  std::string decimal = ",";
  std::string grouping = ".";
  std::string currency = "€";
  std::string dateSeparator = "-";
  std::string trueText = "True";
  std::string falseText = "False";
};

// The regional settings in force for this process.
const Locale& CurrentLocale();
void SetLocale(const Locale& locale);

}  // namespace vb
