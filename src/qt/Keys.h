#pragma once
// A Qt key event as the model wants it: the Windows virtual key code, the Shift/Ctrl/Alt
// mask and the character the key types (0 for keys that type none).

#include <optional>

class QKeyEvent;

namespace dvqt {

struct Keystroke {
  int keyCode = 0;
  int shift = 0;
  int character = 0;
};

// nullopt for keys the model has no code for (media keys, lone dead keys).
std::optional<Keystroke> TranslateKey(const QKeyEvent& event);
int ShiftMask(const QKeyEvent& event);

}  // namespace dvqt
