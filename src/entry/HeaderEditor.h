#pragma once
// How the component's classes get a header editor without knowing its class: a fresh
// frmMain, on which they set MainClass and CallBackClass and call DoInsert or DoOpen
// by name.

#include <memory>

#include "platform/forms/Form.h"

namespace entry {

// A fresh, unloaded frmMain that opens real line editors and, after a restart, the
// next header editor.
std::shared_ptr<forms::Form> NewHeaderEditor();

}  // namespace entry
