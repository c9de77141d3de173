#include "Reporter.h"

#include <cstdio>
#include <ctime>
#include <regex>
#include <stdexcept>

#include <fmt/format.h>
#include <nlohmann/json.hpp>

#include "ErrorLog.h"
#include "platform/forms/Desktop.h"
#include "platform/vb/Error.h"

namespace ravelport {

namespace {

// Basic's "Path/File access error": the log could not be written.
constexpr int32_t kErrPathFileAccess = 75;

std::string IsoTime(std::chrono::system_clock::time_point time) {
  std::time_t seconds = std::chrono::system_clock::to_time_t(time);
  std::tm utc{};
  gmtime_r(&seconds, &utc);
  auto millis = std::chrono::duration_cast<std::chrono::milliseconds>(time.time_since_epoch()) % 1000;
  char text[32];
  std::strftime(text, sizeof text, "%Y-%m-%dT%H:%M:%S", &utc);
  return fmt::format("{}.{:03}Z", text, millis.count());
}

}  // namespace

automation::ObjectCounter& LiveObjects() {
  static automation::ObjectCounter counter;
  return counter;
}

std::string LogLine(const ReportRecord& report, std::chrono::system_clock::time_point time) {
  nlohmann::ordered_json line{
      {"time", IsoTime(time)},          {"product", report.product},
      {"project", report.project},      {"module", report.module},
      {"procedure", report.procedure},  {"message", report.message},
  };
  return line.dump(-1, ' ', false, nlohmann::json::error_handler_t::replace);
}

std::string ConsoleLine(const ReportRecord& report) {
  std::string line = fmt::format("{} [{}] {}.{}: {}", report.product, report.project,
                                 report.module, report.procedure, report.message);
  for (char& c : line) {
    if (c == '\n' || c == '\r') c = ' ';
  }
  return line;
}

std::string NoticeText(const ReportRecord& report) {
  static const std::regex kSecret(
      R"(((?:password|pwd|user id|uid|user|data source|server|address|initial catalog|database|dsn)\s*=)[^;]*)",
      std::regex::icase);
  static const std::regex kEncoded(R"(dv1:[A-Za-z0-9+/=]+)");
  std::string text = fmt::format("{}.{}: {}", report.module, report.procedure, report.message);
  text = std::regex_replace(text, kSecret, "$1***");
  return std::regex_replace(text, kEncoded, "***");
}

const automation::MemberTable<Reporter>& Reporter::Members() {
  static const auto table = automation::MemberTable<Reporter>().Method(
      "Report", {5, 5}, [](Reporter& self, automation::Args& a) {
        self.Report(ReportRecord{automation::TextArg(a[0]), automation::TextArg(a[1]),
                                 automation::TextArg(a[2]), automation::TextArg(a[3]),
                                 automation::TextArg(a[4])});
        return vb::Variant();
      });
  return table;
}

void Reporter::Report(const ReportRecord& report) {
  std::string console = ConsoleLine(report) + "\n";
  std::fputs(console.c_str(), stderr);
  try {
    AppendLine(ErrorLogPath(), LogLine(report, std::chrono::system_clock::now()));
  } catch (const std::runtime_error& e) {
    throw vb::Error(kErrPathFileAccess, fmt::format("the error log cannot be written: {}", e.what()),
                    "Ravelport.General");
  }
  try {
    forms::Desktop::Current().ShowNotice(report.product, NoticeText(report));
  } catch (const std::exception& e) {
    std::fputs(fmt::format("Ravelport.General: the notice could not be shown: {}\n", e.what()).c_str(),
               stderr);
  }
}

}  // namespace ravelport
