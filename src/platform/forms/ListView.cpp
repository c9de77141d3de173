#include "platform/forms/ListView.h"

#include <algorithm>

#include "platform/forms/Form.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace forms {

namespace {

[[noreturn]] void NotFound() { throw vb::Error(vb::kErrElementNotFound, "Element not found"); }
[[noreturn]] void OutOfBounds() { throw vb::Error(35600, "Index out of bounds"); }
[[noreturn]] void KeyTaken() {
  throw vb::Error(vb::kErrKeyNotUnique, "Key is not unique in collection");
}

const PropertyTable<ListView>& Properties() {
  static const PropertyTable<ListView> table = {
      {"multiselect",
       {[](ListView& c) { return vb::Variant(c.MultiSelect()); },
        [](ListView& c, const vb::Variant& v) { c.SetMultiSelect(vb::CBool(v)); }}},
      {"sorted",
       {[](ListView& c) { return vb::Variant(c.Sorted()); },
        [](ListView& c, const vb::Variant& v) { c.SetSorted(vb::CBool(v)); }}},
      {"sortkey",
       {[](ListView& c) { return vb::Variant(int32_t{c.SortKey()}); },
        [](ListView& c, const vb::Variant& v) { c.SetSortKey(vb::CLng(v)); }}},
      {"sortorder",
       {[](ListView& c) { return vb::Variant(int32_t{c.SortOrder()}); },
        [](ListView& c, const vb::Variant& v) { c.SetSortOrder(vb::CLng(v)); }}},
  };
  return table;
}

const std::string& NoText() {
  static const std::string empty;
  return empty;
}

std::string Folded(const std::string& text) {
  std::string folded = text;
  for (char& ch : folded)
    if (ch >= 'A' && ch <= 'Z') ch = static_cast<char>(ch - 'A' + 'a');
  return folded;
}

}  // namespace

// ---- ColumnHeader ----------------------------------------------------------------

void ColumnHeader::Changed(std::string_view property) {
  owner_.ItemChanged(key_.empty() ? std::to_string(index_) : key_, property);
}

void ColumnHeader::SetText(std::string text) {
  if (text_ == text) return;
  text_ = std::move(text);
  Changed("Text");
}

void ColumnHeader::SetWidth(int32_t width) {
  if (width < 0) throw vb::Error(380, "Invalid property value");
  if (width_ == width) return;
  width_ = width;
  Changed("Width");
}

void ColumnHeader::SetAlignment(int alignment) {
  if (alignment < lvwColumnLeft || alignment > lvwColumnCenter)
    throw vb::Error(380, "Invalid property value");
  // The first column of a report view is always left-aligned on Windows.
  if (index_ == 1 && alignment != lvwColumnLeft) throw vb::Error(380, "Invalid property value");
  if (alignment_ == alignment) return;
  alignment_ = alignment;
  Changed("Alignment");
}

ColumnHeader& ColumnHeaderList::operator()(int32_t index) const {
  if (index < 1 || index > Count()) OutOfBounds();
  return *columns_[static_cast<size_t>(index - 1)];
}

ColumnHeader& ColumnHeaderList::operator()(const std::string& key) const {
  auto found = byKey_.find(key);
  if (found == byKey_.end()) NotFound();
  return *found->second;
}

ColumnHeader& ColumnHeaderList::Add(std::string key, std::string text, int32_t width,
                                    int alignment) {
  if (!key.empty() && byKey_.count(key)) KeyTaken();
  if (columns_.empty()) alignment = lvwColumnLeft;
  columns_.push_back(std::make_unique<ColumnHeader>(owner_, std::move(key), std::move(text),
                                                    width, alignment));
  ColumnHeader& added = *columns_.back();
  added.index_ = Count();
  if (!added.Key().empty()) byKey_[added.Key()] = &added;
  owner_.Changed("ColumnHeaders");
  return added;
}

void ColumnHeaderList::Clear() {
  columns_.clear();
  byKey_.clear();
  owner_.Changed("ColumnHeaders");
}

// ---- ListItem --------------------------------------------------------------------

void ListItem::Changed(std::string_view property) { owner_.ItemChanged(key_, property); }

void ListItem::SetText(std::string text) {
  if (text_ == text) return;
  text_ = std::move(text);
  Changed("Text");
}

const std::string& ListItem::SubItems(int32_t index) const {
  if (index < 1 || index >= owner_.columns_.Count()) throw vb::Error(380, "Invalid property value");
  auto at = static_cast<size_t>(index - 1);
  return at < subItems_.size() ? subItems_[at] : NoText();
}

