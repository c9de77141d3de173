// dorvantos automate: the component driven by a script through JSON lines. One request
// per line on standard input, one response per request on standard output, and before
// each response an event line for everything the component showed or called meanwhile.
//
// The driver stands where the person and the host stand: it is the desktop (message
// boxes, input boxes, pop-up menus and modal windows become events the script answers),
// the host (it creates the classes by ProgID, hands them a call-back object and a
// recordset), and the person at the keyboard (through forms::KeyboardUser).
//
// Waiting is nested, as on Windows: a message box reads requests until one answers it;
// a modal window reads and serves requests of any kind until it is hidden or unloaded.
// Either way the request that caused the wait then goes on and gets its own response.
// Input that ends while something waits answers the box with Cancel (or No, or OK) and
// closes the window, and the driver ends with status 0.
//
// Standard output belongs to the protocol alone: whatever else the process writes there
// (a library's stray print) is sent to standard error, so it cannot break a line.

#include <fcntl.h>
#include <unistd.h>

#include <csignal>
#include <cstdio>
#include <functional>
#include <iostream>
#include <map>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>
#include <vector>

#include <fmt/format.h>

#include "automate_state.h"
#include "host_database.h"
#include "automate_windows.h"
#include "commands.h"
#include "common/PasswordCodec.h"
#include "common/modRegistry.h"
#include "platform/ado/Connection.h"
#include "platform/ado/ConnectionString.h"
#include "platform/ado/Recordset.h"
#include "platform/ado/RecordsetObject.h"
#include "platform/automation/ClassObjects.h"
#include "platform/automation/CreateObject.h"
#include "platform/forms/Forms.h"
#include "platform/registry/Store.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace app {

namespace automate {

namespace {

constexpr const char* kUsage = "usage: dorvantos automate [--registry PATH]\n";
constexpr const char* kReporterProgId = "Ravelport.General";

// A request that cannot be carried out. Its message is the response's error; `extra`
// adds fields to that response (the focus, after an action a person could not do).
class RequestError : public std::runtime_error {
 public:
  explicit RequestError(const std::string& what, Json extra = Json::object())
      : std::runtime_error(what), extra(std::move(extra)) {}
  Json extra;
};

std::string Fold(std::string_view text) {
  std::string folded(text);
  for (char& c : folded)
    if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
  return folded;
}

std::string Text(const Json& request, const char* field) {
  auto it = request.find(field);
  if (it == request.end() || !it->is_string())
    throw RequestError(fmt::format("the request needs \"{}\" as a text", field));
  return it->get<std::string>();
}

int32_t Integer(const Json& request, const char* field) {
  auto it = request.find(field);
  if (it == request.end() || !it->is_number_integer())
    throw RequestError(fmt::format("the request needs \"{}\" as a whole number", field));
  int64_t value = it->get<int64_t>();
  if (value < INT32_MIN || value > INT32_MAX)
    throw RequestError(fmt::format("\"{}\" is out of range", field));
  return static_cast<int32_t>(value);
}

std::optional<int32_t> OptionalInteger(const Json& request, const char* field) {
  if (!request.contains(field)) return std::nullopt;
  return Integer(request, field);
}

bool Has(const Json& request, const char* field) { return request.contains(field); }

Json Failure(const std::exception& e) {
  Json response{{"ok", false}};
  if (auto* request = dynamic_cast<const RequestError*>(&e)) {
    response["error"] = request->what();
    for (auto& [key, value] : request->extra.items()) response[key] = value;
  } else if (auto* error = dynamic_cast<const vb::Error*>(&e)) {
    response["error"] = fmt::format("error {}: {}", error->Number(), error->Description());
  } else {
    response["error"] = e.what();
  }
  return response;
}

Json ParseRequest(const std::string& line) {
  Json request;
  try {
    request = Json::parse(line);
  } catch (const Json::parse_error& e) {
    throw RequestError(fmt::format("not valid JSON: {}", e.what()));
  }
  if (!request.is_object()) throw RequestError("a request is a JSON object");
  return request;
}

}  // namespace

class Driver;

// The desktop the component meets while the driver runs.
class AutomationDesktop : public forms::Desktop {
 public:
  explicit AutomationDesktop(Driver& driver) : driver_(driver) {}
  int MsgBox(const forms::MessageBox& box) override;
  std::string InputBox(const forms::InputRequest& request) override;
  void DoEvents() override {}
  // A notice asks nothing: it becomes an event and the call goes on.
  void ShowNotice(const std::string& title, const std::string& text) override;
  void WaitWhileVisible(forms::Form& form) override;
  forms::Menu* ShowPopupMenu(forms::Form& form, forms::Menu& menu, float, float) override;

