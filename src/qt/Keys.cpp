#include "qt/Keys.h"

#include <QKeyEvent>

#include "platform/forms/Constants.h"

namespace dvqt {

namespace {

// Keys of the numeric keypad, which Windows codes apart from the main keyboard's.
int KeypadCode(int key) {
  if (key >= Qt::Key_0 && key <= Qt::Key_9) return 96 + (key - Qt::Key_0);
  switch (key) {
    case Qt::Key_Asterisk: return 106;
    case Qt::Key_Plus: return forms::vbKeyAdd;
    case Qt::Key_Minus: return forms::vbKeySubtract;
    case Qt::Key_Period:
    case Qt::Key_Comma: return 110;  // the decimal key, whatever the layout prints on it
    case Qt::Key_Slash: return 111;
    default: return 0;
  }
}

int VirtualKey(int key, bool keypad) {
  if (keypad)
    if (int code = KeypadCode(key)) return code;
  if (key >= Qt::Key_A && key <= Qt::Key_Z) return 'A' + (key - Qt::Key_A);
  if (key >= Qt::Key_0 && key <= Qt::Key_9) return '0' + (key - Qt::Key_0);
  if (key >= Qt::Key_F1 && key <= Qt::Key_F24) return forms::vbKeyF1 + (key - Qt::Key_F1);
  switch (key) {
    case Qt::Key_Backspace: return forms::vbKeyBack;
    case Qt::Key_Tab:
    case Qt::Key_Backtab: return forms::vbKeyTab;
    case Qt::Key_Return:
    case Qt::Key_Enter: return forms::vbKeyReturn;
    case Qt::Key_Escape: return forms::vbKeyEscape;
    case Qt::Key_Space: return forms::vbKeySpace;
    case Qt::Key_PageUp: return forms::vbKeyPageUp;
    case Qt::Key_PageDown: return forms::vbKeyPageDown;
    case Qt::Key_End: return forms::vbKeyEnd;
    case Qt::Key_Home: return forms::vbKeyHome;
    case Qt::Key_Left: return forms::vbKeyLeft;
    case Qt::Key_Up: return forms::vbKeyUp;
    case Qt::Key_Right: return forms::vbKeyRight;
    case Qt::Key_Down: return forms::vbKeyDown;
    case Qt::Key_Insert: return forms::vbKeyInsert;
    case Qt::Key_Delete: return forms::vbKeyDelete;
    case Qt::Key_Shift: return forms::vbKeyShift;
    case Qt::Key_Control: return forms::vbKeyControl;
    case Qt::Key_Alt: return 18;
    case Qt::Key_Pause: return 19;
    case Qt::Key_CapsLock: return 20;
    case Qt::Key_Menu: return 93;
    case Qt::Key_Semicolon: return 186;
    case Qt::Key_Equal:
    case Qt::Key_Plus: return 187;
    case Qt::Key_Comma: return 188;
    case Qt::Key_Minus: return 189;
    case Qt::Key_Period: return 190;
    case Qt::Key_Slash: return 191;
    case Qt::Key_QuoteLeft: return 192;
    case Qt::Key_BracketLeft: return 219;
    case Qt::Key_Backslash: return 220;
    case Qt::Key_BracketRight: return 221;
    case Qt::Key_Apostrophe: return 222;
    case Qt::Key_Less: return 226;
    default: return 0;
  }
}

// The code point a key event types; control characters only where Windows sends them
// as characters too (Backspace, Enter, Escape).
int CharacterOf(const QKeyEvent& event, int keyCode) {
  if (keyCode == forms::vbKeyReturn) return 13;
  if (keyCode == forms::vbKeyBack) return 8;
  if (keyCode == forms::vbKeyEscape) return 27;
  if (keyCode == forms::vbKeyTab || keyCode == forms::vbKeyDelete) return 0;
  const QString text = event.text();
  if (text.isEmpty()) return 0;
  char32_t code = text.at(0).unicode();
  if (text.size() > 1 && text.at(0).isHighSurrogate() && text.at(1).isLowSurrogate())
    code = QChar::surrogateToUcs4(text.at(0), text.at(1));
  if (code < 32 || code == 127) return 0;
  return static_cast<int>(code);
}

}  // namespace

int ShiftMask(const QKeyEvent& event) {
  int shift = 0;
  if (event.modifiers() & Qt::ShiftModifier) shift |= forms::vbShiftMask;
  if (event.modifiers() & Qt::ControlModifier) shift |= forms::vbCtrlMask;
  if (event.modifiers() & Qt::AltModifier) shift |= forms::vbAltMask;
  return shift;
}

std::optional<Keystroke> TranslateKey(const QKeyEvent& event) {
  Keystroke stroke;
  stroke.shift = ShiftMask(event);
  if (event.key() == Qt::Key_Backtab) stroke.shift |= forms::vbShiftMask;
  stroke.keyCode = VirtualKey(event.key(), (event.modifiers() & Qt::KeypadModifier) != 0);
  // With Ctrl or Alt held a key is a command, not typing (Ctrl+C is no "c").
  bool command = (stroke.shift & (forms::vbCtrlMask | forms::vbAltMask)) != 0;
  stroke.character = command ? 0 : CharacterOf(event, stroke.keyCode);
  if (stroke.keyCode == 0) {
    // A character no key of the layout has a code for (ç, º, an input method's).
    if (stroke.character == 0) return std::nullopt;
    stroke.keyCode = forms::vbKeyProcessKey;
  }
  return stroke;
}

}  // namespace dvqt
