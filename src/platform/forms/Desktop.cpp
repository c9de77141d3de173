#include "platform/forms/Desktop.h"

#include <fmt/format.h>

#include <array>
#include <cstdio>
#include <span>

#include "platform/forms/ConsoleDesktop.h"
#include "platform/forms/Form.h"

namespace forms {

namespace {

// The answers of each button set, left to right as Windows lays them out.
std::span<const int> ButtonAnswers(MsgButtons buttons) {
  static constexpr std::array<int, 1> kOK{vbOK};
  static constexpr std::array<int, 2> kOKCancel{vbOK, vbCancel};
  static constexpr std::array<int, 3> kAbortRetryIgnore{vbAbort, vbRetry, vbIgnore};
  static constexpr std::array<int, 3> kYesNoCancel{vbYes, vbNo, vbCancel};
  static constexpr std::array<int, 2> kYesNo{vbYes, vbNo};
  static constexpr std::array<int, 2> kRetryCancel{vbRetry, vbCancel};
  switch (buttons) {
    case MsgButtons::OKCancel: return kOKCancel;
    case MsgButtons::AbortRetryIgnore: return kAbortRetryIgnore;
    case MsgButtons::YesNoCancel: return kYesNoCancel;
    case MsgButtons::YesNo: return kYesNo;
    case MsgButtons::RetryCancel: return kRetryCancel;
    case MsgButtons::OK: break;
  }
  return kOK;
}

std::shared_ptr<Desktop>& InstalledSlot() {
  static std::shared_ptr<Desktop> installed;
  return installed;
}

}  // namespace

MsgIcon MessageBox::Icon() const {
  switch (style & 0x70) {
    case vbCritical: return MsgIcon::Critical;
    case vbQuestion: return MsgIcon::Question;
    case vbExclamation: return MsgIcon::Exclamation;
    case vbInformation: return MsgIcon::Information;
    default: return MsgIcon::None;
  }
}

int MessageBox::DefaultAnswer() const {
  // Style bits 0-2 above 5 are not a button set Windows knows; it shows OK then.
  std::span<const int> answers = ButtonAnswers((style & 7) <= 5 ? Buttons() : MsgButtons::OK);
  size_t which = static_cast<size_t>((style & 0x300) >> 8);
  // A default button beyond the last one falls back to the first, as Windows does.
  return which < answers.size() ? answers[which] : answers.front();
}

bool MessageBox::Offers(int answer) const {
  for (int offered : ButtonAnswers((style & 7) <= 5 ? Buttons() : MsgButtons::OK))
    if (offered == answer) return true;
  return false;
}

const std::string& ApplicationTitle() {
  static const std::string title = "POC_Dorvantos";
  return title;
}

Desktop& Desktop::Current() {
  if (auto& installed = InstalledSlot()) return *installed;
  static ConsoleDesktop console;
  return console;
}

void Desktop::Install(std::shared_ptr<Desktop> desktop) { InstalledSlot() = std::move(desktop); }

std::shared_ptr<Desktop> Desktop::Installed() { return InstalledSlot(); }

void Desktop::ShowNotice(const std::string& title, const std::string& text) {
  fmt::print(stderr, "[{}] {}\n", title.empty() ? ApplicationTitle() : title, text);
  std::fflush(stderr);
}

void Desktop::ShowModal(Form& form) {
  form.Display(true);
  WaitWhileVisible(form);
}

void Desktop::WaitWhileVisible(Form& form) {
  while (form.Showing()) DoEvents();
}

int MsgBox(const std::string& prompt, int style, const std::string& title) {
  MessageBox box{prompt, title.empty() ? ApplicationTitle() : title, style};
  return Desktop::Current().MsgBox(box);
}

std::string InputBox(const std::string& prompt, const std::string& title,
                     const std::string& defaultText) {
  InputRequest request{prompt, title.empty() ? ApplicationTitle() : title, defaultText};
  return Desktop::Current().InputBox(request);
}

void DoEvents() { Desktop::Current().DoEvents(); }

}  // namespace forms
