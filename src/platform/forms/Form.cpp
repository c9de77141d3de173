#include "platform/forms/Form.h"

#include <algorithm>

#include "platform/forms/Buttons.h"
#include "platform/forms/ControlFactory.h"
#include "platform/forms/Desktop.h"
#include "platform/forms/FormListener.h"
#include "platform/forms/Menu.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace forms {

namespace {

std::vector<Form*>& LoadedList() {
  static std::vector<Form*> forms;
  return forms;
}

Form*& ActiveSlot() {
  static Form* active = nullptr;
  return active;
}

uint64_t NextActivationStamp() {
  static uint64_t stamp = 0;
  return ++stamp;
}

template <class Fn>
void Tell(Fn&& fn) {
  if (detail::Listened()) detail::Notify(fn);
}

}  // namespace

const std::vector<Form*>& LoadedForms() { return LoadedList(); }
Form* ActiveForm() { return ActiveSlot(); }

std::string Form::ControlKey(std::string_view name, int index) {
  std::string key = LowerName(name);
  if (index >= 0) key += "(" + std::to_string(index) + ")";
  return key;
}

Form::Form(FormDesign design) : design_(std::move(design)) {
  controls_.reserve(design_.controls.size());
  int tabIndex = 0;
  for (const ControlDesign& control : design_.controls) {
    std::string key = ControlKey(control.name, control.index);
    if (byName_.count(key))
      throw std::logic_error("form " + design_.name + " declares " + key + " twice");
    controls_.push_back(CreateControl(*this, control));
    controls_.back()->common_.tabIndex = tabIndex++;
    byName_[key] = controls_.back().get();
  }
}

Form::~Form() {
  // A form destroyed while loaded goes as an unload that nobody can cancel: no handler
  // of its own runs (what derives from it is gone already), but whoever shows it must
  // let go of it now, or its window would go on painting and taking input for freed
  // memory.
  bool wasLoaded = Loaded();
  std::erase(LoadedList(), this);
  if (ActiveSlot() == this) ActiveSlot() = nullptr;
  for (Form* form : LoadedList())
    if (form->owner_ == this) form->owner_ = nullptr;
  if (wasLoaded) {
    state_ = State::Created;
    visible_ = modal_ = false;
    active_ = nullptr;
    owner_ = nullptr;
    try {
      Tell([&](FormListener& l) { l.FormUnloaded(*this); });
    } catch (...) {
      // A destructor throws nothing; a listener that failed keeps its own state.
    }
  }
  // Someone may still hold a control; touching it now raises "object not set".
  for (auto& control : controls_) control->Detach();
}

void Form::Changed(std::string_view property) {
  if (applyingDesign_) return;
  Tell([&](FormListener& l) { l.FormChanged(*this, property); });
}

// ---- lifecycle -------------------------------------------------------------------

void Form::EnsureLoaded() {
  if (state_ == State::Created) Load();
}

void Form::Load() {
  if (state_ != State::Created) return;
  if (!initialized_) {
    initialized_ = true;
    Form_Initialize();
  }
  state_ = State::Loading;
  ++loadGeneration_;
  caption_ = design_.caption;
  left_ = design_.left;
  top_ = design_.top;
  width_ = design_.width;
  height_ = design_.height;
  windowState_ = vbNormal;
  mousePointer_ = vbDefault;
  visible_ = modal_ = shownOnce_ = topMost_ = false;
  active_ = nullptr;
  applyingDesign_ = true;
  try {
    for (auto& control : controls_) control->ApplyDesign();
  } catch (...) {
    applyingDesign_ = false;
    state_ = State::Created;
    throw;
  }
  applyingDesign_ = false;
  LoadedList().push_back(this);
  Tell([&](FormListener& l) { l.FormLoaded(*this); });
  try {
    Form_Load();
  } catch (...) {
    // The window exists even when its Load handler failed, as on Windows.
    if (state_ == State::Loading) state_ = State::Loaded;
    throw;
  }
  if (state_ == State::Loading) state_ = State::Loaded;
}

