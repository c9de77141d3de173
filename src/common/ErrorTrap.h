#pragma once
// The error trap every trapped procedure arms at its start. On an error it undoes what
// the procedure says must be undone (an open transaction), hands the error to the
// reporter "Ravelport.General" when the rules of the procedure's kind allow it, and
// leaves the procedure: a function returns whatever result it had set before.
//
//   bool result = false;
//   Trap(FormSite("frmMain", "DoGravar"), [&] { ...; result = true; });
//   return result;
//
// Errors 0 and 3709 (a closed connection, which the reconnect dialog already told the
// person about) are never reported. A reporter that is missing or fails never stops
// the caller.

#include <cstdint>
#include <functional>
#include <string>

namespace common {

// The extra condition a kind of procedure puts on reporting.
enum class TrapRule {
  Always,    // any description
  NonEmpty,  // the description is not ""
  NonBlank,  // the description, trimmed of blanks, is not ""
};

// The labels a report carries and the rules of the procedure's kind.
struct TrapSite {
  std::string product;
  std::string project;
  std::string module;
  std::string procedure;
  TrapRule rule = TrapRule::NonBlank;
  // "Error Number = N | Description = D" instead of the bare description.
  bool longMessage = false;
};

// The kinds of trapped procedures of the component.
TrapSite LoginSite(const std::string& procedure);             // Login of both classes
TrapSite DataEnvironmentSite(const std::string& procedure);   // the connection's events
TrapSite ClassSite(const std::string& procedure);             // NovoRegisto, Registo
TrapSite FormSite(const std::string& form, const std::string& procedure);
TrapSite FindContaSite(const std::string& procedure);         // the account tree finder
TrapSite ControlFillSite();
TrapSite RegistrySite(const std::string& procedure);          // modRegistry
TrapSite FechosSite(const std::string& procedure);            // modFechos
TrapSite CodeSite(const std::string& procedure);              // modCode
TrapSite DataSite(const std::string& procedure);              // modData

// The message a report carries for an error at this site.
std::string ReportMessage(const TrapSite& site, int32_t number, const std::string& description);
// Whether an error at this site is reported at all.
bool ShouldReport(const TrapSite& site, int32_t number, const std::string& description);
// Reports an error when the site's rules allow it. Never throws.
void ReportError(const TrapSite& site, int32_t number, const std::string& description);

// Runs body under the trap. On an error: onError first (its own failure is ignored),
// then the report. Returns true when body ended without an error.
bool Trap(const TrapSite& site, const std::function<void()>& body,
          const std::function<void()>& onError = {});

}  // namespace common
