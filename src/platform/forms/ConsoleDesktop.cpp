#include "platform/forms/ConsoleDesktop.h"

#include <fmt/format.h>

#include <cstdio>

#include "platform/forms/Form.h"

namespace forms {

namespace {

const char* AnswerName(int answer) {
  switch (answer) {
    case vbOK: return "OK";
    case vbCancel: return "Cancel";
    case vbAbort: return "Abort";
    case vbRetry: return "Retry";
    case vbIgnore: return "Ignore";
    case vbYes: return "Yes";
    case vbNo: return "No";
    default: return "?";
  }
}

}  // namespace

int ConsoleDesktop::MsgBox(const MessageBox& box) {
  int answer = box.DefaultAnswer();
  fmt::print(stderr, "[{}] {} -> {}\n", box.title.empty() ? ApplicationTitle() : box.title,
             box.text, AnswerName(answer));
  std::fflush(stderr);
  return answer;
}

std::string ConsoleDesktop::InputBox(const InputRequest& request) {
  fmt::print(stderr, "[{}] {} -> \"{}\"\n",
             request.title.empty() ? ApplicationTitle() : request.title, request.prompt,
             request.defaultText);
  std::fflush(stderr);
  return request.defaultText;
}

void ConsoleDesktop::WaitWhileVisible(Form& form) {
  if (!form.Showing()) return;
  fmt::print(stderr, "[{}] window shown with nobody to answer it; closing it\n", form.Name());
  std::fflush(stderr);
  if (form.Showing()) form.Close();
  if (form.Showing()) form.Hide();
}

}  // namespace forms