void Form::Show(int modal, Form* owner) {
  EnsureLoaded();
  if (!Loaded()) return;  // its Load handler unloaded it
  owner_ = owner;
  if (modal == vbModal) {
    if (ShownModally()) return;
    Desktop::Current().ShowModal(*this);
  } else {
    Display(false);
  }
}

void Form::Display(bool modal) {
  EnsureLoaded();
  if (!Loaded()) return;
  modal_ = modal;
  if (!visible_) {
    visible_ = true;
    Changed("Visible");
    Tell([&](FormListener& l) { l.FormShown(*this, modal); });
  }
  uint64_t generation = loadGeneration_;
  auto still = [&] { return Showing() && loadGeneration_ == generation; };
  if (!shownOnce_) {
    shownOnce_ = true;
    RaiseResize();
  }
  if (still()) Activate();
  if (still() && !active_) FocusFirstControl();
}

void Form::Activate() {
  if (!Showing()) return;
  Form* previous = ActiveSlot();
  activationStamp_ = NextActivationStamp();
  if (previous == this) return;
  ActiveSlot() = this;
  if (previous && previous->Loaded()) previous->Form_Deactivate();
  if (ActiveSlot() == this) Form_Activate();
}

void Form::ActivateNextWindow() {
  Form* next = nullptr;
  for (Form* form : LoadedList()) {
    if (form != this && form->Showing() &&
        (!next || form->activationStamp_ > next->activationStamp_))
      next = form;
  }
  if (next) next->Activate();
}

void Form::Hide() {
  EnsureLoaded();
  if (!visible_) return;
  visible_ = false;
  modal_ = false;
  Changed("Visible");
  Tell([&](FormListener& l) { l.FormHidden(*this); });
  if (ActiveSlot() == this) {
    ActiveSlot() = nullptr;
    Form_Deactivate();
    ActivateNextWindow();
  }
}

bool Form::Unload() { return UnloadWith(vbFormCode); }
bool Form::Close() { return UnloadWith(vbFormControlMenu); }

bool Form::UnloadWith(int mode) {
  if (state_ == State::Created) return true;
  // Unloading again from inside the form's own QueryUnload or Unload does nothing.
  if (state_ == State::Unloading) return false;
  State before = state_;
  state_ = State::Unloading;
  int cancel = 0;
  try {
    Form_QueryUnload(cancel, mode);
    if (cancel == 0) Form_Unload(cancel);
  } catch (...) {
    if (state_ == State::Unloading) state_ = before;
    throw;
  }
  if (cancel != 0) {
    if (state_ == State::Unloading) state_ = before;
    return false;
  }
  if (visible_) {
    visible_ = false;
    modal_ = false;
    Tell([&](FormListener& l) { l.FormHidden(*this); });
  }
  bool wasActive = ActiveSlot() == this;
  if (wasActive) ActiveSlot() = nullptr;
  active_ = nullptr;
  owner_ = nullptr;
  state_ = State::Created;
  std::erase(LoadedList(), this);
  Tell([&](FormListener& l) { l.FormUnloaded(*this); });
  if (wasActive) ActivateNextWindow();
  return true;
}

// ---- properties ------------------------------------------------------------------

std::string Form::Caption() const {
  const_cast<Form*>(this)->EnsureLoaded();
  return caption_;
}

void Form::SetCaption(std::string caption) {
  EnsureLoaded();
  if (caption_ == caption) return;
  caption_ = std::move(caption);
  Changed("Caption");
}

bool Form::Visible() const {
  const_cast<Form*>(this)->EnsureLoaded();
  return visible_;
}

void Form::SetVisible(bool visible) {
  if (visible)
    Show();
  else
    Hide();
}

int Form::WindowState() const {
  const_cast<Form*>(this)->EnsureLoaded();
  return windowState_;
}

