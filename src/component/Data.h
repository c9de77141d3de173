#pragma once
// The data environment: the one shared connection SqlServer and what keeps it usable.
// Before every statement on it the connection is probed; when it has gone away it is
// opened again from the settings, and as long as that fails the person is asked,
// through frmSQLServer, whether to try again. After every statement pending window
// messages run, so the windows stay alive during long work.
//
//   statement --WillExecute--> probe "SELECT @@TRANCOUNT as flTrans"
//        broken? --no--> run it
//          |yes
//          v
//   close, read settings, open --ok or 3709--> run it
//          |failed
//          v
//   frmSQLServer: "&Ligar ao servidor SQL" -> again | "&Sair" -> run it; it fails on the
//   closed connection with 3709, which no trap reports.

#include <memory>

#include "platform/ado/Connection.h"

namespace component {

class frmSQLServer;

class DataEnvironment {
 public:
  DataEnvironment();
  ~DataEnvironment();
  DataEnvironment(const DataEnvironment&) = delete;
  DataEnvironment& operator=(const DataEnvironment&) = delete;

  // The shared connection of the component.
  const ado::ConnectionPtr& SqlServer() const;

  void SqlServer_WillExecute(ado::WillExecuteEvent& event);
  void SqlServer_ExecuteComplete(ado::ExecuteCompleteEvent& event);
  void DataEnvironment_Terminate();

  // The retry dialog while it is on screen, else null.
  const std::shared_ptr<frmSQLServer>& Dialog() const { return dialog_; }

 private:
  // True when the connection cannot run the statement about to start.
  bool ProbeFindsBroken();
  // Opens the connection again, asking the person between failed attempts.
  void Reconnect();
  // Shows frmSQLServer and waits for the person's answer.
  bool AskTryAgain();

  // Set while the probe's own statement runs, which must not probe again.
  bool probing_ = false;
  std::shared_ptr<frmSQLServer> dialog_;
};

// The data environment of the component, created on first use with its handlers on
// the shared connection.
DataEnvironment& Data();

}  // namespace component
