#pragma once
// What the windows ask of the screen they run on: message and input boxes, letting
// pending window messages run, and (with the form model) modal display, the pointer,
// bringing windows to the front. Three implementations stand behind it: the Qt desktop
// (real windows), the scripted desktop (tests) and the automation driver (JSON lines).

#include <cstdint>
#include <memory>
#include <string>

namespace forms {

class Form;
class Menu;

// MsgBox styles and answers, numbered as Basic numbers them.
enum MsgBoxStyle : int {
  vbOKOnly = 0,
  vbOKCancel = 1,
  vbAbortRetryIgnore = 2,
  vbYesNoCancel = 3,
  vbYesNo = 4,
  vbRetryCancel = 5,
  vbCritical = 16,
  vbQuestion = 32,
  vbExclamation = 48,
  vbInformation = 64,
  vbDefaultButton1 = 0,
  vbDefaultButton2 = 256,
  vbDefaultButton3 = 512,
  vbApplicationModal = 0,
  vbSystemModal = 4096,
};

enum MsgBoxResult : int {
  vbOK = 1,
  vbCancel = 2,
  vbAbort = 3,
  vbRetry = 4,
  vbIgnore = 5,
  vbYes = 6,
  vbNo = 7,
};

enum class MsgButtons { OK, OKCancel, AbortRetryIgnore, YesNoCancel, YesNo, RetryCancel };
enum class MsgIcon { None, Critical, Question, Exclamation, Information };

// A message box as the caller asked for it, decoded from the style bits.
struct MessageBox {
  std::string text;
  std::string title;
  int style = 0;

  MsgButtons Buttons() const { return static_cast<MsgButtons>(style & 7); }
  MsgIcon Icon() const;
  bool SystemModal() const { return (style & vbSystemModal) != 0; }
  // The answer of the default button (the first unless a vbDefaultButtonN says otherwise).
  int DefaultAnswer() const;
  // Whether an answer is one of this box's buttons.
  bool Offers(int answer) const;
};

struct InputRequest {
  std::string prompt;
  std::string title;
  std::string defaultText;
};

// The caption message and input boxes take when the caller gives none.
const std::string& ApplicationTitle();

class Desktop {
 public:
  virtual ~Desktop() = default;

  // Shows a message box and returns the button chosen. An empty title shows the
  // application title.
  virtual int MsgBox(const MessageBox& box) = 0;
  // Asks for a text; "" when the person cancels.
  virtual std::string InputBox(const InputRequest& request) = 0;
  // Lets pending window messages run.
  virtual void DoEvents() = 0;
  // Tells the person something without waiting for them: the caller goes on at once
  // and the notice stays until dismissed. For what must be seen but asks nothing (an
  // error already recorded elsewhere). By default it goes to standard error.
  virtual void ShowNotice(const std::string& title, const std::string& text);

  // The screen's size in twips (1920 x 1080 pixels unless a desktop knows better).
  virtual int32_t ScreenWidth() const { return 1920 * 15; }
  virtual int32_t ScreenHeight() const { return 1080 * 15; }

  // Shows a form modally and returns when it is hidden or unloaded. By default: put
  // it on screen and wait while it is visible.
  virtual void ShowModal(Form& form);
  // Lets window messages run until the form is no longer visible (the loop of a
  // dialog shown modeless and waited on).
  virtual void WaitWhileVisible(Form& form);
  // A form's mouse pointer changed (vbHourglass, vbDefault).
  virtual void MousePointerChanged(Form& form, int pointer) {}
  // A form's place in the z-order changed (HWND_TOPMOST, HWND_NOTOPMOST, HWND_TOP).
  virtual void WindowOrderChanged(Form& form, int32_t insertAfter) {}
  // Shows a pop-up menu and returns the item chosen, or null when it was dismissed.
  // Only a visible, enabled item that is no separator may be returned.
  virtual Menu* ShowPopupMenu(Form& form, Menu& menu, float x, float y) { return nullptr; }

  // The desktop of this process. Until a host installs one, a console desktop answers
  // every box with its default button and writes it to standard error.
  static Desktop& Current();
  static void Install(std::shared_ptr<Desktop> desktop);
  static std::shared_ptr<Desktop> Installed();
};

// Basic's MsgBox and InputBox on the current desktop.
int MsgBox(const std::string& prompt, int style = vbOKOnly, const std::string& title = {});
std::string InputBox(const std::string& prompt, const std::string& title = {},
                     const std::string& defaultText = {});
void DoEvents();

}  // namespace forms
