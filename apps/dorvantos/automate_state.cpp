#include "automate_state.h"

#include <fmt/format.h>

#include <array>
#include <cctype>
#include <cmath>
#include <utility>

namespace app::automate {

namespace {

std::string Lower(std::string_view text) {
  std::string lower(text);
  for (char& c : lower) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return lower;
}

bool StartsWithNoCase(std::string_view text, std::string_view prefix) {
  return text.size() >= prefix.size() && Lower(text.substr(0, prefix.size())) == prefix;
}

// Keys by their lower-case name, with the character each types by itself.
std::optional<KeyStroke> NamedKey(const std::string& name) {
  struct Named {
    const char* name;
    int keyCode;
    int character;
  };
  static constexpr std::array<Named, 17> kKeys{{
      {"enter", forms::vbKeyReturn, 13},
      {"tab", forms::vbKeyTab, 0},
      {"left", forms::vbKeyLeft, 0},
      {"right", forms::vbKeyRight, 0},
      {"up", forms::vbKeyUp, 0},
      {"down", forms::vbKeyDown, 0},
      {"delete", forms::vbKeyDelete, 0},
      {"backspace", forms::vbKeyBack, 8},
      {"escape", forms::vbKeyEscape, 27},
      {"space", forms::vbKeySpace, ' '},
      {"home", forms::vbKeyHome, 0},
      {"end", forms::vbKeyEnd, 0},
      {"pageup", forms::vbKeyPageUp, 0},
      {"pagedown", forms::vbKeyPageDown, 0},
      {"insert", forms::vbKeyInsert, 0},
      // The keypad's plus and minus type their sign, as they do on Windows.
      {"add", forms::vbKeyAdd, '+'},
      {"subtract", forms::vbKeySubtract, '-'},
  }};
  for (const Named& key : kKeys)
    if (name == key.name) return KeyStroke{key.keyCode, 0, key.character};
  if (name.size() >= 2 && name.size() <= 3 && name[0] == 'f') {
    int number = 0;
    for (size_t i = 1; i < name.size(); ++i) {
      if (!std::isdigit(static_cast<unsigned char>(name[i]))) return std::nullopt;
      number = number * 10 + (name[i] - '0');
    }
    if (name[1] == '0' || number < 1 || number > 12) return std::nullopt;
    return KeyStroke{forms::vbKeyF1 + number - 1, 0, 0};
  }
  return std::nullopt;
}

const char* IconName(forms::MsgIcon icon) {
  switch (icon) {
    case forms::MsgIcon::Critical: return "critical";
    case forms::MsgIcon::Question: return "question";
    case forms::MsgIcon::Exclamation: return "exclamation";
    case forms::MsgIcon::Information: return "information";
    case forms::MsgIcon::None: break;
  }
  return "none";
}

const char* ButtonsName(const forms::MessageBox& box) {
  // Style bits Windows does not know show OK, as the box itself does.
  if ((box.style & 7) > 5) return "ok";
  switch (box.Buttons()) {
    case forms::MsgButtons::OKCancel: return "okcancel";
    case forms::MsgButtons::AbortRetryIgnore: return "abortretryignore";
    case forms::MsgButtons::YesNoCancel: return "yesnocancel";
    case forms::MsgButtons::YesNo: return "yesno";
    case forms::MsgButtons::RetryCancel: return "retrycancel";
    case forms::MsgButtons::OK: break;
  }
  return "ok";
}

Json ListEntries(const forms::ListControl& list) {
  Json items = Json::array();
  for (int32_t i = 0; i < list.ListCount(); ++i)
    items.push_back({{"text", list.List(i)}, {"itemData", list.ItemData(i)}});
  return items;
}

void ListViewState(forms::ListView& list, Json& state) {
  forms::ColumnHeaderList& columns = list.ColumnHeaders();
  Json columnStates = Json::array();
  for (int32_t i = 1; i <= columns.Count(); ++i)
    columnStates.push_back({{"text", columns(i).Text()}, {"width", columns(i).Width()}});
  Json items = Json::array();
  forms::ListItemList& listItems = list.ListItems();
  for (int32_t i = 1; i <= listItems.Count(); ++i) {
    forms::ListItem& item = listItems(i);
    Json subItems = Json::array();
    // One sub-item per column after the first; those never written read as "".
    for (int32_t s = 1; s < columns.Count(); ++s) subItems.push_back(item.SubItems(s));
    items.push_back({{"key", item.Key()},
                     {"text", item.Text()},
                     {"subItems", std::move(subItems)},
                     {"selected", item.Selected()}});
  }
  state["columns"] = std::move(columnStates);
  state["items"] = std::move(items);
}

void TreeViewState(forms::TreeView& tree, Json& state) {
  Json items = Json::array();
  forms::NodeList& nodes = tree.Nodes();
  for (int32_t i = 1; i <= nodes.Count(); ++i) {
    forms::Node& node = nodes(i);
    items.push_back({{"key", node.Key()},
                     {"text", node.Text()},
                     {"parent", node.Parent() ? Json(node.Parent()->Key()) : Json(nullptr)},
                     {"tag", ValueJson(node.Tag())},
                     {"bold", node.Bold()},
                     {"image", node.Image()},
                     {"expanded", node.Expanded()}});
  }
  state["items"] = std::move(items);
}

void ToolbarState(forms::Toolbar& toolbar, Json& state) {
  Json buttons = Json::object();
  forms::ToolbarButtons& all = toolbar.Buttons();
  for (int32_t i = 1; i <= all.Count(); ++i) {
    forms::ToolbarButton& button = all(i);
    // A button without a key is reached by its position only.
    std::string key = button.Key().empty() ? "#" + std::to_string(i) : button.Key();
    buttons[key] = {{"caption", button.Caption()},
                    {"enabled", button.Enabled()},
                    {"visible", button.Visible()}};
  }
  state["buttons"] = std::move(buttons);
}

}  // namespace

std::optional<KeyStroke> KeyFromName(std::string_view name) {
  int shift = 0;
  for (bool more = true; more;) {
    more = false;
    static constexpr std::array<std::pair<std::string_view, int>, 3> kModifiers{
        {{"shift+", forms::vbShiftMask}, {"ctrl+", forms::vbCtrlMask}, {"alt+", forms::vbAltMask}}};
    for (auto [prefix, mask] : kModifiers) {
      if (StartsWithNoCase(name, prefix) && name.size() > prefix.size()) {
        shift |= mask;
        name.remove_prefix(prefix.size());
        more = true;
      }
    }
  }
  std::optional<KeyStroke> key = NamedKey(Lower(name));
  if (!key) return std::nullopt;
  key->shift = shift;
  // With Ctrl or Alt held a key types nothing.
  if (shift & (forms::vbCtrlMask | forms::vbAltMask)) key->character = 0;
  return key;
}

std::string ControlName(const forms::Control& control) {
  if (control.Index() < 0) return control.Name();
  return fmt::format("{}({})", control.Name(), control.Index());
}

std::optional<ControlRef> ParseControlName(std::string_view text) {
  ControlRef ref;
  size_t open = text.find('(');
  if (open == std::string_view::npos) {
    if (text.empty() || text.find(')') != std::string_view::npos) return std::nullopt;
    ref.name = std::string(text);
    return ref;
  }
  if (open == 0 || text.back() != ')' || open + 2 > text.size() - 1) return std::nullopt;
  std::string_view digits = text.substr(open + 1, text.size() - open - 2);
  if (digits.size() > 6) return std::nullopt;
  int index = 0;
  for (char c : digits) {
    if (!std::isdigit(static_cast<unsigned char>(c))) return std::nullopt;
    index = index * 10 + (c - '0');
  }
  ref.name = std::string(text.substr(0, open));
  ref.index = index;
  return ref;
}

std::string ColorText(int32_t color) {
  return fmt::format("&H{:X}", static_cast<uint32_t>(color));
}

std::string DateText(vb::Date date) {
  vb::DateParts parts = vb::SplitDate(date);
  return fmt::format("{:04}-{:02}-{:02} {:02}:{:02}:{:02}", parts.year, parts.month, parts.day,
                     parts.hour, parts.minute, parts.second);
}

Json ValueJson(const vb::Variant& value) {
  switch (value.Type()) {
    case vb::VarType::Boolean: return value.AsBoolean();
    case vb::VarType::Long: return value.AsLong();
    case vb::VarType::Double: {
      double number = value.AsDouble();
      return std::isfinite(number) ? Json(number) : Json(nullptr);
    }
    case vb::VarType::Date: return DateText(value.AsDate());
    case vb::VarType::String: return value.AsString();
    case vb::VarType::Empty:
    case vb::VarType::Null:
    case vb::VarType::Missing:
    case vb::VarType::Object: break;
  }
  return nullptr;
}

Json ControlState(forms::Control& control) {
  using forms::ControlType;
  Json state;
  state["type"] = forms::TypeName(control.Type());
  switch (control.Type()) {
    case ControlType::TextBox: {
      auto& box = static_cast<forms::TextBox&>(control);
      state["text"] = box.Text();
      state["locked"] = box.Locked();
      break;
    }
    case ControlType::Label:
      state["caption"] = static_cast<forms::Label&>(control).Caption();
      break;
    case ControlType::Frame:
      state["caption"] = static_cast<forms::Frame&>(control).Caption();
      break;
    case ControlType::CommandButton:
      state["caption"] = static_cast<forms::CommandButton&>(control).Caption();
      break;
    case ControlType::CheckBox: {
      auto& box = static_cast<forms::CheckBox&>(control);
      state["caption"] = box.Caption();
      state["value"] = box.Value();
      break;
    }
    case ControlType::OptionButton: {
      auto& option = static_cast<forms::OptionButton&>(control);
      state["caption"] = option.Caption();
      state["value"] = option.Value();
      break;
    }
    case ControlType::ComboBox: {
      auto& combo = static_cast<forms::ComboBox&>(control);
      state["text"] = combo.Text();
      state["listIndex"] = combo.ListIndex();
      state["items"] = ListEntries(combo);
      break;
    }
    case ControlType::ListBox: {
      auto& list = static_cast<forms::ListBox&>(control);
      state["text"] = list.Text();
      state["listIndex"] = list.ListIndex();
      state["items"] = ListEntries(list);
      break;
    }
    case ControlType::DTPicker:
      state["value"] = DateText(static_cast<forms::DTPicker&>(control).Value());
      break;
    case ControlType::ProgressBar:
      state["value"] = static_cast<forms::ProgressBar&>(control).Value();
      break;
    case ControlType::Menu: {
      auto& menu = static_cast<forms::Menu&>(control);
      state["caption"] = menu.Caption();
      state["checked"] = menu.Checked();
      break;
    }
    case ControlType::Toolbar:
      ToolbarState(static_cast<forms::Toolbar&>(control), state);
      break;
    case ControlType::ListView:
      ListViewState(static_cast<forms::ListView&>(control), state);
      break;
    case ControlType::TreeView:
      TreeViewState(static_cast<forms::TreeView&>(control), state);
      break;
    case ControlType::Image:
    case ControlType::ImageList:
      break;
  }
  state["tag"] = control.Tag();
  state["enabled"] = control.Enabled();
  state["visible"] = control.Visible();
  state["backColor"] = ColorText(control.BackColor());
  state["left"] = control.Left();
  state["top"] = control.Top();
  state["width"] = control.Width();
  state["height"] = control.Height();
  return state;
}

Json FormState(forms::Form& form) {
  Json state;
  state["caption"] = form.Caption();
  state["visible"] = form.Visible();
  state["mousePointer"] = form.MousePointer() == forms::vbHourglass ? "hourglass" : "default";
  forms::Control* focus = form.ActiveControl();
  state["focus"] = focus ? Json(ControlName(*focus)) : Json(nullptr);
  state["windowState"] = form.WindowState() == forms::vbMinimized   ? "minimized"
                         : form.WindowState() == forms::vbMaximized ? "maximized"
                                                                    : "normal";
  state["left"] = form.Left();
  state["top"] = form.Top();
  state["width"] = form.Width();
  state["height"] = form.Height();
  Json controls = Json::object();
  for (const auto& control : form.Controls()) controls[ControlName(*control)] = ControlState(*control);
  state["controls"] = std::move(controls);
  return state;
}

Json MsgBoxEvent(const forms::MessageBox& box) {
  return {{"event", "msgbox"},
          {"text", box.text},
          {"title", box.title.empty() ? forms::ApplicationTitle() : box.title},
          {"icon", IconName(box.Icon())},
          {"buttons", ButtonsName(box)},
          {"system", box.SystemModal()}};
}

Json InputBoxEvent(const forms::InputRequest& request) {
  return {{"event", "inputbox"},
          {"prompt", request.prompt},
          {"title", request.title.empty() ? forms::ApplicationTitle() : request.title},
          {"default", request.defaultText}};
}

Json MenuEvent(forms::Menu& menu) {
  Json items = Json::array();
  for (forms::Menu* item : menu.Items())
    items.push_back({{"name", ControlName(*item)},
                     {"caption", item->Caption()},
                     {"enabled", item->Enabled()},
                     {"visible", item->Visible()}});
  return {{"event", "menu"}, {"menu", ControlName(menu)}, {"items", std::move(items)}};
}

std::optional<int> AnswerFromName(std::string_view name) {
  static constexpr std::array<std::pair<std::string_view, int>, 7> kAnswers{{
      {"ok", forms::vbOK},
      {"cancel", forms::vbCancel},
      {"abort", forms::vbAbort},
      {"retry", forms::vbRetry},
      {"ignore", forms::vbIgnore},
      {"yes", forms::vbYes},
      {"no", forms::vbNo},
  }};
  std::string lower = Lower(name);
  for (auto [answerName, answer] : kAnswers)
    if (lower == answerName) return answer;
  return std::nullopt;
}

int CancelAnswer(const forms::MessageBox& box) {
  for (int answer : {forms::vbCancel, forms::vbNo, forms::vbOK})
    if (box.Offers(answer)) return answer;
  return box.DefaultAnswer();
}

}  // namespace app::automate
