// The component's in-process server entry points, as a host or a registration tool
// finds them by name.

#include "component/ClassIds.h"
#include "component/ClassObject.h"
#include "component/General.h"
#include "component/GeneralDetails.h"
#include "platform/automation/InprocServer.h"

namespace {

using namespace component;

automation::ClassFactory<General> generalFactory;
automation::ClassFactory<GeneralDetails> generalDetailsFactory;

// Its address tells DllRegisterServer which library it is in; internal linkage, so no
// other server's symbol can answer for it.
const char kModuleAnchor = 0;

const automation::ServerModule& Module() {
  static const automation::ServerModule module{
      {kTypeLibName, kTypeLibId, kTypeLibVersion},
      {
          {{kGeneralClassName, kGeneralProgId, kGeneralClsid}, &generalFactory},
          {{kGeneralDetailsClassName, kGeneralDetailsProgId, kGeneralDetailsClsid},
           &generalDetailsFactory},
      }};
  return module;
}

}  // namespace

DV_INPROC_SERVER_ENTRY_POINTS(Module, kModuleAnchor, LiveObjects())
