#pragma once
// A window: a vb::Object with a design (Design.h), controls built from it, event hooks
// for the form's own events and Event slots on each control for theirs.
//
// Life of a form:
//
//     created --first touch--> loading --Form_Load--> loaded, hidden <--Show/Hide--> shown
//        ^                                                 |
//        +------------------ Unload (not cancelled) -------+
//
// Touching a form (a property, Show, one of its controls) loads it. Unload asks
// QueryUnload and Unload, either of which may cancel; an unloaded form keeps its C++
// object and its member variables, and the next touch loads it again from its design.
// Loaded forms are listed process-wide (LoadedForms) in the order they loaded.

#include <cstdint>
#include <functional>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "platform/forms/Constants.h"
#include "platform/forms/Control.h"
#include "platform/forms/Design.h"
#include "platform/forms/Event.h"
#include "platform/vb/Object.h"
#include "platform/vb/Variant.h"

namespace forms {

class Menu;
class CommandButton;

class Form : public vb::Object {
 public:
  explicit Form(FormDesign design);
  ~Form() override;
  Form(const Form&) = delete;
  Form& operator=(const Form&) = delete;

  // Identity and state; reading these does not load the form.
  const std::string& Name() const { return design_.name; }
  bool Loaded() const { return state_ != State::Created; }
  // Whether the window is on screen, without loading it: what modal loops wait on.
  bool Showing() const { return Loaded() && visible_; }
  bool ShownModally() const { return Showing() && modal_; }
  bool TopMost() const { return topMost_; }
  uint64_t LoadGeneration() const { return loadGeneration_; }

  // Lifecycle.
  void Load();
  // Shows the form; vbModal returns when it is hidden or unloaded. The owner is the
  // window the modal form belongs to; the model only remembers it.
  void Show(int modal = vbModeless, Form* owner = nullptr);
  void Hide();
  // Unloads by code; false when QueryUnload or Unload cancelled.
  bool Unload();
  // Closes the window as its close box does (QueryUnload's mode vbFormControlMenu).
  bool Close();
  // Puts the window on screen and raises what showing raises (the first Resize,
  // Activate, the first control's GotFocus). Desktops call it from ShowModal.
  void Display(bool modal);
  // Makes this the active window, raising Activate when it was not.
  void Activate();

  // Properties.
  std::string Caption() const;
  void SetCaption(std::string caption);
  bool Visible() const;
  void SetVisible(bool visible);
  int WindowState() const;
  void SetWindowState(int state);
  int MousePointer() const;
  void SetMousePointer(int pointer);
  int32_t Left() const;
  int32_t Top() const;
  int32_t Width() const;
  int32_t Height() const;
  void SetLeft(int32_t twips);
  void SetTop(int32_t twips);
  // Every change of size raises Resize, also from inside a Resize handler.
  void SetWidth(int32_t twips);
  void SetHeight(int32_t twips);
  void Move(int32_t left, int32_t top, int32_t width, int32_t height);
  Form* Owner() const { return owner_; }

  // Controls, by name and, for control arrays, index. Finding does not load the form.
  Control* FindControl(std::string_view name, int index = -1) const;
  template <class T>
  T& Ctl(std::string_view name, int index = -1) const {
    T* typed = dynamic_cast<T*>(FindControl(name, index));
    if (!typed)
      throw std::logic_error("form " + Name() + " has no control " + std::string(name) +
                             " of the type asked for");
    return *typed;
  }
  const std::vector<std::shared_ptr<Control>>& Controls() const { return controls_; }
  Control* ActiveControl() const;
  CommandButton* DefaultButton() const;
  CommandButton* CancelButton() const;