void ListItem::SetSubItems(int32_t index, std::string text) {
  if (index < 1 || index >= owner_.columns_.Count()) throw vb::Error(380, "Invalid property value");
  auto at = static_cast<size_t>(index - 1);
  if (subItems_.size() <= at) subItems_.resize(at + 1);
  if (subItems_[at] == text) return;
  subItems_[at] = std::move(text);
  Changed("SubItems");
}

void ListItem::SetSmallIcon(int icon) {
  if (smallIcon_ == icon) return;
  smallIcon_ = icon;
  Changed("SmallIcon");
}

void ListItem::SetSelected(bool selected) {
  if (selected_ == selected) return;
  owner_.ItemSelected(*this, selected);
}

void ListItem::EnsureVisible() {
  owner_.scrolledTo_ = this;
  Changed("EnsureVisible");
}

// ---- ListItemList ----------------------------------------------------------------

ListItem* ListItemList::Find(const std::string& key) const {
  auto found = byKey_.find(key);
  return found == byKey_.end() ? nullptr : found->second;
}

ListItem& ListItemList::operator()(const std::string& key) const {
  if (ListItem* item = Find(key)) return *item;
  NotFound();
}

ListItem& ListItemList::operator()(int32_t index) const {
  if (index < 1 || index > Count()) OutOfBounds();
  return *items_[static_cast<size_t>(index - 1)];
}

void ListItemList::Renumber(size_t from) {
  for (size_t i = from; i < items_.size(); ++i) items_[i]->index_ = static_cast<int32_t>(i + 1);
}

ListItem& ListItemList::Add(int32_t index, std::string key, std::string text, int smallIcon) {
  if (index != -1 && (index < 1 || index > Count() + 1)) OutOfBounds();
  if (!key.empty() && byKey_.count(key)) KeyTaken();
  auto item = std::make_unique<ListItem>(owner_, std::move(key), std::move(text), smallIcon);
  size_t position = owner_.sorted_ ? owner_.SortedPosition(*item)
                    : index == -1  ? items_.size()
                                   : static_cast<size_t>(index - 1);
  ListItem& added = *item;
  items_.insert(items_.begin() + static_cast<std::ptrdiff_t>(position), std::move(item));
  Renumber(position);
  if (!added.Key().empty()) byKey_[added.Key()] = &added;
  owner_.Changed("ListItems");
  return added;
}

void ListItemList::EraseAt(size_t position) {
  ListItem* item = items_[position].get();
  if (owner_.selected_ == item) owner_.selected_ = nullptr;
  if (owner_.scrolledTo_ == item) owner_.scrolledTo_ = nullptr;
  if (owner_.editing_ == item) owner_.editing_ = nullptr;
  if (!item->Key().empty()) byKey_.erase(item->Key());
  items_.erase(items_.begin() + static_cast<std::ptrdiff_t>(position));
  Renumber(position);
  owner_.Changed("ListItems");
}

void ListItemList::Remove(const std::string& key) {
  EraseAt(static_cast<size_t>((*this)(key).Index() - 1));
}

void ListItemList::Remove(int32_t index) {
  (*this)(index);  // raises when out of bounds
  EraseAt(static_cast<size_t>(index - 1));
}

void ListItemList::Clear() {
  items_.clear();
  byKey_.clear();
  owner_.selected_ = owner_.scrolledTo_ = owner_.editing_ = nullptr;
  owner_.Changed("ListItems");
}

// ---- ListView --------------------------------------------------------------------

void ListView::ResetState() {
  items_.Clear();
  columns_.Clear();
  multiSelect_ = sorted_ = false;
  sortKey_ = sortOrder_ = 0;
}

void ListView::ApplyItems(const std::vector<ItemDesign>& items) {
  for (const ItemDesign& column : items)
    columns_.Add(column.key, column.caption, column.width, column.alignment);
}

ListItem* ListView::SelectedItem() const { Touch(); return selected_; }
ListItem* ListView::ScrolledTo() const { Touch(); return scrolledTo_; }

void ListView::ItemSelected(ListItem& item, bool selected) {
  Touch();
  if (selected && !multiSelect_ && selected_ && selected_ != &item) {
    selected_->selected_ = false;
    selected_->Changed("Selected");
  }
  item.selected_ = selected;
  if (selected) selected_ = &item;
  else if (selected_ == &item) selected_ = nullptr;
  item.Changed("Selected");
}

