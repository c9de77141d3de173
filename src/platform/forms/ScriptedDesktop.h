#pragma once
// The desktop of tests: every message and input box is recorded, and answered from a
// queue of answers the test prepared (or the box's default when the queue is empty).
// Forms shown modally (or waited on) are acted on by what the test scripted for them;
// pop-up menus, pointer and z-order changes are recorded.

#include <cstdint>
#include <deque>
#include <functional>
#include <string>
#include <unordered_map>
#include <vector>

#include "platform/forms/Desktop.h"

namespace forms {

class ScriptedDesktop : public Desktop {
 public:
  int MsgBox(const MessageBox& box) override;
  std::string InputBox(const InputRequest& request) override;
  void DoEvents() override { ++doEventsCalls; }
  void ShowNotice(const std::string& title, const std::string& text) override {
    notices.push_back({title, text});
  }

  int32_t ScreenWidth() const override { return screenWidth; }
  int32_t ScreenHeight() const override { return screenHeight; }
  void ShowModal(Form& form) override;
  void WaitWhileVisible(Form& form) override;
  void MousePointerChanged(Form& form, int pointer) override;
  void WindowOrderChanged(Form& form, int32_t insertAfter) override;
  Menu* ShowPopupMenu(Form& form, Menu& menu, float x, float y) override;

  // Answers for the next boxes, in order. An answer that is not among a box's buttons
  // fails the box with a logic_error, so a test cannot answer "Yes" to an OK box.
  void QueueAnswer(int answer) { answers_.push_back(answer); }
  // Texts for the next input boxes; nullopt-like cancel is QueueInputCancel.
  void QueueInput(std::string text) { inputs_.push_back({std::move(text), false}); }
  void QueueInputCancel() { inputs_.push_back({{}, true}); }

  // What the person does the next time the form of that name is shown modally or
  // waited on ("select item #3 and click OK"). Each action runs once, in the order
  // queued. When the form is still on screen after it (or nothing was queued), the
  // person closes it with its close box; a form that refuses even that is hidden and
  // named in `leftOpen`, so no test waits forever.
  void WhenShown(std::string formName, std::function<void(Form&)> action) {
    actions_[std::move(formName)].push_back(std::move(action));
  }
  // The item chosen in the next pop-up menu, by its name; "" dismisses the menu. A
  // choice the menu does not offer enabled and visible fails with a logic_error.
  void QueueMenuChoice(std::string itemName) { menuChoices_.push_back(std::move(itemName)); }

  std::vector<MessageBox> messages;
  std::vector<InputRequest> inputs;
  struct Notice {
    std::string title;
    std::string text;
  };
  std::vector<Notice> notices;
  int doEventsCalls = 0;

  // Names of the forms shown modally or waited on, in order.
  std::vector<std::string> modalForms;
  std::vector<std::string> leftOpen;
  struct MenuItemSeen {
    std::string name;
    std::string caption;
    bool enabled;
    bool visible;
  };
  struct MenuSeen {
    std::string form;
    std::string menu;
    std::vector<MenuItemSeen> items;
  };
  std::vector<MenuSeen> menus;
  struct PointerChange {
    std::string form;
    int pointer;
  };
  std::vector<PointerChange> pointers;
  struct WindowOrder {
    std::string form;
    int32_t insertAfter;
  };
  std::vector<WindowOrder> windowOrders;

  int32_t screenWidth = 1920 * 15;
  int32_t screenHeight = 1080 * 15;

 private:
  void ActOn(Form& form);

  std::deque<int> answers_;
  struct Input {
    std::string text;
    bool cancel;
  };
  std::deque<Input> inputs_;
  std::unordered_map<std::string, std::deque<std::function<void(Form&)>>> actions_;
  std::deque<std::string> menuChoices_;
};

}  // namespace forms
