#pragma once
// How other windows get a new line editor without knowing its class: the header editor
// creates one, sets its MainClass to itself and calls one of DoInsert, DoOpen or
// DoRemove by name.

#include <memory>

#include "platform/forms/Form.h"

namespace lines {

// A fresh, unloaded frmMainDetails.
std::shared_ptr<forms::Form> NewLineEditor();

}  // namespace lines
