#pragma once
// The one connection all database work of the component goes through. The data
// environment owns its life (settings, login, the probe before every statement and the
// reconnect dialog); the shared helpers below it only need to reach it.

#include "platform/ado/Connection.h"

namespace common {

// The shared connection, created closed on first use and never replaced.
const ado::ConnectionPtr& SqlServer();

}  // namespace common
