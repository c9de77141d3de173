#include "qt/Guard.h"

#include <fmt/format.h>

#include <cstdio>

#include "platform/vb/Error.h"

namespace dvqt {

bool Guarded(const std::function<void()>& action, const char* what) {
  try {
    action();
    return true;
  } catch (const vb::Error& error) {
    fmt::print(stderr, "dv_qt: {}: error {}: {}\n", what, error.Number(), error.Description());
  } catch (const std::exception& error) {
    fmt::print(stderr, "dv_qt: {}: {}\n", what, error.what());
  } catch (...) {
    fmt::print(stderr, "dv_qt: {}: unknown exception\n", what);
  }
  return false;
}

}  // namespace dvqt
