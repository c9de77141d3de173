#include "component/Data.h"

#include <optional>

#include "common/ErrorTrap.h"
#include "common/PasswordCodec.h"
#include "common/SqlServer.h"
#include "component/ConnectionSettings.h"
#include "component/frmSQLServer.h"
#include "platform/forms/Desktop.h"
#include "platform/vb/Error.h"

namespace component {

namespace {

enum class OpenOutcome { Opened, GiveUp, Failed };

// One attempt to open the shared connection from the settings, its errors ignored: a
// failure is an answer here, not something to report.
OpenOutcome OpenFromSettings(const ado::ConnectionPtr& connection) {
  std::optional<ConnectionSettings> settings = ReadConnectionSettings();
  if (!settings) return OpenOutcome::GiveUp;
  try {
    std::optional<std::string> password = common::DecodePassword(settings->password);
    // A stored password that does not decode is refused as a wrong one would be.
    if (!password) return OpenOutcome::Failed;
    connection->SetConnectionString(ConnectionString(*settings, settings->user, *password));
    connection->Open();
    // As ADO's Open does: what failed before belongs to the connection that failed.
    connection->Errors().Clear();
  } catch (const vb::Error& e) {
    return e.Number() == vb::kErrConnectionClosed ? OpenOutcome::Opened : OpenOutcome::Failed;
  } catch (const std::exception&) {
    return OpenOutcome::Failed;
  }
  return OpenOutcome::Opened;
}

}  // namespace

DataEnvironment::DataEnvironment() {
  const ado::ConnectionPtr& connection = SqlServer();
  connection->WillExecute = [this](ado::WillExecuteEvent& event) { SqlServer_WillExecute(event); };
  connection->ExecuteComplete = [this](ado::ExecuteCompleteEvent& event) {
    SqlServer_ExecuteComplete(event);
  };
}

DataEnvironment::~DataEnvironment() {
  DataEnvironment_Terminate();
  // The connection may outlive us in someone's hands; it must not call back into us.
  SqlServer()->WillExecute = nullptr;
  SqlServer()->ExecuteComplete = nullptr;
}

const ado::ConnectionPtr& DataEnvironment::SqlServer() const { return common::SqlServer(); }

void DataEnvironment::DataEnvironment_Terminate() { dialog_.reset(); }

void DataEnvironment::SqlServer_ExecuteComplete(ado::ExecuteCompleteEvent&) { forms::DoEvents(); }

void DataEnvironment::SqlServer_WillExecute(ado::WillExecuteEvent&) {
  if (probing_) return;
  common::Trap(common::DataEnvironmentSite("SqlServer_WillExecute"), [&] {
    if (!ProbeFindsBroken()) return;
    SqlServer()->Errors().Clear();
    Reconnect();
  });
  // Whatever happened, the statement now runs as usual: on a closed connection it fails
  // with 3709, which no trap reports.
}

bool DataEnvironment::ProbeFindsBroken() {
  const ado::ConnectionPtr& connection = SqlServer();
  bool probeFailed = false;
  probing_ = true;
  try {
    connection->Execute("SELECT @@TRANCOUNT as flTrans");
  } catch (const vb::Error& e) {
    probeFailed = true;
    if (e.Number() != vb::kErrConnectionClosed) connection->Errors().Refresh();
  } catch (const std::exception&) {
    probeFailed = true;
  }
  probing_ = false;
  // An error left from an earlier statement counts too: the connection may have gone
  // wrong then, and a fresh one costs little.
  return connection->State() != ado::adStateOpen || connection->Errors().Count() > 0 ||
         probeFailed;
}

void DataEnvironment::Reconnect() {
  const ado::ConnectionPtr& connection = SqlServer();
  for (;;) {
    if (connection->State() != ado::adStateClosed) connection->Close();
    switch (OpenFromSettings(connection)) {
      case OpenOutcome::Opened:
      case OpenOutcome::GiveUp: return;
      case OpenOutcome::Failed: break;
    }
    if (!AskTryAgain()) return;
  }
}

bool DataEnvironment::AskTryAgain() {
  // Kept here as well as in dialog_: window messages run while it waits, and a handler
  // entered meanwhile may reach this loop and show a dialog of its own.
  auto dialog = std::make_shared<frmSQLServer>();
  dialog_ = dialog;
  dialog->Show(forms::vbModeless);
  forms::Desktop::Current().WaitWhileVisible(*dialog);
  bool again = dialog->TryAgain;
  dialog->Unload();
  if (dialog_ == dialog) dialog_.reset();
  return again;
}

DataEnvironment& Data() {
  static DataEnvironment data;
  return data;
}

}  // namespace component