  // Focus and input, as a person's actions arrive (the keyboard user and renderers).
  // Moves the focus with validation: false when Validate kept it where it was.
  bool MoveFocus(Control& target);
  // The next control in tab order that can take the focus, after `from`.
  Control* NextInTabOrder(Control* from, bool backwards = false) const;
  // One keystroke on the focused control: KeyDown, KeyPress for a character, the
  // control's own action, KeyUp. `character` is 0 for keys that produce none.
  void KeyStroke(int keyCode, int shift, int character);
  // Shows a pop-up menu through the desktop and raises Click of the item chosen.
  void PopupMenu(Menu& menu, float x = 0, float y = 0);

  vb::Variant Invoke(const std::string& name, std::vector<vb::Variant>& args) override;
  vb::Variant Get(const std::string& name) override;
  void Let(const std::string& name, const vb::Variant& value) override;

  // Used by controls: whether the design is being applied (events muted), loading
  // on first touch.
  bool ApplyingDesign() const { return applyingDesign_; }
  void EnsureLoaded();
  void ControlFocusLost(Control& control);

 protected:
  // The form's own events. Override the ones the window handles.
  virtual void Form_Initialize() {}
  virtual void Form_Load() {}
  virtual void Form_Activate() {}
  virtual void Form_Deactivate() {}
  virtual void Form_QueryUnload(int& Cancel, int UnloadMode) {}
  virtual void Form_Unload(int& Cancel) {}
  virtual void Form_Resize() {}

  // Binds a member function as the handler of a control's event:
  //     Handle(FXDebito.KeyDown, &frmMainDetails::FXDebito_KeyDown);
  template <class F, class... A>
  void Handle(Event<A...>& event, void (F::*handler)(A...)) {
    F* self = static_cast<F*>(this);
    event = [self, handler](A... args) { (self->*handler)(std::forward<A>(args)...); };
  }

  // Public members reached by name from other windows. A method receives its
  // arguments by reference and may write back into them.
  using MethodFn = std::function<vb::Variant(std::vector<vb::Variant>&)>;
  void Method(const std::string& name, MethodFn fn);
  void Property(const std::string& name, std::function<vb::Variant()> get,
                std::function<void(const vb::Variant&)> let = {});

 private:
  enum class State { Created, Loading, Loaded, Unloading };

  bool UnloadWith(int mode);
  void RaiseResize();
  void Changed(std::string_view property);
  void FocusFirstControl();
  void ActivateNextWindow();
  void ClearFocus();
  static std::string ControlKey(std::string_view name, int index);

  FormDesign design_;
  std::vector<std::shared_ptr<Control>> controls_;
  std::unordered_map<std::string, Control*> byName_;
  std::unordered_map<std::string, MethodFn> methods_;
  struct PropertyFns {
    std::function<vb::Variant()> get;
    std::function<void(const vb::Variant&)> let;
  };
  std::unordered_map<std::string, PropertyFns> properties_;

  State state_ = State::Created;
  bool initialized_ = false;
  bool applyingDesign_ = false;
  uint64_t loadGeneration_ = 0;
  bool visible_ = false;
  bool modal_ = false;
  bool shownOnce_ = false;
  bool topMost_ = false;
  Form* owner_ = nullptr;
  std::string caption_;
  int windowState_ = vbNormal;
  int mousePointer_ = vbDefault;
  int32_t left_ = 0, top_ = 0, width_ = 0, height_ = 0;
  Control* active_ = nullptr;
  uint64_t activationStamp_ = 0;

  friend void SetWindowPos(Form&, int32_t, int32_t, int32_t, int32_t, int32_t, uint32_t);
};

// The forms loaded in this process, in the order they loaded.
const std::vector<Form*>& LoadedForms();
// The active window, or null.
Form* ActiveForm();

// user32's SetWindowPos on a form: moves and sizes it unless told not to, and changes
// its place in the z-order (HWND_TOPMOST, HWND_NOTOPMOST, HWND_TOP, HWND_BOTTOM).
void SetWindowPos(Form& form, int32_t insertAfter, int32_t x, int32_t y, int32_t cx,
                  int32_t cy, uint32_t flags);

}  // namespace forms
