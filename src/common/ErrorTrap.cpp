#include "common/ErrorTrap.h"

#include <cstdio>
#include <exception>
#include <new>

#include <fmt/format.h>

#include "platform/automation/CreateObject.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"
#include "platform/vb/Object.h"
#include "platform/vb/Variant.h"

namespace common {

namespace {

TrapSite Site(std::string product, std::string project, std::string module,
              std::string procedure, TrapRule rule, bool longMessage = false) {
  return TrapSite{std::move(product), std::move(project), std::move(module),
                  std::move(procedure), rule, longMessage};
}

// The last resort when the reporter cannot take a report: one line on stderr, which a
// host's log keeps, rather than an error that vanishes.
void ReportToStderr(const TrapSite& site, const std::string& message,
                    std::exception_ptr failure) noexcept {
  try {
    std::string why = "unknown failure";
    try {
      std::rethrow_exception(failure);
    } catch (const vb::Error& e) {
      why = fmt::format("error {}: {}", e.Number(), e.Description());
    } catch (const std::exception& e) {
      why = e.what();
    } catch (...) {
    }
    std::string line = fmt::format(
        "poc-dorvantos: the error reporter {} failed ({}); unreported error in {}.{}: {}\n",
        kReporterProgId, why, site.module, site.procedure, message);
    std::fputs(line.c_str(), stderr);
  } catch (...) {
    std::fputs("poc-dorvantos: an error could not be reported\n", stderr);
  }
}

void RunOnError(const std::function<void()>& onError) noexcept {
  if (!onError) return;
  try {
    onError();
  } catch (...) {
    // Undoing is best effort: the error that brought us here is the one to report.
  }
}

}  // namespace

TrapSite LoginSite(const std::string& procedure) {
  return Site(kProductLabel, kLoginProjectLabel, "General", procedure, TrapRule::Always);
}

TrapSite DataEnvironmentSite(const std::string& procedure) {
  return Site(kProductLabel, kLoginProjectLabel, "DataEnvironment", procedure, TrapRule::Always);
}

TrapSite ClassSite(const std::string& procedure) {
  return Site(kProductLabel, kClassProjectLabel, "General", procedure, TrapRule::NonEmpty);
}

TrapSite FormSite(const std::string& form, const std::string& procedure) {
  return Site(kProductLabel, kEntryProjectLabel, form, procedure, TrapRule::NonBlank);
}

TrapSite FindContaSite(const std::string& procedure) {
  return Site(kProductLabel, kFinderProjectLabel, "frmFindConta", procedure, TrapRule::NonBlank);
}

TrapSite ControlFillSite() {
  return Site(kControlFillLabel, kControlFillLabel, "modControlFill", "ControlFill",
              TrapRule::NonBlank);
}

TrapSite RegistrySite(const std::string& procedure) {
  return Site(kRegistryProductLabel, kRegistryProjectLabel, "modRegistry", procedure,
              TrapRule::NonBlank, true);
}

TrapSite FechosSite(const std::string& procedure) {
  return Site(kProductLabel, kFechosProjectLabel, "modFechos", procedure, TrapRule::NonBlank,
              true);
}

TrapSite CodeSite(const std::string& procedure) {
  return Site(kProductLabel, kCodeProjectLabel, "modCode", procedure, TrapRule::NonBlank, true);
}

TrapSite DataSite(const std::string& procedure) {
  return Site(kProductLabel, kDataProjectLabel, "modData", procedure, TrapRule::NonBlank, true);
}

std::string ReportMessage(const TrapSite& site, int32_t number, const std::string& description) {
  if (!site.longMessage) return description;
  return "Error Number = " + std::to_string(number) + " | Description = " + description;
}

bool ShouldReport(const TrapSite& site, int32_t number, const std::string& description) {
  // 3709 is a connection the reconnect dialog already told the person about.
  if (number == 0 || number == vb::kErrConnectionClosed) return false;
  switch (site.rule) {
    case TrapRule::Always: return true;
    case TrapRule::NonEmpty: return !description.empty();
    case TrapRule::NonBlank: return !vb::Trim(description).empty();
  }
  return true;
}

void ReportError(const TrapSite& site, int32_t number, const std::string& description) {
  std::string message;
  try {
    if (!ShouldReport(site, number, description)) return;
    message = ReportMessage(site, number, description);
    vb::ObjectPtr reporter = automation::CreateObject(kReporterProgId);
    reporter->Call("Report", {vb::Variant(site.product), vb::Variant(site.project),
                              vb::Variant(site.module), vb::Variant(site.procedure),
                              vb::Variant(message)});
  } catch (...) {
    ReportToStderr(site, message.empty() ? description : message, std::current_exception());
  }
}

bool Trap(const TrapSite& site, const std::function<void()>& body,
          const std::function<void()>& onError) {
  int32_t number = 0;
  std::string description;
  try {
    body();
    return true;
  } catch (const vb::Error& e) {
    number = e.Number();
    description = e.Description();
  } catch (const std::bad_alloc&) {
    number = kErrOutOfMemory;
    description = "Out of memory";
  } catch (const std::exception& e) {
    number = kErrInternal;
    description = e.what();
  } catch (...) {
    number = kErrInternal;
    description = "Internal error";
  }
  RunOnError(onError);
  ReportError(site, number, description);
  return false;
}

}  // namespace common