 private:
  Driver& driver_;
};

class Driver {
 public:
  Driver(std::istream& in, std::FILE* out);
  ~Driver();
  Driver(const Driver&) = delete;
  Driver& operator=(const Driver&) = delete;

  // Serves requests until the input ends; the exit status.
  int Run();

  void Emit(const Json& line);
  int AskMsgBox(const forms::MessageBox& box);
  std::string AskInput(const forms::InputRequest& request);
  forms::Menu* AskMenu(forms::Form& form, forms::Menu& menu);
  void WaitWhileShowing(forms::Form& form);

 private:
  using Op = Json (Driver::*)(const Json&);

  std::optional<std::string> ReadLine();
  // One request, one response line (events may come before it).
  void Serve(const std::string& line);
  // Reads requests until one is an answer that `take` accepts (it returns why not);
  // false when the input ended first.
  bool AwaitAnswer(const char* what,
                   const std::function<std::optional<std::string>(const Json&)>& take);
  // A window left on screen when nobody is there to work it any more.
  void CloseLeftOver(forms::Form& form);

  vb::ObjectPtr ClassObject(const std::string& name);
  ado::ConnectionPtr Database();
  forms::Form& TheForm(const Json& request);
  forms::Control& TheControl(forms::Form& form, const Json& request);
  Json FocusFields(forms::Form* acted);
  Json Performed(forms::Form& form, bool done, const std::string& what);

  Json OpLogin(const Json& request);
  Json OpNew(const Json& request);
  Json OpOpen(const Json& request);
  Json OpForms(const Json& request);
  Json OpState(const Json& request);
  Json OpFocus(const Json& request);
  Json OpType(const Json& request);
  Json OpKey(const Json& request);
  Json OpClick(const Json& request);
  Json OpDblClick(const Json& request);
  Json OpSelect(const Json& request);
  Json OpRightClick(const Json& request);
  Json OpClose(const Json& request);
  Json OpResize(const Json& request);
  Json OpWindowState(const Json& request);
  Json OpSql(const Json& request);
  Json OpAnswer(const Json& request);

  std::istream& in_;
  std::FILE* out_;
  bool ended_ = false;
  WindowIndex windows_;
  std::shared_ptr<forms::Desktop> previousDesktop_;
  std::map<std::string, vb::ObjectPtr> classes_;
  vb::ObjectPtr callback_;
  ado::ConnectionPtr database_;
};

namespace {

// The host's call-back object: the header editor tells it the entry's key on closing.
class HostCallback : public vb::Object {
 public:
  explicit HostCallback(Driver& driver) : driver_(driver) {}
  vb::Variant Invoke(const std::string& name, std::vector<vb::Variant>& args) override {
    if (Fold(name) != "remotekey")
      throw vb::Error(vb::kErrMemberNotSupported,
                      vb::DefaultDescription(vb::kErrMemberNotSupported) + " (" + name + ")");
    if (args.size() != 1 || args[0].IsMissing()) throw vb::Error(449, "Argument not optional");
    driver_.Emit({{"event", "remotekey"}, {"id", vb::CLng(args[0])}});
    return {};
  }