void Form::SetWindowState(int state) {
  EnsureLoaded();
  if (state != vbNormal && state != vbMinimized && state != vbMaximized)
    throw vb::Error(380, "Invalid property value");
  if (windowState_ == state) return;
  windowState_ = state;
  Changed("WindowState");
  RaiseResize();
}

int Form::MousePointer() const {
  const_cast<Form*>(this)->EnsureLoaded();
  return mousePointer_;
}

void Form::SetMousePointer(int pointer) {
  EnsureLoaded();
  if (mousePointer_ == pointer) return;
  mousePointer_ = pointer;
  Changed("MousePointer");
  Desktop::Current().MousePointerChanged(*this, pointer);
}

int32_t Form::Left() const {
  const_cast<Form*>(this)->EnsureLoaded();
  return left_;
}
int32_t Form::Top() const {
  const_cast<Form*>(this)->EnsureLoaded();
  return top_;
}
int32_t Form::Width() const {
  const_cast<Form*>(this)->EnsureLoaded();
  return width_;
}
int32_t Form::Height() const {
  const_cast<Form*>(this)->EnsureLoaded();
  return height_;
}

void Form::SetLeft(int32_t twips) {
  EnsureLoaded();
  if (left_ == twips) return;
  left_ = twips;
  Changed("Left");
}

void Form::SetTop(int32_t twips) {
  EnsureLoaded();
  if (top_ == twips) return;
  top_ = twips;
  Changed("Top");
}

void Form::SetWidth(int32_t twips) {
  EnsureLoaded();
  if (twips < 0) throw vb::Error(380, "Invalid property value");
  if (width_ == twips) return;
  width_ = twips;
  Changed("Width");
  RaiseResize();
}

void Form::SetHeight(int32_t twips) {
  EnsureLoaded();
  if (twips < 0) throw vb::Error(380, "Invalid property value");
  if (height_ == twips) return;
  height_ = twips;
  Changed("Height");
  RaiseResize();
}

void Form::Move(int32_t left, int32_t top, int32_t width, int32_t height) {
  EnsureLoaded();
  if (width < 0 && width != -1) throw vb::Error(380, "Invalid property value");
  if (height < 0 && height != -1) throw vb::Error(380, "Invalid property value");
  SetLeft(left);
  SetTop(top);
  // One move is one resize, however many sides changed.
  bool resized = false;
  if (width >= 0 && width != width_) {
    width_ = width;
    Changed("Width");
    resized = true;
  }
  if (height >= 0 && height != height_) {
    height_ = height;
    Changed("Height");
    resized = true;
  }
  if (resized) RaiseResize();
}

void Form::RaiseResize() {
  if (state_ == State::Created || applyingDesign_) return;
  Form_Resize();
}

// ---- controls and focus ----------------------------------------------------------

Control* Form::FindControl(std::string_view name, int index) const {
  if (name.empty()) return nullptr;
  auto found = byName_.find(ControlKey(name, index));
  return found == byName_.end() ? nullptr : found->second;
}

Control* Form::ActiveControl() const {
  const_cast<Form*>(this)->EnsureLoaded();
  return active_;
}

CommandButton* Form::DefaultButton() const {
  for (const auto& control : controls_)
    if (auto* button = dynamic_cast<CommandButton*>(control.get()); button && button->Default())
      return button;
  return nullptr;
}

CommandButton* Form::CancelButton() const {
  for (const auto& control : controls_)
    if (auto* button = dynamic_cast<CommandButton*>(control.get()); button && button->Cancel())
      return button;
  return nullptr;
}

void Form::ClearFocus() {
  active_ = nullptr;
  Tell([&](FormListener& l) { l.FocusChanged(*this, nullptr); });
}

void Form::ControlFocusLost(Control& control) {
  if (active_ != &control) return;
  ClearFocus();
  control.LostFocus();
}

