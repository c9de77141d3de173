#include "component/GeneralDetails.h"

#include "common/ErrorTrap.h"
#include "component/LoginState.h"

namespace component {

void GeneralDetails::Registo(vb::Variant& tRs, const vb::Variant& Pkey,
                             const std::string& Tabela, const std::string& StrWhere,
                             const vb::ObjectPtr& Caller) {
  common::Trap(common::ClassSite("Registo"), [&] {
    if (!IsLoggedIn()) return;
    // Tabela and StrWhere are not used: Pkey names a line, and the line its entry.
  });
}

}  // namespace component
