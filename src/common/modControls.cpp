#include "common/modControls.h"

#include <fmt/format.h>

#include <optional>
#include <string_view>

#include "common/modCode.h"
#include "platform/forms/Buttons.h"
#include "platform/forms/DTPicker.h"
#include "platform/forms/ListControls.h"
#include "platform/forms/StaticControls.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Format.h"

namespace common {
namespace {

constexpr std::string_view kDateFormat = "dd-mm-yyyy";

bool IsNumericKind(int32_t kind) {
  switch (kind) {
    case kValueNumber: case kValueEuro: case kValuePercent: case kValueWhole:
    case kValueEuro3: case kValueNumber3: return true;
    default: return false;
  }
}

// How a raw value is shown when it is set or refreshed.
std::string_view ShownFormat(int32_t kind) {
  switch (kind) {
    case kValueNumber: return "#,##0.00;- #,##0.00";
    case kValueEuro: return "€ #,##0.00;€ -#,##0.00";
    case kValuePercent: return "0.00 %";
    case kValueEuro3: return "€ #,##0.000;€ -#,##0.000";
    case kValueNumber3: return "#,##0.000;- #,##0.000";
    default: return {};
  }
}

// How it is shown right after the person edited it: the plain numbers drop the
// section that writes negatives with a blank after the minus.
std::string_view EditedFormat(int32_t kind) {
  switch (kind) {
    case kValueNumber: return "#,##0.00";
    case kValueNumber3: return "#,##0.000";
    default: return ShownFormat(kind);
  }
}

std::string WholeNumber(const vb::Variant& value) { return vb::CStr(vb::CLng(value)); }

// A Single holds about seven significant digits; writing it with more would show the
// noise of its binary fraction (0,2 as 0,200000002980232).
std::string SingleText(float value) {
  const std::string digits = fmt::format("{:.7g}", value);
  return vb::CStr(vb::ParseInvariantNumber(digits).value_or(static_cast<double>(value)));
}

void SelectAll(forms::TextBox& box) {
  box.SetSelStart(0);
  box.SetSelLength(vb::Len(box.Text()));
}

// Whether a raw value can be saved as it is: written the SQL way (the comma turned
// into a point) it reads as a plain number.
bool IsPlainNumber(const std::string& raw) {
  return vb::ParseInvariantNumber(ReplaceChar(raw, ",", ".")).has_value();
}

// The raw value of what a person typed into a numeric box. A point counts as the
// decimal symbol, so the numeric keypad's key works ("12.5" is 12,5). Text that is no
// number counts as 0. Anything else that reads as a number in the regional way
// ("1.234,50", "€ 12,50") is stored as that number, so that the raw value always
// saves as what the box shows and never turns into null.
std::string TypedRawValue(const std::string& text) {
  const std::string trimmed = vb::Trim(text);
  if (!vb::IsNumeric(vb::Variant(trimmed))) return "0";
  const std::string pointAsComma = ReplaceChar(trimmed, ".", ",");
  if (IsPlainNumber(pointAsComma)) return pointAsComma;
  return vb::CStr(vb::CDbl(vb::Variant(trimmed)));
}

// What a text box or a label shows for a value: the raw value for its tag and its
// text. What is left empty stays as it was.
struct Shown {
  std::optional<std::string> tag;
  std::optional<std::string> text;
};

Shown ShownFor(const vb::Variant& value, int32_t kind) {
  if (value.IsNull()) return {"", ""};
  switch (kind) {
    case kValuePlain: {
      const std::string text = vb::CStr(value);
      if (vb::IsNumeric(value)) return {text, text};
      return {std::nullopt, text};
    }
    case kValueDate: return {"", vb::Format(value, kDateFormat)};
    case kValueText: return {"", vb::CStr(value)};
    case kValueWhole: {
      const std::string text = WholeNumber(value);
      return {vb::CStr(value), text};
    }
    case kValueNumber: case kValueEuro: case kValuePercent: case kValueEuro3:
    case kValueNumber3: {
      // An empty raw value clears what is shown too: the box must never show an
      // amount that it would not save.
      const std::string raw = vb::CStr(value);
      return {raw, raw.empty() ? std::string() : vb::Format(vb::Variant(raw), ShownFormat(kind))};
    }
    default: return {};
  }
}

void SetTextBox(forms::TextBox& box, const vb::Variant& value, int32_t kind) {
  const Shown shown = ShownFor(value, kind);
  if (shown.tag) box.SetTag(*shown.tag);
  if (shown.text) box.SetText(*shown.text);
}

void SetLabel(forms::Label& label, const vb::Variant& value, int32_t kind) {
  Shown shown;
  if (value.IsNull()) {
    shown.text = "";  // a label keeps its raw value when it is blanked
  } else if (kind == kValueWhole && !vb::IsNumeric(value)) {
    shown = {vb::CStr(value), vb::CStr(value)};
  } else {
    shown = ShownFor(value, kind);
  }
  if (shown.tag) label.SetTag(*shown.tag);
  if (shown.text) label.SetCaption(*shown.text);
}

bool IsDropDownList(const forms::ListControl& list) {
  auto* combo = dynamic_cast<const forms::ComboBox*>(&list);
  return !combo || combo->Style() == forms::vbComboDropDownList;
}

// Entries of a drop-down list or list box are known by their item data, a key.
void SelectByItemData(forms::ListControl& list, const vb::Variant& value) {
  if (value.IsNull() || !vb::IsNumeric(value)) {
    list.SetListIndex(-1);
    return;
  }
  const double key = vb::CDbl(value);
  for (int32_t i = 0; i < list.ListCount(); ++i) {
    if (list.ItemData(i) == key) {
      list.SetListIndex(i);
      return;
    }
  }
  // A key that is not among the entries keeps the selection the list had.
}

int OnOff(const vb::Variant& value) {
  return !value.IsNull() && vb::IsNumeric(value) && vb::CDbl(value) != 0.0 ? 1 : 0;
}

std::string TextBoxSqlValue(forms::TextBox& box, int32_t kind) {
  if (box.Text().empty()) return "null";
  switch (kind) {
    case kValuePlain:
      // A raw number goes out unquoted only when it is one the server reads as such.
      if (IsPlainNumber(box.Tag())) return ReplaceChar(box.Tag(), ",", ".");
      return "'" + Trtf(box.Text()) + "'";
    case kValueDate: return SqlValue(vb::Variant(box.Text()), kSqlDate);
    case kValueText: return SqlValue(vb::Variant(box.Text()), kSqlText);
    default:
      if (IsNumericKind(kind)) return SqlValue(vb::Variant(box.Tag()), kSqlNumber);
      return "";
  }
}

std::string ListSqlValue(forms::ListControl& list) {
  if (list.ListIndex() < 0) return "null";
  return std::to_string(list.ItemData(list.ListIndex()));
}

}  // namespace

void SetControlValue(forms::Control& ctl, const vb::Variant& value, int32_t kind) {
  if (auto* box = dynamic_cast<forms::TextBox*>(&ctl)) return SetTextBox(*box, value, kind);
  if (auto* label = dynamic_cast<forms::Label*>(&ctl)) return SetLabel(*label, value, kind);
  if (auto* list = dynamic_cast<forms::ListControl*>(&ctl)) {
    if (IsDropDownList(*list)) return SelectByItemData(*list, value);
    auto& combo = dynamic_cast<forms::ComboBox&>(*list);
    return combo.SetText(value.IsNull() ? std::string() : vb::CStr(value));
  }
  if (auto* picker = dynamic_cast<forms::DTPicker*>(&ctl)) {
    const bool noDate = value.IsNull() || !vb::IsDate(value);
    return picker->SetValue(noDate ? vb::kEmptyDate : vb::CDate(value));
  }
  if (auto* check = dynamic_cast<forms::CheckBox*>(&ctl)) return check->SetValue(OnOff(value));
  if (auto* option = dynamic_cast<forms::OptionButton*>(&ctl))
    return option->SetValue(OnOff(value) == 1);
}

std::string ControlSqlValue(forms::Control& ctl, int32_t kind) {
  if (auto* box = dynamic_cast<forms::TextBox*>(&ctl)) return TextBoxSqlValue(*box, kind);
  if (auto* list = dynamic_cast<forms::ListControl*>(&ctl)) {
    if (IsDropDownList(*list)) return ListSqlValue(*list);
    const std::string& text = dynamic_cast<forms::ComboBox&>(*list).Text();
    return text.empty() ? "null" : SqlValue(vb::Variant(text), kSqlText);
  }
  if (auto* picker = dynamic_cast<forms::DTPicker*>(&ctl)) {
    if (picker->Value() == vb::kEmptyDate) return "null";
    return SqlValue(vb::Variant(picker->Value()), kSqlDateTime);
  }
  if (auto* check = dynamic_cast<forms::CheckBox*>(&ctl)) return check->Value() != 0 ? "1" : "0";
  if (auto* option = dynamic_cast<forms::OptionButton*>(&ctl)) return option->Value() ? "1" : "0";
  return "";
}

void FormatControlText(forms::TextBox& box, int32_t kind) {
  if (box.Tag().empty() || !IsNumericKind(kind)) return;
  if (kind == kValueWhole) return box.SetText(box.Tag());
  box.SetText(vb::Format(vb::Variant(box.Tag()), ShownFormat(kind)));
}

void BeginEdit(forms::TextBox& box, int32_t kind) {
  if (kind == kValueText) return SelectAll(box);
  if (!IsNumericKind(kind)) return;
  if (box.Tag().empty()) {
    box.SetText("");
    box.SetTag("");
    return SelectAll(box);
  }
  const vb::Variant raw(box.Tag());
  switch (kind) {
    case kValueNumber: case kValueEuro: box.SetText(box.Tag()); break;
    case kValueEuro3: case kValueNumber3: box.SetText(vb::CStr(vb::Round(vb::CDbl(raw), 3))); break;
    case kValuePercent: box.SetText(SingleText(vb::CSng(raw) * 100.0f)); break;
    case kValueWhole: {
      const std::string whole = WholeNumber(raw);
      box.SetTag(whole);
      box.SetText(whole);
      break;
    }
  }
  SelectAll(box);
}

void EndEdit(forms::TextBox& box, int32_t kind) {
  if (kind == kValueText) return box.SetTag("");
  if (!IsNumericKind(kind) || box.Text().empty()) return;
  const std::string typed = TypedRawValue(box.Text());
  std::string raw;
  std::string shown;
  switch (kind) {
    case kValuePercent:
      raw = SingleText(vb::CSng(vb::Variant(typed)) / 100.0f);
      shown = vb::Format(vb::Variant(raw), EditedFormat(kind));
      break;
    case kValueWhole:
      raw = shown = WholeNumber(vb::Variant(typed));
      break;
    default:
      raw = typed;
      shown = vb::Format(vb::Variant(raw), EditedFormat(kind));
      break;
  }
  box.SetTag(raw);
  box.SetText(shown);
}

}  // namespace common
