#pragma once
// A list view in report view: ColumnHeaderList (text, width, alignment) and ListItemList,
// each found by key through an index (ListItemList("#12")), with its text, sub-items
// (one per column after the first), small icon and selection. Label editing starts
// with BeforeLabelEdit, whose Cancel refuses it.

#include <cstdint>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "platform/forms/Control.h"

namespace forms {

class ListView;

class ColumnHeader {
 public:
  ColumnHeader(ListView& owner, std::string key, std::string text, int32_t width, int alignment)
      : owner_(owner), key_(std::move(key)), text_(std::move(text)), width_(width),
        alignment_(alignment) {}

  const std::string& Key() const { return key_; }
  int32_t Index() const { return index_; }
  const std::string& Text() const { return text_; }
  void SetText(std::string text);
  int32_t Width() const { return width_; }
  void SetWidth(int32_t width);
  int Alignment() const { return alignment_; }
  void SetAlignment(int alignment);

 private:
  friend class ColumnHeaderList;
  void Changed(std::string_view property);

  ListView& owner_;
  std::string key_;
  std::string text_;
  int32_t width_;
  int alignment_;
  int32_t index_ = 0;
};

class ColumnHeaderList {
 public:
  explicit ColumnHeaderList(ListView& owner) : owner_(owner) {}

  // 1-based; error 35600 out of bounds.
  ColumnHeader& operator()(int32_t index) const;
  // Error 35601 when no column has the key.
  ColumnHeader& operator()(const std::string& key) const;
  int32_t Count() const { return static_cast<int32_t>(columns_.size()); }
  ColumnHeader& Add(std::string key, std::string text, int32_t width = 1440,
                    int alignment = lvwColumnLeft);
  void Clear();

 private:
  ListView& owner_;
  std::vector<std::unique_ptr<ColumnHeader>> columns_;
  std::unordered_map<std::string, ColumnHeader*> byKey_;
};

class ListItem {
 public:
  ListItem(ListView& owner, std::string key, std::string text, int smallIcon)
      : owner_(owner), key_(std::move(key)), text_(std::move(text)), smallIcon_(smallIcon) {}

  const std::string& Key() const { return key_; }
  // 1-based position in the list.
  int32_t Index() const { return index_; }
  const std::string& Text() const { return text_; }
  void SetText(std::string text);
  // Sub-item i (1-based) is the text of column i + 1. Reading one never written gives
  // ""; an index without a column raises 380.
  const std::string& SubItems(int32_t index) const;
  void SetSubItems(int32_t index, std::string text);
  int SmallIcon() const { return smallIcon_; }
  void SetSmallIcon(int icon);
  bool Selected() const { return selected_; }
  // Selecting an item of a single-selection list deselects the one selected before.
  void SetSelected(bool selected);
  // Scrolls the list so that the item shows.
  void EnsureVisible();
  const std::string& Tag() const { return tag_; }
  void SetTag(std::string tag) { tag_ = std::move(tag); }

 private:
  friend class ListItemList;
  friend class ListView;
  void Changed(std::string_view property);

  ListView& owner_;
  std::string key_;
  std::string text_;
  std::vector<std::string> subItems_;
  int smallIcon_;
  bool selected_ = false;
  int32_t index_ = 0;
  std::string tag_;
};

class ListItemList {
 public:
  explicit ListItemList(ListView& owner) : owner_(owner) {}

  // Error 35601 when no item has the key.
  ListItem& operator()(const std::string& key) const;
  // 1-based; error 35600 out of bounds.
  ListItem& operator()(int32_t index) const;
  ListItem* Find(const std::string& key) const;
  int32_t Count() const { return static_cast<int32_t>(items_.size()); }
  // Adds an item at the end, or at a 1-based index. A key already used raises 35602.
  ListItem& Add(int32_t index, std::string key, std::string text, int smallIcon = 0);
  ListItem& Add(std::string key, std::string text, int smallIcon = 0) {
    return Add(-1, std::move(key), std::move(text), smallIcon);
  }
  void Remove(const std::string& key);
  void Remove(int32_t index);
  void Clear();

 private:
  friend class ListView;
  void Renumber(size_t from);
  void EraseAt(size_t position);

  ListView& owner_;
  std::vector<std::unique_ptr<ListItem>> items_;
  std::unordered_map<std::string, ListItem*> byKey_;
};

class ListView : public Control {
 public:
  ListView(Form& form, ControlDesign design)
      : Control(form, std::move(design)), columns_(*this), items_(*this) {}

  ColumnHeaderList& ColumnHeaders() { Touch(); return columns_; }
  ListItemList& ListItems() { Touch(); return items_; }

  ListItem* SelectedItem() const;
  bool MultiSelect() const;
  void SetMultiSelect(bool multi);
  // The item last scrolled into view, null before any.
  ListItem* ScrolledTo() const;
  // Sorting by a column's text: SortKey 0 is the item text, k the sub-item k.
  bool Sorted() const;
  void SetSorted(bool sorted);
  int SortKey() const;
  void SetSortKey(int key);
  int SortOrder() const;  // 0 ascending, 1 descending
  void SetSortOrder(int order);
  bool LabelEditing() const { return editing_ != nullptr; }

  Event<ListItem&> ItemClick;
  Event<ColumnHeader&> ColumnClick;
  Event<int&> BeforeLabelEdit;                // Cancel
  Event<int&, std::string&> AfterLabelEdit;   // Cancel, NewString

  // A person's actions on the list, as the keyboard user and renderers report them.
  // Clicking an item selects it and raises ItemClick; the mouse events come around it.
  void ClickItem(ListItem& item, int button = vbLeftButton, int shift = 0);
  void ClickColumn(ColumnHeader& column);
  // Starts editing an item's text: false when BeforeLabelEdit cancelled.
  bool StartLabelEdit(ListItem& item);
  // Ends an edit with the text typed: false when AfterLabelEdit cancelled it.
  bool EndLabelEdit(std::string text);

  vb::Variant Get(const std::string& name) override;
  void Let(const std::string& name, const vb::Variant& value) override;
  bool Focusable() const override { return true; }
  void KeyAction(int keyCode, int shift) override;

 protected:
  void ResetState() override;
  int32_t DefaultBackColor() const override { return vbWindowBackground; }
  void ApplyItems(const std::vector<ItemDesign>& items) override;

 private:
  friend class ListItem;
  friend class ListItemList;
  friend class ColumnHeader;
  friend class ColumnHeaderList;
  void ItemSelected(ListItem& item, bool selected);
  void Resort();
  bool Before(const ListItem& a, const ListItem& b) const;
  size_t SortedPosition(const ListItem& item) const;

  ColumnHeaderList columns_;
  ListItemList items_;
  ListItem* selected_ = nullptr;
  ListItem* scrolledTo_ = nullptr;
  ListItem* editing_ = nullptr;
  bool multiSelect_ = false;
  bool sorted_ = false;
  int sortKey_ = 0;
  int sortOrder_ = 0;
};

}  // namespace forms
