// RecordFinder's in-process server entry points.

#include "RecordFinder.h"
#include "platform/automation/InprocServer.h"

namespace {

automation::ClassFactory<recordfinder::RecordFinder> finderFactory;

// Its address tells DllRegisterServer which library it is in.
const char kModuleAnchor = 0;

const automation::ServerModule& Module() {
  static const automation::ServerModule module{
      {"RecordFinder", "{5C1E8B47-3F2A-4D6E-9B0C-7A4E2D9F1B63}", "1.0"},
      {
          {{"General", "RecordFinder.General", "{A3D94F12-6B7E-4C85-8E21-F04B9C6D7E58}"},
           &finderFactory},
      }};
  return module;
}

}  // namespace

DV_INPROC_SERVER_ENTRY_POINTS(Module, kModuleAnchor, recordfinder::LiveObjects())
