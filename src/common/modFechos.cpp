#include "common/modFechos.h"

#include "common/ErrorTrap.h"
#include "common/SqlServer.h"
#include "platform/ado/Recordset.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Date.h"

namespace common {

namespace {

// The last moment a closing dated `closed` still covers: the end of its calendar day,
// whatever time of day the closing was stored with.
vb::Date EndOfClosedDay(vb::Date closed) {
  vb::DateParts day = vb::SplitDate(closed);
  return *vb::DateSerial(day.year, day.month, day.day, 23, 59, 59);
}

}  // namespace

vb::Variant GetServerDate() {
  try {
    ado::RecordsetPtr rs = SqlServer()->Execute("SELECT GETDATE() AS DATE");
    return rs->Fields("date").Value();
  } catch (...) {
    // A date nobody could ask for is no date; the statement's own failure (a closed
    // connection, most likely) has been dealt with by the reconnect dialog.
    return vb::Variant::Null();
  }
}

bool IsTransactionOpen() {
  const ado::ConnectionPtr& connection = SqlServer();
  if (connection->State() != ado::adStateOpen) return false;
  ado::RecordsetPtr rs = connection->Execute("SELECT @@TRANCOUNT as valor");
  return vb::CDbl(rs->Fields("valor").Value()) != 0;
}

bool IsClosedDate(const vb::Variant& date, const ado::ConnectionPtr& connection) {
  bool closed = false;
  Trap(FechosSite("IsClosedDate"), [&] {
    if (date.IsNull()) return;
    ado::RecordsetPtr rs = ado::Recordset::Create();
    rs->Open("SELECT MAX(data) as max_data FROM tbFechos WHERE (anulado is null OR anulado = 0)",
             connection);
    if (!rs->Eof()) {
      const vb::Variant& lastClosed = rs->Fields("max_data").Value();
      if (!lastClosed.IsNull()) closed = vb::CDate(date) <= EndOfClosedDay(vb::CDate(lastClosed));
    }
    rs->Close();
  });
  return closed;
}

}  // namespace common
