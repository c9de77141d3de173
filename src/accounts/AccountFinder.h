#pragma once
// How the line editor gets a new account finder without knowing its class: it creates
// one, sets its MainForm to itself and calls DoOpen by name; the pick comes back later
// as a call of DoFillConta on MainForm.

#include <memory>

#include "platform/forms/Form.h"

namespace accounts {

// A fresh, unloaded frmFindConta.
std::shared_ptr<forms::Form> NewAccountFinder();

}  // namespace accounts
