#include "common/modData.h"

#include "common/ErrorTrap.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"
#include "platform/vb/Format.h"

namespace common {

namespace {

std::string DisplayText(const vb::Variant& value, int32_t kind) {
  switch (kind) {
    case kListDate: return vb::Format(value, "dd-mm-yyyy");
    case kListNumber: return vb::Format(value, "#,##0.00;- #,##0.00");
    case kListText: return vb::CStr(value);
    case kListEuro: return vb::Format(value, "€ #,##0.00;€ -#,##0.00");
    case kListPercent: return vb::Format(value, "0.00 %");
    // The picture alone would round halves away from zero; counts and codes round to
    // the even neighbour, as CLng does.
    case kListWhole: return vb::Format(vb::Variant(vb::RoundHalfEven(vb::CDbl(value))), "#,##0");
    case kListDateTime: return vb::Format(value, "dd-mm-yyyy Hh:Nn:Ss");
    default: return "";
  }
}

}  // namespace

std::string ListField(const ado::RecordsetPtr& rs, const std::string& fieldName, int32_t kind) {
  std::string text;
  Trap(DataSite("ListField"), [&] {
    if (!rs) throw vb::Error(vb::kErrObjectNotSet);
    int32_t index = rs->Fields().IndexOf(fieldName);
    if (index < 0) {
      text = " ";
      return;
    }
    const vb::Variant& value = rs->Fields(index).Value();
    text = value.IsNull() ? std::string(" ") : DisplayText(value, kind);
  });
  return text;
}

}  // namespace common
