#pragma once
// Classes a process serves to itself, as COM's CoRegisterClassObject lets a running
// program offer a class: while registered, CreateObject of that ProgID makes an object
// here, without looking at the class registry. A host uses it to stand between the
// component and a peer (to watch the reports that go to Ravelport.General, say) without
// touching the settings store that other processes share.

#include <functional>
#include <string>

#include "platform/vb/Object.h"

namespace automation {

// Makes a new instance of a class served by this process.
using ClassObjectFactory = std::function<vb::ObjectPtr()>;

// Serves progId from this process until revoked; a second registration of the same
// ProgID (compared ignoring letter case, as the class registry compares them) takes the
// place of the first. Raises std::invalid_argument for a name that is no ProgID or an
// empty factory.
void RegisterClassObject(const std::string& progId, ClassObjectFactory factory);
// Stops serving progId; false when it was not registered here.
bool RevokeClassObject(const std::string& progId);

// The factory registered for progId in this process, or an empty function.
ClassObjectFactory FindClassObject(const std::string& progId);

// CreateObject as it is without the classes of this process: the class registry only.
// What a registered class uses to reach the class it stands in front of.
vb::ObjectPtr CreateRegisteredObject(const std::string& progId);

}  // namespace automation
