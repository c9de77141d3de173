#include "common/SqlServer.h"

namespace common {

const ado::ConnectionPtr& SqlServer() {
  static const ado::ConnectionPtr connection = ado::Connection::Create();
  return connection;
}

}  // namespace common
