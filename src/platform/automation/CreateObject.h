#pragma once
// Basic's CreateObject for in-process servers: ProgID → CLSID → the server library
// registered for it → DllGetClassObject → a new instance.

#include <string>

#include "platform/vb/Object.h"

namespace automation {

// Raises vb::Error 429 "ActiveX component can't create object" when any step fails;
// the description goes on to say which step and why.
vb::ObjectPtr CreateObject(const std::string& progId);

}  // namespace automation
