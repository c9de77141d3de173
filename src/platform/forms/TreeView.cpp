#include "platform/forms/TreeView.h"

#include <algorithm>
#include <unordered_set>

#include "platform/forms/Form.h"
#include "platform/vb/Error.h"

namespace forms {

// ---- Node ------------------------------------------------------------------------

void Node::Changed(std::string_view property) {
  owner_.ItemChanged(key_.empty() ? std::to_string(index_) : key_, property);
}

void Node::SetText(std::string text) {
  if (text_ == text) return;
  text_ = std::move(text);
  Changed("Text");
}

void Node::SetBold(bool bold) {
  if (bold_ == bold) return;
  bold_ = bold;
  Changed("Bold");
}

void Node::SetImage(int image) {
  if (image_ == image) return;
  image_ = image;
  Changed("Image");
}

void Node::SetSelectedImage(int image) {
  if (selectedImage_ == image) return;
  selectedImage_ = image;
  Changed("SelectedImage");
}

void Node::SetExpanded(bool expanded) {
  if (expanded_ == expanded) return;
  expanded_ = expanded;
  Changed("Expanded");
}

bool Node::Selected() const { return owner_.selected_ == this; }

void Node::SetSelected(bool selected) {
  Node* before = owner_.selected_;
  if (selected == (before == this)) return;
  owner_.selected_ = selected ? this : nullptr;
  if (before && before != this) before->Changed("Selected");
  Changed("Selected");
}

void Node::EnsureVisible() {
  for (Node* ancestor = parent_; ancestor; ancestor = ancestor->parent_)
    ancestor->SetExpanded(true);
  owner_.scrolledTo_ = this;
  Changed("EnsureVisible");
}

// ---- NodeList --------------------------------------------------------------------

Node* NodeList::Find(const std::string& key) const {
  auto found = byKey_.find(key);
  return found == byKey_.end() ? nullptr : found->second;
}

Node& NodeList::operator()(const std::string& key) const {
  if (Node* node = Find(key)) return *node;
  throw vb::Error(vb::kErrElementNotFound, "Element not found");
}

Node& NodeList::operator()(int32_t index) const {
  if (index < 1 || index > Count()) throw vb::Error(35600, "Index out of bounds");
  return *nodes_[static_cast<size_t>(index - 1)];
}

Node& NodeList::Add(const std::string& relative, int relationship, std::string key,
                    std::string text, int image, int selectedImage) {
  if (relationship < tvwFirst || relationship > tvwChild)
    throw vb::Error(vb::kErrInvalidProcedureCall, "Invalid procedure call or argument");
  // Everything is checked before anything changes, so a refused Add leaves the tree as
  // it was and a caller may try another parent.
  Node* anchor = nullptr;
  if (!relative.empty()) {
    anchor = Find(relative);
    if (!anchor) throw vb::Error(vb::kErrElementNotFound, "Element not found");
  }
  if (!key.empty() && byKey_.count(key))
    throw vb::Error(vb::kErrKeyNotUnique, "Key is not unique in collection");

  Node* parent = nullptr;
  size_t position = 0;
  if (!anchor) {
    position = relationship == tvwFirst ? 0 : roots_.size();
  } else if (relationship == tvwChild) {
    parent = anchor;
    position = anchor->children_.size();
  } else {
    parent = anchor->parent_;
    std::vector<Node*>& siblings = SiblingsOf(parent);
    auto at = static_cast<size_t>(std::find(siblings.begin(), siblings.end(), anchor) -
                                  siblings.begin());
    position = relationship == tvwFirst  ? 0
               : relationship == tvwLast ? siblings.size()
               : relationship == tvwNext ? at + 1
                                         : at;
  }

  nodes_.push_back(std::make_unique<Node>(owner_, std::move(key), std::move(text), image,
                                          selectedImage));
  Node& added = *nodes_.back();
  added.index_ = Count();
  added.parent_ = parent;
  std::vector<Node*>& siblings = SiblingsOf(parent);
  siblings.insert(siblings.begin() + static_cast<std::ptrdiff_t>(position), &added);
  if (!added.Key().empty()) byKey_[added.Key()] = &added;
  owner_.Changed("Nodes");
  return added;
}

void NodeList::Remove(const std::string& key) {
  Node& node = (*this)(key);
  std::unordered_set<Node*> doomed;
  std::vector<Node*> pending{&node};
  while (!pending.empty()) {
    Node* next = pending.back();
    pending.pop_back();
    doomed.insert(next);
    pending.insert(pending.end(), next->children_.begin(), next->children_.end());
  }
  std::erase(SiblingsOf(node.parent_), &node);
  for (Node* gone : doomed) {
    if (!gone->Key().empty()) byKey_.erase(gone->Key());
    if (owner_.selected_ == gone) owner_.selected_ = nullptr;
    if (owner_.scrolledTo_ == gone) owner_.scrolledTo_ = nullptr;
    if (owner_.editing_ == gone) owner_.editing_ = nullptr;
  }
  std::erase_if(nodes_, [&](const std::unique_ptr<Node>& n) { return doomed.count(n.get()) > 0; });
  for (size_t i = 0; i < nodes_.size(); ++i) nodes_[i]->index_ = static_cast<int32_t>(i + 1);
  owner_.Changed("Nodes");
}

void NodeList::Clear() {
  nodes_.clear();
  byKey_.clear();
  roots_.clear();
  owner_.selected_ = owner_.scrolledTo_ = owner_.editing_ = nullptr;
  owner_.Changed("Nodes");
}

// ---- TreeView --------------------------------------------------------------------

Node* TreeView::SelectedItem() const { Touch(); return selected_; }
Node* TreeView::ScrolledTo() const { Touch(); return scrolledTo_; }

void TreeView::ClickNode(Node& node, int button, int shift) {
  Touch();
  uint64_t generation = LoadGeneration();
  auto alive = [&] { return LoadGeneration() == generation && Parent().Loaded(); };
  Raise(MouseDown, button, shift, 0.0f, 0.0f);
  if (!alive()) return;
  node.SetSelected(true);
  Raise(NodeClick, node);
  if (!alive()) return;
  Raise(MouseUp, button, shift, 0.0f, 0.0f);
  if (!alive()) return;
  if (button == vbLeftButton) Raise(Click);
}

void TreeView::ToggleNode(Node& node) {
  Touch();
  if (node.Children().empty()) return;
  node.SetExpanded(!node.Expanded());
  if (node.Expanded())
    Raise(Expand, node);
  else
    Raise(Collapse, node);
}

bool TreeView::StartLabelEdit(Node& node) {
  Touch();
  int cancel = 0;
  Raise(BeforeLabelEdit, cancel);
  if (cancel != 0) return false;
  editing_ = &node;
  Changed("LabelEdit");
  return true;
}

bool TreeView::EndLabelEdit(std::string text) {
  Touch();
  Node* node = editing_;
  editing_ = nullptr;
  if (!node) return false;
  int cancel = 0;
  Raise(AfterLabelEdit, cancel, text);
  Changed("LabelEdit");
  if (cancel != 0) return false;
  node->SetText(std::move(text));
  return true;
}

}  // namespace forms
