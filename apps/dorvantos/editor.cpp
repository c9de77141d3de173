// The journal in real windows: the host loads the component by ProgID, logs the person
// in and shows its list of entries (or opens an entry, or the entry of a line, at
// once), then runs the desktop until the last window closes.

#include <fmt/format.h>

#include <cstdio>
#include <optional>
#include <string>

#include "commands.h"
#include "editor_list.h"
#include "common/PasswordCodec.h"
#include "host_database.h"
#include "platform/ado/RecordsetObject.h"
#include "platform/automation/CreateObject.h"
#include "platform/forms/Desktop.h"
#include "platform/forms/DesktopLoader.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace app {
namespace {

struct EditorOptions {
  std::string user = "demo";
  std::string password = "demo";
  std::optional<int32_t> entry;  // --open
  std::optional<int32_t> line;   // --line
};

std::optional<EditorOptions> ParseEditorOptions(const Args& args) {
  EditorOptions options;
  for (size_t i = 0; i < args.size(); ++i) {
    const std::string& arg = args[i];
    if (i + 1 >= args.size()) return std::nullopt;
    const std::string& value = args[++i];
    if (arg == "--user") {
      options.user = value;
    } else if (arg == "--password") {
      options.password = value;
    } else if (arg == "--open" || arg == "--line") {
      const auto id = vb::ParseInvariantNumber(value);
      if (!id || *id != static_cast<int32_t>(*id) || *id <= 0) return std::nullopt;
      (arg == "--open" ? options.entry : options.line) = static_cast<int32_t>(*id);
    } else {
      return std::nullopt;
    }
  }
  if (options.entry && options.line) return std::nullopt;
  return options;
}

// Opens what the options ask for: the list of entries, or one entry in the class's
// header editor. Returns the list window, which must outlive the desktop's run.
std::shared_ptr<frmDiario> OpenEditor(const vb::ObjectPtr& component, const EditorOptions& options) {
  if (!options.entry && !options.line) {
    auto list = std::make_shared<frmDiario>(OpenSettingsDatabase(), component);
    list->Show();
    return list;
  }
  // As a host does: its own recordset of the table, handed over with the key.
  const char* query = options.entry ? "SELECT * FROM tbPOC_Dorvantos ORDER BY dorvanto_id"
                                    : "SELECT * FROM tbPOC_Dorvantos_Details ORDER BY diario_id";
  ado::RecordsetPtr records = OpenSettingsDatabase()->Execute(query);
  component->Call("Registo", {ado::RecordsetObject::Wrap(records),
                              vb::Variant(options.entry ? *options.entry : *options.line),
                              vb::Variant::Missing(), vb::Variant::Missing(), vb::Nothing()});
  return nullptr;
}

}  // namespace

int RunEditor(const Args& args) {
  const std::optional<EditorOptions> options = ParseEditorOptions(args);
  if (!options) {
    std::fputs("usage: dorvantos [--user NAME] [--password TEXT] [--open ID | --line ID]\n",
               stderr);
    return 2;
  }
  if (!forms::LoadGraphicalDesktop()) {
    std::fputs("dorvantos: no display to open the journal editor on (DISPLAY is not set, or "
               "libdv_qt.so is missing beside the component)\n",
               stderr);
    return 1;
  }
  try {
    const char* progId = options->line ? "POC_Dorvantos.GeneralDetails" : "POC_Dorvantos.General";
    vb::ObjectPtr component = automation::CreateObject(progId);
    const vb::Variant loggedIn = component->Call(
        "Login", {vb::Variant(options->user), vb::Variant(common::EncodePassword(options->password))});
    if (!vb::CBool(loggedIn)) {
      forms::MsgBox(fmt::format("O utilizador {} não foi aceite pela base de dados.", options->user),
                    forms::vbCritical);
      return 1;
    }
    const std::shared_ptr<frmDiario> list = OpenEditor(component, *options);
    forms::RunGraphicalDesktop();
    return 0;
  } catch (const std::exception& e) {
    std::fprintf(stderr, "dorvantos: %s\n", e.what());
    return 1;
  }
}

}  // namespace app
