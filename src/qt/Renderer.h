#pragma once
// Follows the form model and keeps one window per loaded form in step with it. Every
// input a window takes runs through RunInput, which keeps Qt's focus on the model's
// focused control afterwards and disposes of the windows of forms unloaded meanwhile
// once no handler of theirs is on the stack.

#include <QEventLoop>
#include <functional>
#include <memory>
#include <unordered_map>
#include <vector>

#include "platform/forms/FormListener.h"
#include "qt/Twips.h"

namespace forms {
class Form;
class Control;
}  // namespace forms

namespace dvqt {

class FormWindow;

class Renderer : public forms::FormListener {
 public:
  explicit Renderer(TwipsScale scale);
  ~Renderer() override;
  Renderer(const Renderer&) = delete;
  Renderer& operator=(const Renderer&) = delete;

  const TwipsScale& scale() const { return scale_; }
  // The window of a loaded form; null for a form not loaded.
  FormWindow* WindowOf(const forms::Form& form) const;

  // Runs a person's action on a form's model. Errors are logged, not thrown.
  void RunInput(forms::Form& form, const std::function<void()>& action);
  void MirrorFocus(forms::Form& form);
  // Rebuilds every collection whose rebuild is still pending.
  void FlushAll();

  // Event loops waiting for a form to leave the screen (modal display).
  void AddWaiter(const forms::Form& form, QEventLoop* loop);
  void RemoveWaiter(const forms::Form& form, QEventLoop* loop);
  // Told after a form's window went with its unload.
  std::function<void(const forms::Form&)> onUnloaded;

  // Activation. The model decides which form is active; Qt's activation follows it.
  // Every show, hide, raise or activation request of ours makes the window system
  // activate windows on its own for a while (the window under a hidden one, say),
  // and those reports must not take the model's choice back. ActivationRequested
  // marks a request of ours in flight until Qt activates the model's active form;
  // meanwhile Qt's activation of another window is not a person's.
  void ActivationRequested();
  // Whether the model should take Qt's activation of this window as a person's.
  bool QtActivated(FormWindow& window);
  // Nothing of ours is in flight any more: Qt activated the model's active form, or
  // a person chose a window (a mouse button pressed in it).
  void ActivationSettled();

  void FormLoaded(forms::Form& form) override;
  void FormShown(forms::Form& form, bool modal) override;
  void FormHidden(forms::Form& form) override;
  void FormUnloaded(forms::Form& form) override;
  void FormChanged(forms::Form& form, std::string_view property) override;
  void ControlChanged(forms::Control& control, std::string_view property) override;
  void ItemChanged(forms::Control& control, std::string_view key,
                   std::string_view property) override;
  void FocusChanged(forms::Form& form, forms::Control* focused) override;

 private:
  FormWindow* EnsureWindow(forms::Form& form);
  void StopWaiters(const forms::Form& form);
  // Disposes of retired windows from the event loop, never from inside an event of
  // theirs: the view whose handler unloaded its form still runs after the model returns.
  void Reap();
  // Gives Qt's activation to the window of the form the model made active.
  void FollowActivation();

  TwipsScale scale_;
  std::unordered_map<const forms::Form*, std::unique_ptr<FormWindow>> windows_;
  std::vector<std::unique_ptr<FormWindow>> retired_;
  std::unordered_multimap<const forms::Form*, QEventLoop*> waiters_;
  int depth_ = 0;
  bool reapPending_ = false;
  // An activation of ours that Qt has not confirmed yet, and how often Qt activated
  // another window meanwhile.
  bool pending_ = false;
  int overruled_ = 0;
  // Owns the timers of deferred work, so none fires after the renderer is gone.
  QObject later_;
};

// Whether the form object is still one the model lists as loaded: a window never
// touches a form that was destroyed under it.
bool IsLoadedForm(const forms::Form* form);

}  // namespace dvqt
