#include "platform/forms/ScriptedDesktop.h"

#include <fmt/format.h>

#include <stdexcept>

namespace forms {

int ScriptedDesktop::MsgBox(const MessageBox& box) {
  messages.push_back(box);
  if (messages.back().title.empty()) messages.back().title = ApplicationTitle();
  if (answers_.empty()) return box.DefaultAnswer();
  int answer = answers_.front();
  answers_.pop_front();
  if (!box.Offers(answer))
    throw std::logic_error(
        fmt::format("scripted answer {} is not a button of the box \"{}\"", answer, box.text));
  return answer;
}

std::string ScriptedDesktop::InputBox(const InputRequest& request) {
  inputs.push_back(request);
  if (inputs.back().title.empty()) inputs.back().title = ApplicationTitle();
  if (inputs_.empty()) return request.defaultText;
  Input input = std::move(inputs_.front());
  inputs_.pop_front();
  return input.cancel ? std::string{} : std::move(input.text);
}

}  // namespace forms
