#include "common/modControlFill.h"

#include "common/ErrorTrap.h"
#include "common/SqlServer.h"
#include "platform/ado/Recordset.h"
#include "platform/vb/Conversions.h"

namespace common {
namespace {

// Field names are matched exactly here, unlike Fields(name): a query whose columns
// are not spelt as the caller expects is taken as not meant for this control.
bool HasField(ado::Recordset& rs, const std::string& name) {
  ado::Fields& fields = rs.Fields();
  for (int32_t i = 0; i < fields.Count(); ++i)
    if (fields.Item(i).Name() == name) return true;
  return false;
}

bool FieldsPresent(ado::Recordset& rs, const std::string& textField,
                   const std::string& itemDataField) {
  if (!HasField(rs, textField)) return false;
  return itemDataField.empty() || HasField(rs, itemDataField);
}

void AddRows(forms::ListControl& ctl, ado::Recordset& rs, const std::string& textField,
             const std::string& itemDataField) {
  for (; !rs.Eof(); rs.MoveNext()) {
    const vb::Variant& text = rs.Fields(textField).Value();
    if (text.IsNull()) continue;
    ctl.AddItem(vb::CStr(text));
    if (!itemDataField.empty())
      ctl.SetItemData(ctl.NewIndex(), vb::CLng(rs.Fields(itemDataField).Value()));
  }
}

}  // namespace

void ControlFill(forms::ListControl& ctl, const std::string& sql, const std::string& textField,
                 const std::string& itemDataField) {
  Trap(ControlFillSite(), [&] {
    ado::RecordsetPtr rs = ado::Recordset::Create();
    rs->Open(sql, SqlServer());
    if (!rs->Eof() && FieldsPresent(*rs, textField, itemDataField)) {
      ctl.Clear();
      AddRows(ctl, *rs, textField, itemDataField);
    }
    rs->Close();
  });
}

}  // namespace common
