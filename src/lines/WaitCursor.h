#pragma once
// The hourglass on a window for the length of a scope. The default pointer comes back
// when the scope ends, also when it ends through an error, so a failed lookup never
// leaves the window looking busy.

#include "platform/forms/Form.h"

namespace lines {

class WaitCursor {
 public:
  explicit WaitCursor(forms::Form& form) : form_(form) { form_.SetMousePointer(forms::vbHourglass); }
  ~WaitCursor() {
    // The window may have been unloaded meanwhile; touching it would load it again.
    if (form_.Loaded()) form_.SetMousePointer(forms::vbDefault);
  }
  WaitCursor(const WaitCursor&) = delete;
  WaitCursor& operator=(const WaitCursor&) = delete;

 private:
  forms::Form& form_;
};

}  // namespace lines