bool ListView::MultiSelect() const { Touch(); return multiSelect_; }
void ListView::SetMultiSelect(bool multi) {
  Touch();
  multiSelect_ = multi;
  Changed("MultiSelect");
}

bool ListView::Sorted() const { Touch(); return sorted_; }
void ListView::SetSorted(bool sorted) {
  Touch();
  sorted_ = sorted;
  Changed("Sorted");
  if (sorted_) Resort();
}

int ListView::SortKey() const { Touch(); return sortKey_; }
void ListView::SetSortKey(int key) {
  Touch();
  if (key < 0) throw vb::Error(380, "Invalid property value");
  sortKey_ = key;
  Changed("SortKey");
  if (sorted_) Resort();
}

int ListView::SortOrder() const { Touch(); return sortOrder_; }
void ListView::SetSortOrder(int order) {
  Touch();
  if (order != 0 && order != 1) throw vb::Error(380, "Invalid property value");
  sortOrder_ = order;
  Changed("SortOrder");
  if (sorted_) Resort();
}

bool ListView::Before(const ListItem& a, const ListItem& b) const {
  // A sort key past the last sub-item sorts by an empty text: the order stays.
  auto text = [&](const ListItem& item) -> const std::string& {
    if (sortKey_ == 0) return item.text_;
    auto at = static_cast<size_t>(sortKey_ - 1);
    return at < item.subItems_.size() ? item.subItems_[at] : NoText();
  };
  std::string left = Folded(text(a)), right = Folded(text(b));
  return sortOrder_ == 0 ? left < right : right < left;
}

size_t ListView::SortedPosition(const ListItem& item) const {
  auto at = std::upper_bound(items_.items_.begin(), items_.items_.end(), item,
                             [&](const ListItem& value, const std::unique_ptr<ListItem>& other) {
                               return Before(value, *other);
                             });
  return static_cast<size_t>(at - items_.items_.begin());
}

void ListView::Resort() {
  std::stable_sort(items_.items_.begin(), items_.items_.end(),
                   [&](const std::unique_ptr<ListItem>& a, const std::unique_ptr<ListItem>& b) {
                     return Before(*a, *b);
                   });
  items_.Renumber(0);
  Changed("ListItems");
}

void ListView::ClickItem(ListItem& item, int button, int shift) {
  Touch();
  uint64_t generation = LoadGeneration();
  auto alive = [&] { return LoadGeneration() == generation && Parent().Loaded(); };
  Raise(MouseDown, button, shift, 0.0f, 0.0f);
  if (!alive()) return;
  item.SetSelected(true);
  Raise(ItemClick, item);
  if (!alive()) return;
  Raise(MouseUp, button, shift, 0.0f, 0.0f);
  if (!alive()) return;
  if (button == vbLeftButton) Raise(Click);
}

void ListView::ClickColumn(ColumnHeader& column) {
  Touch();
  Raise(ColumnClick, column);
}

bool ListView::StartLabelEdit(ListItem& item) {
  Touch();
  int cancel = 0;
  Raise(BeforeLabelEdit, cancel);
  if (cancel != 0) return false;
  editing_ = &item;
  Changed("LabelEdit");
  return true;
}

bool ListView::EndLabelEdit(std::string text) {
  Touch();
  ListItem* item = editing_;
  editing_ = nullptr;
  if (!item) return false;
  int cancel = 0;
  Raise(AfterLabelEdit, cancel, text);
  Changed("LabelEdit");
  if (cancel != 0) return false;
  item->SetText(std::move(text));
  return true;
}

void ListView::KeyAction(int keyCode, int shift) {
  Touch();
  if (items_.Count() == 0) return;
  int32_t at = selected_ ? selected_->Index() : 0;
  if (keyCode == vbKeyDown) at = std::min(at + 1, items_.Count());
  else if (keyCode == vbKeyUp) at = std::max(at - 1, 1);
  else if (keyCode == vbKeyHome) at = 1;
  else if (keyCode == vbKeyEnd) at = items_.Count();
  else return;
  ListItem& item = items_(at);
  item.SetSelected(true);
  item.EnsureVisible();
  Raise(ItemClick, item);
}

vb::Variant ListView::Get(const std::string& name) { return GetProperty(Properties(), *this, name); }
void ListView::Let(const std::string& name, const vb::Variant& value) {
  LetProperty(Properties(), *this, name, value);
}

}  // namespace forms