 private:
  Driver& driver_;
};

// Ravelport.General as this process serves it: each report becomes an event, then goes
// on to the reporter the class registry names, so it is kept as it always is.
class ReportRelay : public vb::Object {
 public:
  explicit ReportRelay(Driver& driver) : driver_(driver) {}
  vb::Variant Invoke(const std::string& name, std::vector<vb::Variant>& args) override {
    if (Fold(name) != "report")
      throw vb::Error(vb::kErrMemberNotSupported,
                      vb::DefaultDescription(vb::kErrMemberNotSupported) + " (" + name + ")");
    auto label = [&](size_t i) {
      return i < args.size() && !args[i].IsMissing() ? vb::CStr(args[i]) : std::string();
    };
    driver_.Emit({{"event", "report"},
                  {"product", label(0)},
                  {"project", label(1)},
                  {"module", label(2)},
                  {"procedure", label(3)},
                  {"message", label(4)}});
    // A reporter that is missing or fails raises here, and the caller's trap deals with
    // it as it would without the driver in between.
    return automation::CreateRegisteredObject(kReporterProgId)->Invoke(name, args);
  }

 private:
  Driver& driver_;
};

}  // namespace

int AutomationDesktop::MsgBox(const forms::MessageBox& box) { return driver_.AskMsgBox(box); }
std::string AutomationDesktop::InputBox(const forms::InputRequest& request) {
  return driver_.AskInput(request);
}
void AutomationDesktop::ShowNotice(const std::string& title, const std::string& text) {
  driver_.Emit({{"event", "notice"},
                {"title", title.empty() ? forms::ApplicationTitle() : title},
                {"text", text}});
}
void AutomationDesktop::WaitWhileVisible(forms::Form& form) { driver_.WaitWhileShowing(form); }
forms::Menu* AutomationDesktop::ShowPopupMenu(forms::Form& form, forms::Menu& menu, float, float) {
  return driver_.AskMenu(form, menu);
}

Driver::Driver(std::istream& in, std::FILE* out) : in_(in), out_(out) {
  // The desktop first: a class must never find a process without one and go looking
  // for a graphical one.
  previousDesktop_ = forms::Desktop::Installed();
  forms::Desktop::Install(std::make_shared<AutomationDesktop>(*this));
  automation::RegisterClassObject(kReporterProgId,
                                  [this] { return std::make_shared<ReportRelay>(*this); });
  callback_ = std::make_shared<HostCallback>(*this);
}

Driver::~Driver() {
  // The windows go with the class objects that own them, while the desktop and the
  // relay they may still call are in place.
  ended_ = true;
  classes_.clear();
  callback_.reset();
  database_.reset();
  automation::RevokeClassObject(kReporterProgId);
  forms::Desktop::Install(previousDesktop_);
}

int Driver::Run() {
  while (std::optional<std::string> line = ReadLine()) Serve(*line);
  return 0;
}

void Driver::Emit(const Json& line) {
  // Text that is not UTF-8 must not stop a line from being written.
  std::string text = line.dump(-1, ' ', false, Json::error_handler_t::replace);
  text += '\n';
  std::fwrite(text.data(), 1, text.size(), out_);
  std::fflush(out_);
}

std::optional<std::string> Driver::ReadLine() {
  if (ended_) return std::nullopt;
  std::string line;
  while (std::getline(in_, line)) {
    if (!line.empty() && line.back() == '\r') line.pop_back();
    if (line.find_first_not_of(" \t") != std::string::npos) return line;
  }
  ended_ = true;
  return std::nullopt;
}

void Driver::Serve(const std::string& line) {
  static const std::map<std::string, Op> kOps = {
      {"login", &Driver::OpLogin},        {"new", &Driver::OpNew},
      {"open", &Driver::OpOpen},          {"forms", &Driver::OpForms},
      {"state", &Driver::OpState},        {"focus", &Driver::OpFocus},
      {"type", &Driver::OpType},          {"key", &Driver::OpKey},
      {"click", &Driver::OpClick},        {"dblclick", &Driver::OpDblClick},
      {"select", &Driver::OpSelect},      {"rightclick", &Driver::OpRightClick},
      {"close", &Driver::OpClose},        {"resize", &Driver::OpResize},
      {"minimize", &Driver::OpWindowState}, {"maximize", &Driver::OpWindowState},
      {"restore", &Driver::OpWindowState}, {"sql", &Driver::OpSql},
      {"answer", &Driver::OpAnswer},
  };
  Json response;
  try {
    Json request = ParseRequest(line);
    std::string op = Text(request, "op");
    auto found = kOps.find(op);
    if (found == kOps.end()) throw RequestError(fmt::format("no operation \"{}\"", op));
    response = (this->*found->second)(request);
  } catch (const std::exception& e) {
    response = Failure(e);
  }
  Emit(response);
}

bool Driver::AwaitAnswer(const char* what,
                         const std::function<std::optional<std::string>(const Json&)>& take) {
  while (std::optional<std::string> line = ReadLine()) {
    try {
      Json request = ParseRequest(*line);
      if (!request.contains("op") || request["op"] != "answer")
        throw RequestError(fmt::format("{} waits for an answer first", what));
      if (std::optional<std::string> why = take(request)) throw RequestError(*why);
      Emit({{"ok", true}});
      return true;
    } catch (const std::exception& e) {
      Emit(Failure(e));
    }
  }
  return false;
}

int Driver::AskMsgBox(const forms::MessageBox& box) {
  Emit(MsgBoxEvent(box));
  int answer = CancelAnswer(box);
  AwaitAnswer("a message box", [&](const Json& request) -> std::optional<std::string> {
    auto button = request.find("button");
    if (button == request.end() || !button->is_string())
      return "a message box is answered with \"button\"";
    std::optional<int> chosen = AnswerFromName(button->get<std::string>());
    if (!chosen || !box.Offers(*chosen))
      return fmt::format("the message box has no button \"{}\"", button->get<std::string>());
    answer = *chosen;
    return std::nullopt;
  });
  return answer;
}

std::string Driver::AskInput(const forms::InputRequest& request) {
  Emit(InputBoxEvent(request));
  std::string text;  // what Cancel gives
  AwaitAnswer("an input box", [&](const Json& answer) -> std::optional<std::string> {
    if (answer.contains("cancel") && answer["cancel"] == true) return std::nullopt;
    auto typed = answer.find("text");
    if (typed == answer.end() || !typed->is_string())
      return "an input box is answered with \"text\" or \"cancel\":true";
    text = typed->get<std::string>();
    return std::nullopt;
  });
  return text;
}

forms::Menu* Driver::AskMenu(forms::Form& form, forms::Menu& menu) {
  Emit(MenuEvent(menu));
  forms::Menu* chosen = nullptr;  // dismissed
  AwaitAnswer("a pop-up menu", [&](const Json& answer) -> std::optional<std::string> {
    auto item = answer.find("item");
    if (item == answer.end()) return "a pop-up menu is answered with \"item\" (a name or null)";
    if (item->is_null()) return std::nullopt;
    if (!item->is_string()) return "\"item\" is a menu item's name or null";
    const std::string name = item->get<std::string>();
    for (forms::Menu* candidate : menu.Items()) {
      if (Fold(ControlName(*candidate)) != Fold(name)) continue;
      if (!candidate->CanBeChosen())
        return fmt::format("the menu item {} cannot be chosen now", name);
      chosen = candidate;
      return std::nullopt;
    }
    return fmt::format("the menu {} has no item {}", ControlName(menu), name);
  });
  return chosen;
}

void Driver::CloseLeftOver(forms::Form& form) {
  try {
    if (form.Showing()) form.Close();
  } catch (const std::exception& e) {
    std::fprintf(stderr, "dorvantos automate: closing %s: %s\n", form.Name().c_str(), e.what());
  }
  // A window that refuses even its close box is hidden, so nothing waits for ever.
  if (form.Showing()) form.Hide();
}

void Driver::WaitWhileShowing(forms::Form& form) {
  if (!form.Showing()) return;
  // The window must outlive the wait, whatever the requests served meanwhile release.
  std::shared_ptr<vb::Object> keep = form.weak_from_this().lock();
  if (ended_) return CloseLeftOver(form);
  Emit({{"event", "modal"}, {"form", form.Name()}, {"instance", windows_.InstanceOf(form)}});
  while (form.Showing()) {
    std::optional<std::string> line = ReadLine();
    if (!line) return CloseLeftOver(form);
    Serve(*line);
  }
}

// ---- what the requests reach -----------------------------------------------------------

vb::ObjectPtr Driver::ClassObject(const std::string& name) {
  if (name != "General" && name != "GeneralDetails")
    throw RequestError(fmt::format("no class \"{}\" (General or GeneralDetails)", name));
  vb::ObjectPtr& object = classes_[name];
  if (!object) object = automation::CreateObject("POC_Dorvantos." + name);
  return object;
}

ado::ConnectionPtr Driver::Database() {
  if (database_ && database_->State() == ado::adStateOpen) return database_;
  try {
    database_ = app::OpenSettingsDatabase();
  } catch (const app::SettingsError& e) {
    throw RequestError(e.what());
  }
  return database_;
}

forms::Form& Driver::TheForm(const Json& request) {
  std::string name = Text(request, "form");
  std::optional<int32_t> instance = OptionalInteger(request, "instance");
  forms::Form* form = windows_.Find(name, instance);
  if (!form) {
    throw RequestError(instance ? fmt::format("no window {} instance {}", name, *instance)
                                : fmt::format("no window {}", name));
  }
  return *form;
}

forms::Control& Driver::TheControl(forms::Form& form, const Json& request) {
  std::string text = Text(request, "control");
  std::optional<ControlRef> ref = ParseControlName(text);
  forms::Control* control = ref ? form.FindControl(ref->name, ref->index) : nullptr;
  if (!control) throw RequestError(fmt::format("window {} has no control {}", form.Name(), text));
  return *control;
}

Json Driver::FocusFields(forms::Form* acted) {
  forms::Form* form = forms::ActiveForm();
  if (!form || !form->Loaded()) form = acted && acted->Loaded() ? acted : nullptr;
  forms::Control* focus = form ? form->ActiveControl() : nullptr;
  Json fields;
  fields["focus"] = focus ? Json(ControlName(*focus)) : Json(nullptr);
  fields["active"] = form ? Json{{"form", form->Name()}, {"instance", windows_.InstanceOf(*form)}}
                          : Json(nullptr);
  return fields;
}

Json Driver::Performed(forms::Form& form, bool done, const std::string& what) {
  Json fields = FocusFields(&form);
  if (!done) {
    throw RequestError(
        fmt::format("{}: nothing happened (not on screen, hidden, disabled, or refused)", what),
        fields);
  }
  Json response{{"ok", true}};
  for (auto& [key, value] : fields.items()) response[key] = value;
  return response;
}

// ---- requests ----------------------------------------------------------------------------

Json Driver::OpLogin(const Json& request) {
  vb::ObjectPtr object = ClassObject(Text(request, "class"));
  std::vector<vb::Variant> args{vb::Variant(Text(request, "user")),
                                vb::Variant(common::EncodePassword(Text(request, "password")))};
  vb::Variant result = object->Invoke("Login", args);
  return {{"ok", true}, {"result", vb::CBool(result)}};
}

Json Driver::OpNew(const Json& request) {
  vb::ObjectPtr object = ClassObject(Text(request, "class"));
  std::vector<vb::Variant> args{vb::Variant("tbPOC_Dorvantos"), vb::Variant::Missing(),
                                vb::Variant::Missing(), vb::Variant(callback_)};
  object->Invoke("NovoRegisto", args);
  return {{"ok", true}};
}

Json Driver::OpOpen(const Json& request) {
  std::string className = Text(request, "class");
  vb::ObjectPtr object = ClassObject(className);
  int32_t id = Integer(request, "id");
  // The whole table, as a host hands it: the class finds the record in it.
  const char* query = className == "General"
                          ? "SELECT * FROM tbPOC_Dorvantos ORDER BY dorvanto_id"
                          : "SELECT * FROM tbPOC_Dorvantos_Details ORDER BY diario_id";
  ado::RecordsetPtr records = Database()->Execute(query);
  std::vector<vb::Variant> args{ado::RecordsetObject::Wrap(records), vb::Variant(id),
                                vb::Variant::Missing(), vb::Variant::Missing(),
                                vb::Variant(callback_)};
  object->Invoke("Registo", args);
  return {{"ok", true}};
}

Json Driver::OpForms(const Json&) {
  Json list = Json::array();
  // A copy: numbering a window does not load or unload any, but stay safe.
  std::vector<forms::Form*> loaded = forms::LoadedForms();
  for (forms::Form* form : loaded) {
    list.push_back({{"form", form->Name()},
                    {"instance", windows_.InstanceOf(*form)},
                    {"caption", form->Caption()},
                    {"visible", form->Visible()}});
  }
  return {{"ok", true}, {"forms", std::move(list)}};
}

Json Driver::OpState(const Json& request) {
  forms::Form& form = TheForm(request);
  Json response{{"ok", true}, {"form", form.Name()}, {"instance", windows_.InstanceOf(form)}};
  Json state = FormState(form);
  for (auto& [key, value] : state.items()) response[key] = value;
  return response;
}

Json Driver::OpFocus(const Json& request) {
  forms::Form& form = TheForm(request);
  auto keep = form.weak_from_this().lock();
  forms::Control& control = TheControl(form, request);
  forms::KeyboardUser user(form);
  return Performed(form, user.Focus(control), "focus " + ControlName(control));
}

Json Driver::OpType(const Json& request) {
  forms::Form& form = TheForm(request);
  auto keep = form.weak_from_this().lock();
  forms::Control& control = TheControl(form, request);
  std::string text = Text(request, "text");
  forms::KeyboardUser user(form);
  return Performed(form, user.TypeInto(control, text), "type into " + ControlName(control));
}

Json Driver::OpKey(const Json& request) {
  forms::Form& form = TheForm(request);
  auto keep = form.weak_from_this().lock();
  std::string name = Text(request, "key");
  std::optional<KeyStroke> key = KeyFromName(name);
  if (!key) throw RequestError(fmt::format("no key \"{}\"", name));
  if (!form.Showing()) return Performed(form, false, "key " + name);
  forms::KeyboardUser user(form);
  if (Has(request, "control")) {
    forms::Control& control = TheControl(form, request);
    // The key goes where the person put the focus first.
    if (form.ActiveControl() != &control && !user.Focus(control))
      return Performed(form, false, "focus " + ControlName(control));
  }
  form.KeyStroke(key->keyCode, key->shift, key->character);
  return Performed(form, true, "key " + name);
}

Json Driver::OpClick(const Json& request) {
  forms::Form& form = TheForm(request);
  auto keep = form.weak_from_this().lock();
  forms::Control& control = TheControl(form, request);
  forms::KeyboardUser user(form);
  if (Has(request, "button")) {
    auto* toolbar = dynamic_cast<forms::Toolbar*>(&control);
    if (!toolbar) throw RequestError(fmt::format("{} is no toolbar", ControlName(control)));
    std::string key = Text(request, "button");
    if (!toolbar->Buttons().Find(key))
      throw RequestError(fmt::format("the toolbar {} has no button {}", ControlName(control), key));
    return Performed(form, user.ClickButton(*toolbar, key), "click button " + key);
  }
  if (auto* menu = dynamic_cast<forms::Menu*>(&control))
    return Performed(form, user.ChooseMenu(*menu), "choose " + ControlName(control));
  return Performed(form, user.Click(control), "click " + ControlName(control));
}

Json Driver::OpDblClick(const Json& request) {
  forms::Form& form = TheForm(request);
  auto keep = form.weak_from_this().lock();
  forms::Control& control = TheControl(form, request);
  forms::KeyboardUser user(form);
  if (!Has(request, "key"))
    return Performed(form, user.DoubleClick(control), "double-click " + ControlName(control));
  std::string key = Text(request, "key");
  if (auto* list = dynamic_cast<forms::ListView*>(&control)) {
    if (!list->ListItems().Find(key))
      throw RequestError(fmt::format("the list {} has no item {}", ControlName(control), key));
    return Performed(form, user.DoubleClickItem(*list, key), "double-click item " + key);
  }
  if (auto* tree = dynamic_cast<forms::TreeView*>(&control)) {
    if (!tree->Nodes().Find(key))
      throw RequestError(fmt::format("the tree {} has no node {}", ControlName(control), key));
    return Performed(form, user.DoubleClickNode(*tree, key), "double-click node " + key);
  }
  throw RequestError(fmt::format("{} has no items with keys", ControlName(control)));
}

Json Driver::OpSelect(const Json& request) {
  forms::Form& form = TheForm(request);
  auto keep = form.weak_from_this().lock();
  forms::Control& control = TheControl(form, request);
  forms::KeyboardUser user(form);
  const std::string name = ControlName(control);
  if (auto* list = dynamic_cast<forms::ListControl*>(&control)) {
    int32_t index = -1;
    if (Has(request, "text")) {
      std::string text = Text(request, "text");
      for (int32_t i = 0; i < list->ListCount() && index < 0; ++i)
        if (list->List(i) == text) index = i;
      if (index < 0) throw RequestError(fmt::format("{} has no entry \"{}\"", name, text));
    } else if (Has(request, "itemData")) {
      int32_t data = Integer(request, "itemData");
      for (int32_t i = 0; i < list->ListCount() && index < 0; ++i)
        if (list->ItemData(i) == data) index = i;
      if (index < 0) throw RequestError(fmt::format("{} has no entry with itemData {}", name, data));
    } else if (Has(request, "index")) {
      index = Integer(request, "index");
      if (index < 0 || index >= list->ListCount())
        throw RequestError(fmt::format("{} has no entry {}", name, index));
    } else {
      throw RequestError("select in a list needs \"text\", \"itemData\" or \"index\"");
    }
    return Performed(form, user.Choose(*list, index), "select in " + name);
  }
  if (auto* picker = dynamic_cast<forms::DTPicker*>(&control)) {
    std::string text = Text(request, "date");
    int year = 0, month = 0, day = 0;
    char tail = 0;
    std::optional<vb::Date> date;
    if (std::sscanf(text.c_str(), "%4d-%2d-%2d%c", &year, &month, &day, &tail) == 3)
      date = vb::DateSerial(year, month, day);
    if (!date) throw RequestError(fmt::format("\"{}\" is no date (yyyy-mm-dd)", text));
    return Performed(form, user.ChooseDate(*picker, *date), "select in " + name);
  }
  std::string key = Text(request, "key");
  if (auto* list = dynamic_cast<forms::ListView*>(&control)) {
    if (!list->ListItems().Find(key))
      throw RequestError(fmt::format("the list {} has no item {}", name, key));
    return Performed(form, user.ClickItem(*list, key), "select item " + key);
  }
  if (auto* tree = dynamic_cast<forms::TreeView*>(&control)) {
    if (!tree->Nodes().Find(key))
      throw RequestError(fmt::format("the tree {} has no node {}", name, key));
    return Performed(form, user.ClickNode(*tree, key), "select node " + key);
  }
  throw RequestError(fmt::format("{} has nothing to select", name));
}

Json Driver::OpRightClick(const Json& request) {
  forms::Form& form = TheForm(request);
  auto keep = form.weak_from_this().lock();
  forms::Control& control = TheControl(form, request);
  forms::KeyboardUser user(form);
  const std::string name = ControlName(control);
  if (Has(request, "key")) {
    std::string key = Text(request, "key");
    if (auto* list = dynamic_cast<forms::ListView*>(&control); list && list->ListItems().Find(key))
      return Performed(form, user.ClickItem(*list, key, forms::vbRightButton), "right-click " + key);
    if (auto* tree = dynamic_cast<forms::TreeView*>(&control); tree && tree->Nodes().Find(key))
      return Performed(form, user.ClickNode(*tree, key, forms::vbRightButton), "right-click " + key);
    throw RequestError(fmt::format("{} has no item {}", name, key));
  }
  return Performed(form, user.RightClick(control), "right-click " + name);
}

Json Driver::OpClose(const Json& request) {
  forms::Form& form = TheForm(request);
  auto keep = form.weak_from_this().lock();
  forms::KeyboardUser user(form);
  // A window that refuses to close answers the person; the request itself did its part.
  bool closed = user.CloseWindow();
  Json response{{"ok", true}, {"closed", closed}};
  Json focus = FocusFields(&form);
  for (auto& [key, value] : focus.items()) response[key] = value;
  return response;
}

Json Driver::OpResize(const Json& request) {
  forms::Form& form = TheForm(request);
  auto keep = form.weak_from_this().lock();
  int32_t width = Integer(request, "width");
  int32_t height = Integer(request, "height");
  if (width < 0 || height < 0) throw RequestError("a window's size is not negative");
  forms::KeyboardUser(form).Resize(width, height);
  return Performed(form, true, "resize");
}

Json Driver::OpWindowState(const Json& request) {
  forms::Form& form = TheForm(request);
  auto keep = form.weak_from_this().lock();
  forms::KeyboardUser user(form);
  const std::string op = Text(request, "op");
  if (op == "minimize") user.Minimize();
  else if (op == "maximize") user.Maximize();
  else user.Restore();
  return Performed(form, true, op);
}

Json Driver::OpSql(const Json& request) {
  ado::RecordsetPtr records = Database()->Execute(Text(request, "query"));
  Json rows = Json::array();
  if (records && records->State() == ado::adStateOpen) {
    ado::Fields& fields = records->Fields();
    while (!records->Eof()) {
      Json row = Json::object();
      for (int32_t i = 0; i < fields.Count(); ++i)
        row[fields.Item(i).Name()] = ValueJson(fields.Item(i).Value());
      rows.push_back(std::move(row));
      records->MoveNext();
    }
  }
  return {{"ok", true}, {"rows", std::move(rows)}};
}

Json Driver::OpAnswer(const Json&) { throw RequestError("nothing waits for an answer"); }

}  // namespace automate

int RunAutomate(const Args& args) {
  for (size_t i = 0; i < args.size(); ++i) {
    if (args[i] == "--registry" && i + 1 < args.size()) {
      registry::Store::SetDefaultPath(args[++i]);
      continue;
    }
    std::fputs(automate::kUsage, stderr);
    return 2;
  }
  // A script that stops reading must not kill the driver in the middle of a request.
  std::signal(SIGPIPE, SIG_IGN);
  std::fflush(stdout);
  int protocol = fcntl(STDOUT_FILENO, F_DUPFD_CLOEXEC, 3);
  std::FILE* out = protocol >= 0 ? fdopen(protocol, "w") : nullptr;
  if (!out) {
    std::perror("dorvantos automate");
    return 1;
  }
  dup2(STDERR_FILENO, STDOUT_FILENO);
  int status = 0;
  {
    automate::Driver driver(std::cin, out);
    status = driver.Run();
  }
  std::fclose(out);
  return status;
}

}  // namespace app
