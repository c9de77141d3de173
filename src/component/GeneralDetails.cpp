#include "component/GeneralDetails.h"

#include "common/ErrorTrap.h"
#include "component/HostRecordset.h"
#include "component/LoginState.h"
#include "platform/vb/Conversions.h"

namespace component {

void GeneralDetails::Registo(vb::Variant& tRs, const vb::Variant& Pkey,
                             const std::string& Tabela, const std::string& StrWhere,
                             const vb::ObjectPtr& Caller) {
  common::Trap(common::ClassSite("Registo"), [&] {
    if (!IsLoggedIn()) return;
    // Tabela and StrWhere are not used: Pkey names a line, and the host's recordset,
    // positioned on that line (or on its first record when the line is not there),
    // names the entry.
    const bool given = !Pkey.IsEmpty() && !Pkey.IsMissing();
    const int32_t diarioId = given ? vb::CLng(Pkey) : 0;
    int32_t dorvantoId = 0;
    if (given) {
      const vb::Variant entry = PositionHostRecordset(tRs, "diario_id", diarioId, "dorvanto_id");
      dorvantoId = entry.IsNull() || entry.IsEmpty() ? 0 : vb::CLng(entry);
    }
    OpenInHeaderEditor(Caller, dorvantoId, diarioId);
  });
}

}  // namespace component