bool Form::MoveFocus(Control& target) {
  EnsureLoaded();
  if (target.form_ != this) throw std::logic_error("focus moved to another form's control");
  if (!target.CanFocus()) return false;
  Control* from = active_;
  if (from == &target) return true;
  uint64_t generation = loadGeneration_;
  if (from && target.CausesValidation()) {
    int cancel = 0;
    from->Validate(cancel);
    if (!Loaded() || loadGeneration_ != generation) return false;
    if (cancel != 0) return false;
    // The handler moved the focus itself; its move stands.
    if (active_ != from) return active_ == &target;
    if (!target.CanFocus()) return false;
  }
  // As on Windows, the new control is already the active one while the old one's
  // LostFocus runs.
  active_ = &target;
  Tell([&](FormListener& l) { l.FocusChanged(*this, &target); });
  if (from) from->LostFocus();
  if (!Loaded() || loadGeneration_ != generation || active_ != &target) return false;
  target.GotFocus();
  return true;
}

Control* Form::NextInTabOrder(Control* from, bool backwards) const {
  std::vector<Control*> stops;
  for (const auto& control : controls_)
    if (control->CanFocus() && control->TabStop()) stops.push_back(control.get());
  if (stops.empty()) return nullptr;
  std::stable_sort(stops.begin(), stops.end(),
                   [](Control* a, Control* b) { return a->TabIndex() < b->TabIndex(); });
  if (backwards) std::reverse(stops.begin(), stops.end());
  auto at = std::find(stops.begin(), stops.end(), from);
  if (at == stops.end() || ++at == stops.end()) return stops.front();
  return *at;
}

void Form::FocusFirstControl() {
  if (Control* first = NextInTabOrder(nullptr)) MoveFocus(*first);
}

void Form::KeyStroke(int keyCode, int shift, int character) {
  EnsureLoaded();
  Control* target = active_;
  uint64_t generation = loadGeneration_;
  auto alive = [&] { return Loaded() && loadGeneration_ == generation; };

  // Enter and Escape belong to the default and cancel buttons, unless the focus is on
  // a button, which takes Enter itself.
  bool onButton = dynamic_cast<CommandButton*>(target) != nullptr;
  if (keyCode == vbKeyReturn && !onButton) {
    if (CommandButton* button = DefaultButton(); button && button->CanBeClicked()) {
      button->ClickedByUser();
      return;
    }
  }
  if (keyCode == vbKeyEscape) {
    if (CommandButton* button = CancelButton(); button && button->CanBeClicked()) {
      button->ClickedByUser();
      return;
    }
  }
  if (keyCode == vbKeyTab && (shift & (vbCtrlMask | vbAltMask)) == 0) {
    if (Control* next = NextInTabOrder(target, (shift & vbShiftMask) != 0)) MoveFocus(*next);
    return;
  }
  if (!target) return;

  int code = keyCode;
  target->KeyDown(code, shift);
  if (!alive()) return;
  // KeyCode set to 0 swallows the key: no KeyPress, no action of the control.
  if (code != 0) {
    if (character != 0) {
      int ascii = character;
      target->KeyPress(ascii);
      if (!alive()) return;
      if (ascii != 0) target->CharacterTyped(ascii);
    } else {
      target->KeyAction(code, shift);
    }
  }
  if (!alive()) return;
  int up = keyCode;
  target->KeyUp(up, shift);
}

void Form::PopupMenu(Menu& menu, float x, float y) {
  EnsureLoaded();
  if (&menu.Parent() != this) throw std::logic_error("pop-up menu of another form");
  Menu* chosen = Desktop::Current().ShowPopupMenu(*this, menu, x, y);
  if (chosen && chosen->CanBeChosen()) chosen->Click();
}

// ---- members by name -------------------------------------------------------------

void Form::Method(const std::string& name, MethodFn fn) {
  methods_[LowerName(name)] = std::move(fn);
}

void Form::Property(const std::string& name, std::function<vb::Variant()> get,
                    std::function<void(const vb::Variant&)> let) {
  properties_[LowerName(name)] = {std::move(get), std::move(let)};
}

