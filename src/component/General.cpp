#include "component/General.h"

#include "common/ErrorTrap.h"
#include "component/HostRecordset.h"
#include "component/LoginState.h"
#include "platform/vb/Conversions.h"

namespace component {

void General::Registo(vb::Variant& tRs, const vb::Variant& Pkey, const std::string& Tabela,
                      const std::string& StrWhere, const vb::ObjectPtr& Caller) {
  common::Trap(common::ClassSite("Registo"), [&] {
    if (!IsLoggedIn()) return;
    // Tabela and StrWhere are not used: Pkey alone names the entry. The host's
    // recordset is only positioned on it; the entry opens even when it is not there.
    const bool given = !Pkey.IsEmpty() && !Pkey.IsMissing();
    const int32_t dorvantoId = given ? vb::CLng(Pkey) : 0;
    if (given) PositionHostRecordset(tRs, "dorvanto_id", dorvantoId);
    OpenInHeaderEditor(Caller, dorvantoId, 0);
  });
}

}  // namespace component
