#include "platform/forms/ListControls.h"

#include <cctype>

#include "platform/forms/TextBox.h"
#include "platform/forms/Utf8.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace forms {

namespace {

const PropertyTable<ListControl>& ListProperties() {
  static const PropertyTable<ListControl> table = {
      {"listcount", {[](ListControl& c) { return vb::Variant(c.ListCount()); }, nullptr}},
      {"listindex",
       {[](ListControl& c) { return vb::Variant(c.ListIndex()); },
        [](ListControl& c, const vb::Variant& v) { c.SetListIndex(vb::CLng(v)); }}},
      {"newindex", {[](ListControl& c) { return vb::Variant(c.NewIndex()); }, nullptr}},
  };
  return table;
}

const PropertyTable<ComboBox>& ComboProperties() {
  static const PropertyTable<ComboBox> table = {
      {"style",
       {[](ComboBox& c) { return vb::Variant(int32_t{c.Style()}); },
        [](ComboBox& c, const vb::Variant& v) { c.SetStyle(vb::CLng(v)); }}},
      {"text",
       {[](ComboBox& c) { return vb::Variant(c.Text()); },
        [](ComboBox& c, const vb::Variant& v) { c.SetText(vb::CStr(v)); }}},
  };
  return table;
}

[[noreturn]] void BadIndex() { throw vb::Error(381, "Invalid property array index"); }

int Fold(int ch) { return ch < 128 ? std::tolower(ch) : ch; }

}  // namespace

// ---- ListControl -----------------------------------------------------------------

void ListControl::ResetState() {
  entries_.clear();
  listIndex_ = -1;
  newIndex_ = -1;
}

void ListControl::CheckIndex(int32_t index) const {
  if (index < 0 || index >= static_cast<int32_t>(entries_.size())) BadIndex();
}

int32_t ListControl::ListCount() const { Touch(); return static_cast<int32_t>(entries_.size()); }
int32_t ListControl::ListIndex() const { Touch(); return listIndex_; }
int32_t ListControl::NewIndex() const { Touch(); return newIndex_; }

void ListControl::SetListIndex(int32_t index) {
  Touch();
  if (index < -1 || index >= static_cast<int32_t>(entries_.size()))
    throw vb::Error(380, "Invalid property value");
  if (listIndex_ == index) return;
  listIndex_ = index;
  SelectionMoved();
  Changed("ListIndex");
  Raise(Click);
}

const std::string& ListControl::List(int32_t index) const {
  Touch();
  CheckIndex(index);
  return entries_[static_cast<size_t>(index)].text;
}

void ListControl::SetList(int32_t index, std::string text) {
  Touch();
  CheckIndex(index);
  entries_[static_cast<size_t>(index)].text = std::move(text);
  if (index == listIndex_) SelectionMoved();
  Changed("List");
}

int32_t ListControl::ItemData(int32_t index) const {
  Touch();
  CheckIndex(index);
  return entries_[static_cast<size_t>(index)].data;
}

void ListControl::SetItemData(int32_t index, int32_t data) {
  Touch();
  CheckIndex(index);
  entries_[static_cast<size_t>(index)].data = data;
  Changed("ItemData");
}

void ListControl::AddItem(std::string text, int32_t index) {
  Touch();
  auto count = static_cast<int32_t>(entries_.size());
  if (index > count || index < -1) throw vb::Error(5, "Invalid procedure call or argument");
  if (index == -1) index = count;
  entries_.insert(entries_.begin() + index, Entry{std::move(text), 0});
  newIndex_ = index;
  // The selected entry keeps being the same entry.
  if (listIndex_ >= index) ++listIndex_;
  Changed("List");
}

void ListControl::RemoveItem(int32_t index) {
  Touch();
  CheckIndex(index);
  entries_.erase(entries_.begin() + index);
  if (listIndex_ == index) {
    listIndex_ = -1;
    SelectionMoved();
  } else if (listIndex_ > index) {
    --listIndex_;
  }
  newIndex_ = -1;
  Changed("List");
}

void ListControl::Clear() {
  Touch();
  entries_.clear();
  listIndex_ = -1;
  newIndex_ = -1;
  SelectionMoved();
  Changed("List");
}

int32_t ListControl::EntryStartingWith(int keyAscii) const {
  auto count = static_cast<int32_t>(entries_.size());
  std::string wanted = utf8::Encode(Fold(keyAscii));
  for (int32_t step = 1; step <= count; ++step) {
    int32_t i = (listIndex_ + step) % count;
    const std::string& text = entries_[static_cast<size_t>(i)].text;
    if (text.empty()) continue;
    std::string first = text.substr(0, utf8::Offset(text, 1));
    if (first.size() == 1) first[0] = static_cast<char>(Fold(static_cast<unsigned char>(first[0])));
    if (first == wanted) return i;
  }
  return -1;
}

