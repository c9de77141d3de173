#pragma once
// No exception may cross a Qt event handler: Qt cannot unwind through its event loop.
// What a model handler lets escape is logged and the input is dropped.

#include <exception>
#include <functional>

namespace dvqt {

// Runs the action; false when it threw (after logging what).
bool Guarded(const std::function<void()>& action, const char* what);

}  // namespace dvqt
