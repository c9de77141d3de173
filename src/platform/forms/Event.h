#pragma once
// One event of a control or a form: at most one handler, as a Basic event procedure.
// Arguments a handler may change (Cancel, KeyCode, KeyAscii) are passed by reference.

#include <functional>
#include <utility>

namespace forms {

template <class... Args>
class Event {
 public:
  using Handler = std::function<void(Args...)>;

  Event& operator=(Handler handler) {
    handler_ = std::move(handler);
    return *this;
  }
  explicit operator bool() const { return static_cast<bool>(handler_); }

  void operator()(Args... args) const {
    if (!handler_) return;
    // A handler may replace itself (or its control's handlers) while it runs.
    Handler running = handler_;
    running(std::forward<Args>(args)...);
  }

 private:
  Handler handler_;
};

}  // namespace forms
