#include "component/HostRecordset.h"

#include "platform/ado/RecordsetObject.h"
#include "platform/vb/Error.h"

namespace component {

vb::Variant PositionHostRecordset(vb::Variant& tRs, const std::string& keyField, int32_t key,
                                  const std::string& resultField) {
  const ado::RecordsetPtr rs = ado::RecordsetObject::From(tRs);
  if (!rs) throw vb::Error(vb::kErrObjectNotSet);
  // An empty recordset has no first record to move to; there is nothing to position.
  if (rs->RecordCount() == 0) return vb::Variant();
  rs->MoveFirst();
  rs->Find(keyField + "=" + std::to_string(key));
  if (rs->Eof()) rs->MoveFirst();
  return resultField.empty() ? vb::Variant() : rs->Fields(resultField).Value();
}

}  // namespace component