void ListControl::KeyAction(int keyCode, int shift) {
  Touch();
  auto count = static_cast<int32_t>(entries_.size());
  if (count == 0) return;
  if (keyCode == vbKeyDown) SetListIndex(std::min(listIndex_ + 1, count - 1));
  if (keyCode == vbKeyUp) SetListIndex(std::max(listIndex_ - 1, 0));
}

vb::Variant ListControl::Invoke(const std::string& name, std::vector<vb::Variant>& args) {
  std::string lower = LowerName(name);
  auto at = [&](size_t i) -> const vb::Variant& {
    if (i >= args.size() || args[i].IsMissing()) throw vb::Error(450, "Wrong number of arguments");
    return args[i];
  };
  bool hasSecond = args.size() > 1 && !args[1].IsMissing();
  if (lower == "additem") {
    AddItem(vb::CStr(at(0)), hasSecond ? vb::CLng(args[1]) : -1);
    return {};
  }
  if (lower == "removeitem") {
    RemoveItem(vb::CLng(at(0)));
    return {};
  }
  if (lower == "clear") {
    Clear();
    return {};
  }
  // The indexed properties: List(i), ItemData(i) read; with a second argument, written.
  if (lower == "list") {
    if (hasSecond) SetList(vb::CLng(at(0)), vb::CStr(args[1]));
    return vb::Variant(List(vb::CLng(at(0))));
  }
  if (lower == "itemdata") {
    if (hasSecond) SetItemData(vb::CLng(at(0)), vb::CLng(args[1]));
    return vb::Variant(ItemData(vb::CLng(at(0))));
  }
  return Control::Invoke(name, args);
}

vb::Variant ListControl::Get(const std::string& name) {
  return GetProperty(ListProperties(), *this, name);
}
void ListControl::Let(const std::string& name, const vb::Variant& value) {
  LetProperty(ListProperties(), *this, name, value);
}

// ---- ComboBox --------------------------------------------------------------------

void ComboBox::ResetState() {
  ListControl::ResetState();
  style_ = vbComboDropDown;
  text_.clear();
}

int ComboBox::Style() const { Touch(); return style_; }

void ComboBox::SetStyle(int style) {
  Touch();
  if (!Quiet()) ReadOnlyProperty("Style");  // a combo's style is chosen at design time
  if (style < vbComboDropDown || style > vbComboDropDownList)
    throw vb::Error(380, "Invalid property value");
  style_ = style;
  if (style_ == vbComboDropDownList) text_.clear();
}

const std::string& ComboBox::Text() const { Touch(); return text_; }

void ComboBox::SetText(std::string text) {
  Touch();
  if (style_ == vbComboDropDownList) {
    // A drop-down list takes a text only as the choice of the entry that has it.
    for (size_t i = 0; i < entries_.size(); ++i)
      if (entries_[i].text == text) return SetListIndex(static_cast<int32_t>(i));
    ReadOnlyProperty("Text");
  }
  if (text_ == text) return;
  text_ = std::move(text);
  Changed("Text");
  Raise(Change);
}

void ComboBox::SelectionMoved() {
  // Choosing an entry shows its text; an editable combo does not raise Change for it.
  std::string shown = listIndex_ >= 0 ? entries_[static_cast<size_t>(listIndex_)].text
                                      : (style_ == vbComboDropDownList ? "" : text_);
  if (shown == text_) return;
  text_ = std::move(shown);
  Changed("Text");
}

void ComboBox::CharacterTyped(int keyAscii) {
  Touch();
  if (style_ == vbComboDropDownList) {
    if (keyAscii < 32) return;
    if (int32_t i = EntryStartingWith(keyAscii); i >= 0) SetListIndex(i);
    return;
  }
  // An editable combo edits at the end of its text.
  std::string text = text_;
  if (keyAscii == vbKeyBack) {
    if (text.empty()) return;
    text.resize(utf8::Offset(text, utf8::Length(text) - 1));
  } else if (keyAscii >= 32) {
    text += utf8::Encode(keyAscii);
  } else {
    return;
  }
  listIndex_ = -1;
  SetText(std::move(text));
}

vb::Variant ComboBox::Get(const std::string& name) {
  if (auto* row = FindRow(ComboProperties(), name)) return row->get(*this);
  return ListControl::Get(name);
}

void ComboBox::Let(const std::string& name, const vb::Variant& value) {
  if (auto* row = FindRow(ComboProperties(), name)) return row->let(*this, value);
  ListControl::Let(name, value);
}

// ---- ListBox ---------------------------------------------------------------------

std::string ListBox::Text() const {
  Touch();
  return listIndex_ >= 0 ? entries_[static_cast<size_t>(listIndex_)].text : std::string{};
}

vb::Variant ListBox::Get(const std::string& name) {
  if (LowerName(name) == "text") return vb::Variant(Text());
  return ListControl::Get(name);
}

void ListBox::CharacterTyped(int keyAscii) {
  Touch();
  if (keyAscii < 32) return;
  if (int32_t i = EntryStartingWith(keyAscii); i >= 0) SetListIndex(i);
}

}  // namespace forms
