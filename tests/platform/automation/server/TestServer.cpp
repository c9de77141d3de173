// An in-process server that exists only for tests: a class that answers, a reporter
// whose Report always fails, and a class that cannot be made.

#include <stdexcept>

#include "platform/automation/Dispatch.h"
#include "platform/automation/InprocServer.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace {

automation::ObjectCounter liveObjects;

// Echo(text) gives the text back; Twice(ByRef n) doubles n in place.
class Echo : public automation::Dispatch<Echo> {
 public:
  static const automation::MemberTable<Echo>& Members() {
    static const auto table =
        automation::MemberTable<Echo>()
            .Method("Echo", {1, 1},
                    [](Echo&, automation::Args& a) { return vb::Variant(vb::CStr(a[0])); })
            .Method("Twice", {1, 1}, [](Echo&, automation::Args& a) {
              a[0] = vb::Variant(vb::CLng(a[0]) * 2);
              return vb::Variant();
            });
    return table;
  }

 private:
  automation::ObjectCounter::ObjectLock alive_{liveObjects};
};

// Stands in for a reporter that is installed but broken.
class FailingReporter : public automation::Dispatch<FailingReporter> {
 public:
  static const automation::MemberTable<FailingReporter>& Members() {
    static const auto table = automation::MemberTable<FailingReporter>().Method(
        "Report", {5, 5}, [](FailingReporter&, automation::Args&) -> vb::Variant {
          throw vb::Error(75, "the reporter's store is gone");
        });
    return table;
  }
};

class Unmakeable : public automation::Dispatch<Unmakeable> {
 public:
  Unmakeable() { throw std::runtime_error("no licence for this class"); }
  static const automation::MemberTable<Unmakeable>& Members() {
    static const automation::MemberTable<Unmakeable> table;
    return table;
  }
};

automation::ClassFactory<Echo> echoFactory;
automation::ClassFactory<FailingReporter> failingReporterFactory;
automation::ClassFactory<Unmakeable> unmakeableFactory;

const char kModuleAnchor = 0;

const automation::ServerModule& Module() {
  static const automation::ServerModule module{
      {"DvTest", "{2BC0B2AD-90D6-4DD3-AE63-88EFD3A942D9}", "1.0"},
      {
          {{"Echo", "DvTest.Echo", "{73D8261D-CE0E-47C9-BC73-A4ED1278D484}"}, &echoFactory},
          {{"FailingReporter", "DvTest.FailingReporter",
            "{1D4D7D95-C6DC-4995-AEAD-245B4987B317}"},
           &failingReporterFactory},
          {{"Unmakeable", "DvTest.Unmakeable", "{5B3EA5FE-174A-46A4-9302-C85C830871F9}"},
           &unmakeableFactory},
      }};
  return module;
}

}  // namespace

DV_INPROC_SERVER_ENTRY_POINTS(Module, kModuleAnchor, liveObjects)
