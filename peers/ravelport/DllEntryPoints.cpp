// Ravelport's in-process server entry points.

#include "Reporter.h"
#include "platform/automation/InprocServer.h"

namespace {

automation::ClassFactory<ravelport::Reporter> reporterFactory;

// Its address tells DllRegisterServer which library it is in.
const char kModuleAnchor = 0;

const automation::ServerModule& Module() {
  static const automation::ServerModule module{
      {"Ravelport", "{268E7FA0-A2A7-4E93-A864-0F07BCA58539}", "1.0"},
      {
          {{"General", "Ravelport.General", "{D509D970-8B36-4696-98AB-51AE8489D3F0}"},
           &reporterFactory},
      }};
  return module;
}

}  // namespace

DV_INPROC_SERVER_ENTRY_POINTS(Module, kModuleAnchor, ravelport::LiveObjects())
