#include "platform/forms/ConsoleDesktop.h"

#include <fmt/format.h>

#include <cstdio>

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

}  // namespace forms