vb::Variant Form::Get(const std::string& name) {
  std::string lower = LowerName(name);
  if (auto found = properties_.find(lower); found != properties_.end()) return found->second.get();
  if (lower == "name") return vb::Variant(Name());
  if (lower == "caption") return vb::Variant(Caption());
  if (lower == "visible") return vb::Variant(Visible());
  if (lower == "windowstate") return vb::Variant(int32_t{WindowState()});
  if (lower == "mousepointer") return vb::Variant(int32_t{MousePointer()});
  if (lower == "left") return vb::Variant(Left());
  if (lower == "top") return vb::Variant(Top());
  if (lower == "width") return vb::Variant(Width());
  if (lower == "height") return vb::Variant(Height());
  if (Control* control = FindControl(name)) {
    EnsureLoaded();
    return vb::Variant(control->shared_from_this());
  }
  if (auto found = methods_.find(lower); found != methods_.end()) {
    std::vector<vb::Variant> none;
    return found->second(none);
  }
  NoSuchMember(name);
}

void Form::Let(const std::string& name, const vb::Variant& value) {
  std::string lower = LowerName(name);
  if (auto found = properties_.find(lower); found != properties_.end()) {
    if (!found->second.let) ReadOnlyProperty(name);
    found->second.let(value);
    return;
  }
  if (lower == "caption") return SetCaption(vb::CStr(value));
  if (lower == "visible") return SetVisible(vb::CBool(value));
  if (lower == "windowstate") return SetWindowState(vb::CLng(value));
  if (lower == "mousepointer") return SetMousePointer(vb::CLng(value));
  if (lower == "left") return SetLeft(vb::CLng(value));
  if (lower == "top") return SetTop(vb::CLng(value));
  if (lower == "width") return SetWidth(vb::CLng(value));
  if (lower == "height") return SetHeight(vb::CLng(value));
  NoSuchMember(name);
}

vb::Variant Form::Invoke(const std::string& name, std::vector<vb::Variant>& args) {
  std::string lower = LowerName(name);
  if (auto found = methods_.find(lower); found != methods_.end()) return found->second(args);
  auto arg = [&](size_t i) -> const vb::Variant* {
    return i < args.size() && !args[i].IsMissing() ? &args[i] : nullptr;
  };
  if (lower == "show") {
    Show(arg(0) ? vb::CLng(*arg(0)) : vbModeless);
    return {};
  }
  if (lower == "hide") {
    Hide();
    return {};
  }
  if (lower == "move") {
    Move(vb::CLng(args.at(0)), arg(1) ? vb::CLng(*arg(1)) : Top(),
         arg(2) ? vb::CLng(*arg(2)) : -1, arg(3) ? vb::CLng(*arg(3)) : -1);
    return {};
  }
  // An element of a control array: Label2(1).
  if (args.size() == 1) {
    if (Control* control = FindControl(name, vb::CLng(args[0]))) {
      EnsureLoaded();
      return vb::Variant(control->shared_from_this());
    }
  }
  if (args.empty()) return Get(name);
  NoSuchMember(name);
}

// ---- z-order ---------------------------------------------------------------------

void SetWindowPos(Form& form, int32_t insertAfter, int32_t x, int32_t y, int32_t cx,
                  int32_t cy, uint32_t flags) {
  form.EnsureLoaded();
  if ((flags & SWP_NOMOVE) == 0) {
    form.SetLeft(x * kTwipsPerPixel);
    form.SetTop(y * kTwipsPerPixel);
  }
  if ((flags & SWP_NOSIZE) == 0) form.Move(form.Left(), form.Top(), cx * kTwipsPerPixel, cy * kTwipsPerPixel);
  if (insertAfter == HWND_TOPMOST) form.topMost_ = true;
  if (insertAfter == HWND_NOTOPMOST) form.topMost_ = false;
  form.Changed("ZOrder");
  Desktop::Current().WindowOrderChanged(form, insertAfter);
}

}  // namespace forms
