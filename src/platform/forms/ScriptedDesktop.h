#pragma once
// The desktop of tests: every message and input box is recorded, and answered from a
// queue of answers the test prepared (or the box's default when the queue is empty).

#include <deque>
#include <functional>
#include <string>
#include <vector>

#include "platform/forms/Desktop.h"

namespace forms {

class ScriptedDesktop : public Desktop {
 public:
  int MsgBox(const MessageBox& box) override;
  std::string InputBox(const InputRequest& request) override;
  void DoEvents() override { ++doEventsCalls; }

  // Answers for the next boxes, in order. An answer that is not among a box's buttons
  // fails the box with a logic_error, so a test cannot answer "Yes" to an OK box.
  void QueueAnswer(int answer) { answers_.push_back(answer); }
  // Texts for the next input boxes; nullopt-like cancel is QueueInputCancel.
  void QueueInput(std::string text) { inputs_.push_back({std::move(text), false}); }
  void QueueInputCancel() { inputs_.push_back({{}, true}); }

  std::vector<MessageBox> messages;
  std::vector<InputRequest> inputs;
  int doEventsCalls = 0;

 private:
  std::deque<int> answers_;
  struct Input {
    std::string text;
    bool cancel;
  };
  std::deque<Input> inputs_;
};

}  // namespace forms
