#include "platform/vb/Locale.h"

#include <mutex>

namespace vb {
namespace {

Locale& Instance() {
  static Locale locale;
  return locale;
}

}  // namespace

const Locale& CurrentLocale() { return Instance(); }

void SetLocale(const Locale& locale) { Instance() = locale; }

}  // namespace vb
