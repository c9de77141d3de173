#include "qt/Renderer.h"

#include <QTimer>
#include <algorithm>

#include "platform/forms/Control.h"
#include "platform/forms/Form.h"
#include "qt/ControlView.h"
#include "qt/FormWindow.h"
#include "qt/Guard.h"

namespace dvqt {

bool IsLoadedForm(const forms::Form* form) {
  const auto& loaded = forms::LoadedForms();
  return std::find(loaded.begin(), loaded.end(), form) != loaded.end();
}

Renderer::Renderer(TwipsScale scale) : scale_(scale) {
  forms::AddListener(this);
  // Forms loaded before the renderer came get their windows now.
  for (forms::Form* form : forms::LoadedForms()) {
    FormWindow* window = EnsureWindow(*form);
    if (window && form->Showing()) window->ShowForm(form->ShownModally());
  }
}

Renderer::~Renderer() {
  forms::RemoveListener(this);
  for (auto& [form, loop] : waiters_) loop->quit();
  windows_.clear();
  retired_.clear();
}

FormWindow* Renderer::WindowOf(const forms::Form& form) const {
  auto found = windows_.find(&form);
  return found == windows_.end() ? nullptr : found->second.get();
}

FormWindow* Renderer::EnsureWindow(forms::Form& form) {
  if (FormWindow* window = WindowOf(form)) return window;
  if (!form.Loaded()) return nullptr;
  FormWindow* created = nullptr;
  Guarded([&] {
    auto window = std::make_unique<FormWindow>(*this, form);
    created = window.get();
    windows_[&form] = std::move(window);
  }, "building a window");
  return created;
}

void Renderer::RunInput(forms::Form& form, const std::function<void()>& action) {
  if (!IsLoadedForm(&form)) return;
  // A handler may drop the last reference to its own form (the line editor that the
  // header editor replaces with the next one): the form lives until the action and
  // the model code around it are done with it.
  const std::shared_ptr<vb::Object> keep = form.weak_from_this().lock();
  ++depth_;
  Guarded(action, "input");
  --depth_;
  // The model may have moved the focus, or refused to: Qt's follows. The windows of
  // forms unloaded meanwhile go once no handler of theirs is running.
  if (FormWindow* window = WindowOf(form)) window->MirrorFocus();
  if (depth_ == 0) Reap();
}

void Renderer::MirrorFocus(forms::Form& form) {
  if (FormWindow* window = WindowOf(form)) window->MirrorFocus();
}

void Renderer::FlushAll() {
  for (auto& [form, window] : windows_)
    if (window->Live())
      for (const auto& control : form->Controls())
        if (ControlView* view = window->ViewOf(control.get())) view->Flush();
}

void Renderer::Reap() {
  if (retired_.empty() || reapPending_) return;
  reapPending_ = true;
  QTimer::singleShot(0, &later_, [this] {
    reapPending_ = false;
    // Inside a handler's nested loop the windows wait for RunInput to unwind.
    if (depth_ == 0) retired_.clear();
  });
}

void Renderer::AddWaiter(const forms::Form& form, QEventLoop* loop) { waiters_.emplace(&form, loop); }

void Renderer::RemoveWaiter(const forms::Form& form, QEventLoop* loop) {
  auto [from, to] = waiters_.equal_range(&form);
  for (auto at = from; at != to; ++at)
    if (at->second == loop) {
      waiters_.erase(at);
      return;
    }
}

void Renderer::StopWaiters(const forms::Form& form) {
  auto [from, to] = waiters_.equal_range(&form);
  for (auto at = from; at != to; ++at) at->second->quit();
}

// ---- the model's notifications ----------------------------------------------------------

void Renderer::FormLoaded(forms::Form& form) { EnsureWindow(form); }

void Renderer::FormShown(forms::Form& form, bool modal) {
  if (FormWindow* window = EnsureWindow(form)) window->ShowForm(modal);
}

void Renderer::FormHidden(forms::Form& form) {
  if (FormWindow* window = WindowOf(form)) {
    ActivationRequested();
    window->HideForm();
  }
  StopWaiters(form);
  FollowActivation();
}

void Renderer::FormUnloaded(forms::Form& form) {
  StopWaiters(form);
  if (onUnloaded) onUnloaded(form);
  auto found = windows_.find(&form);
  if (found == windows_.end()) return;
  ActivationRequested();
  found->second->Retire();
  retired_.push_back(std::move(found->second));
  windows_.erase(found);
  if (depth_ == 0) Reap();
  FollowActivation();
}

void Renderer::FollowActivation() {
  // The model picks the next active form only after telling of the hide or unload.
  QTimer::singleShot(0, &later_, [this] {
    forms::Form* active = forms::ActiveForm();
    if (active && IsLoadedForm(active)) MirrorFocus(*active);
  });
}

// ---- activation ---------------------------------------------------------------------------

namespace {
// A window system that keeps activating another window after this many requests of
// ours has the last word: the model then follows where the keyboard really is.
constexpr int kMaxOverruled = 3;
}  // namespace

// Asking again for the activation Qt just took elsewhere keeps the count of refusals.
void Renderer::ActivationRequested() { pending_ = true; }

void Renderer::ActivationSettled() {
  pending_ = false;
  overruled_ = 0;
}

bool Renderer::QtActivated(FormWindow& window) {
  forms::Form* wanted = forms::ActiveForm();
  FormWindow* target = wanted && IsLoadedForm(wanted) && wanted->Showing() ? WindowOf(*wanted) : nullptr;
  if (&window == target) {
    ActivationSettled();
    return false;
  }
  // Nothing of ours in flight, or nothing the model wants shown: a person's choice.
  if (!pending_ || !target || !target->isVisible() || ++overruled_ > kMaxOverruled) {
    ActivationSettled();
    return true;
  }
  // The window system's own consequence of our show or hide: the model's active form
  // keeps the activation, and Qt is brought back to it once this report is done.
  QTimer::singleShot(0, &later_, [this] {
    forms::Form* active = forms::ActiveForm();
    if (active && IsLoadedForm(active)) MirrorFocus(*active);
  });
  return false;
}

void Renderer::FormChanged(forms::Form& form, std::string_view property) {
  if (FormWindow* window = EnsureWindow(form)) window->FormChanged(property);
}

void Renderer::ControlChanged(forms::Control& control, std::string_view property) {
  if (FormWindow* window = EnsureWindow(control.Parent()))
    window->ControlChanged(control, property);
}

void Renderer::ItemChanged(forms::Control& control, std::string_view key,
                           std::string_view property) {
  if (FormWindow* window = EnsureWindow(control.Parent()))
    window->ItemChanged(control, key, property);
}

void Renderer::FocusChanged(forms::Form& form, forms::Control*) {
  if (FormWindow* window = WindowOf(form)) window->MirrorFocus();
}

}  // namespace dvqt
