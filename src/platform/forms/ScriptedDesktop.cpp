#include "platform/forms/ScriptedDesktop.h"

#include <fmt/format.h>

#include <stdexcept>

#include "platform/forms/Form.h"
#include "platform/forms/Menu.h"

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

void ScriptedDesktop::ShowModal(Form& form) {
  form.Display(true);
  WaitWhileVisible(form);
}

void ScriptedDesktop::WaitWhileVisible(Form& form) {
  if (!form.Showing()) return;
  modalForms.push_back(form.Name());
  ActOn(form);
}

void ScriptedDesktop::ActOn(Form& form) {
  ++doEventsCalls;
  auto queued = actions_.find(form.Name());
  if (queued != actions_.end() && !queued->second.empty()) {
    auto action = std::move(queued->second.front());
    queued->second.pop_front();
    action(form);
  }
  if (form.Showing()) form.Close();
  if (form.Showing()) {
    leftOpen.push_back(form.Name());
    form.Hide();
  }
}

void ScriptedDesktop::MousePointerChanged(Form& form, int pointer) {
  pointers.push_back({form.Name(), pointer});
}

void ScriptedDesktop::WindowOrderChanged(Form& form, int32_t insertAfter) {
  windowOrders.push_back({form.Name(), insertAfter});
}

Menu* ScriptedDesktop::ShowPopupMenu(Form& form, Menu& menu, float x, float y) {
  MenuSeen seen{form.Name(), menu.Name(), {}};
  Menu* chosen = nullptr;
  std::string choice;
  if (!menuChoices_.empty()) {
    choice = std::move(menuChoices_.front());
    menuChoices_.pop_front();
  }
  for (Menu* item : menu.Items()) {
    seen.items.push_back({item->Name(), item->Caption(), item->Enabled(), item->Visible()});
    if (!choice.empty() && item->Name() == choice) chosen = item;
  }
  menus.push_back(std::move(seen));
  if (!choice.empty() && (!chosen || !chosen->CanBeChosen()))
    throw std::logic_error(fmt::format("menu {} offers no item {} to choose", menu.Name(), choice));
  return chosen;
}

}  // namespace forms
