#pragma once
// How a renderer observes the form model. The model is the single source of truth:
// a listener is told what changed and reads the new state back from the model.
// Listeners are process-wide, because a renderer shows every form.

#include <functional>
#include <string_view>

namespace forms {

class Form;
class Control;

class FormListener {
 public:
  virtual ~FormListener() = default;

  // The form's controls were built from its design; the Load handler runs next.
  virtual void FormLoaded(Form&) {}
  virtual void FormShown(Form&, bool modal) {}
  virtual void FormHidden(Form&) {}
  // Also told when a loaded form is destroyed, from its destructor: a listener then
  // lets go of the form and touches nothing of it but its address.
  virtual void FormUnloaded(Form&) {}
  // A property of the form itself (Caption, Width, WindowState, MousePointer...).
  virtual void FormChanged(Form&, std::string_view property) {}
  // A property of a control, or its collection ("List", "ListItems", "Nodes",
  // "Buttons", "ColumnHeaders") as a whole.
  virtual void ControlChanged(Control&, std::string_view property) {}
  // A property of one item of a control (list item, node, toolbar button, column),
  // named by its key.
  virtual void ItemChanged(Control&, std::string_view key, std::string_view property) {}
  virtual void FocusChanged(Form&, Control* focused) {}
};

// Registers and drops a listener. The caller keeps it alive while registered.
void AddListener(FormListener* listener);
void RemoveListener(FormListener* listener);

namespace detail {
// Calls fn on each listener registered when the notification starts.
void Notify(const std::function<void(FormListener&)>& fn);
// Whether anyone listens: lets hot paths skip building a notification.
bool Listened();
}  // namespace detail

}  // namespace forms
