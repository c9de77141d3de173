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

// The reporter every trap hands its errors to.
inline constexpr const char* kReporterProgId = "Ravelport.General";

// The labels of the reports, where they are not a form's or a module's own name.
inline constexpr const char* kProductLabel = "POC Dorvantos";
inline constexpr const char* kLoginProjectLabel = "Ligação";     // Login, the connection
inline constexpr const char* kClassProjectLabel = "Registos";    // NovoRegisto, Registo
inline constexpr const char* kEntryProjectLabel = "Dorvantos";   // the entry's windows
inline constexpr const char* kFinderProjectLabel = "Cordavel";   // the account finder
inline constexpr const char* kControlFillLabel = "ControlFill";
inline constexpr const char* kRegistryProductLabel = "Módulo de Registo";
inline constexpr const char* kRegistryProjectLabel = "Configuração";
inline constexpr const char* kFechosProjectLabel = "Fechos";
inline constexpr const char* kCodeProjectLabel = "Código";
inline constexpr const char* kDataProjectLabel = "Dados";

// The numbers a trap gives failures that are no Basic error.
inline constexpr int32_t kErrOutOfMemory = 7;
inline constexpr int32_t kErrInternal = 51;  // any other exception; its what() describes it

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
// Reports an error when the site's rules allow it, through a fresh reporter made for
// this one report. Never throws: when the reporter is missing or fails, the report goes
// to the standard error stream instead, so it is not lost without a trace.
void ReportError(const TrapSite& site, int32_t number, const std::string& description);

// Runs body under the trap. On an error: onError first (its own failure is ignored),
// then the report. Returns true when body ended without an error. Nothing escapes:
// a vb::Error keeps its number and description, any other exception is reported as
// kErrInternal with its what().
bool Trap(const TrapSite& site, const std::function<void()>& body,
          const std::function<void()>& onError = {});

}  // namespace common
