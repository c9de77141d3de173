#pragma once
// Ravelport.General: takes the component's error reports. Each report becomes one JSON
// line in the error log and one line on stderr, so that it is kept, and a notice on the
// desktop, so that the person at the window sees it without being stopped by it.
//
//   Report(product, project, module, procedure, message)

#include <chrono>
#include <string>

#include "platform/automation/Dispatch.h"
#include "platform/automation/InprocServer.h"

namespace ravelport {

automation::ObjectCounter& LiveObjects();

struct ReportRecord {
  std::string product;
  std::string project;
  std::string module;
  std::string procedure;
  std::string message;
};

// The log line of a report made at the given time ("time" in UTC, ISO 8601). Text that
// is not valid UTF-8 is kept with its faulty bytes replaced, never refused.
std::string LogLine(const ReportRecord& report, std::chrono::system_clock::time_point time);
// The one-line form for stderr: line breaks of the message become spaces.
std::string ConsoleLine(const ReportRecord& report);

// The notice's text: where the error happened and what it says, with the values of
// connection-string keys (passwords, users, servers) and encoded passwords masked. A
// notice is read over a shoulder; the log, private to its user, keeps the message whole.
std::string NoticeText(const ReportRecord& report);

class Reporter : public automation::Dispatch<Reporter> {
 public:
  static const automation::MemberTable<Reporter>& Members();

  // Raises error 75 when the log cannot be written; the stderr line is written first
  // either way. The notice comes after the log line: it can neither delay nor lose it,
  // and a desktop that fails to show it costs the report nothing.
  void Report(const ReportRecord& report);

 private:
  automation::ObjectCounter::ObjectLock alive_{LiveObjects()};
};

}  // namespace ravelport
