#pragma once
// A tree view: Nodes found by key through an index. Nodes.Add places a node relative
// to another (tvwChild, tvwFirst, tvwLast, tvwNext, tvwPrevious); a relative that does
// not exist raises 35601 and a key already in the tree 35602, and the tree is left
// as it was.

#include <cstdint>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "platform/forms/Control.h"
#include "platform/vb/Variant.h"

namespace forms {

class TreeView;

class Node {
 public:
  Node(TreeView& owner, std::string key, std::string text, int image, int selectedImage)
      : owner_(owner), key_(std::move(key)), text_(std::move(text)), image_(image),
        selectedImage_(selectedImage) {}

  const std::string& Key() const { return key_; }
  int32_t Index() const { return index_; }
  const std::string& Text() const { return text_; }
  void SetText(std::string text);
  const vb::Variant& Tag() const { return tag_; }
  void SetTag(vb::Variant tag) { tag_ = std::move(tag); }
  bool Bold() const { return bold_; }
  void SetBold(bool bold);
  int Image() const { return image_; }
  void SetImage(int image);
  int SelectedImage() const { return selectedImage_; }
  void SetSelectedImage(int image);
  bool Expanded() const { return expanded_; }
  void SetExpanded(bool expanded);
  bool Selected() const;
  void SetSelected(bool selected);
  // Expands the node's ancestors and scrolls the tree so that the node shows.
  void EnsureVisible();

  // Null for a top-level node.
  Node* Parent() const { return parent_; }
  const std::vector<Node*>& Children() const { return children_; }
  Node* Child() const { return children_.empty() ? nullptr : children_.front(); }

 private:
  friend class NodeList;
  void Changed(std::string_view property);

  TreeView& owner_;
  std::string key_;
  std::string text_;
  vb::Variant tag_;
  int image_;
  int selectedImage_;
  bool bold_ = false;
  bool expanded_ = false;
  Node* parent_ = nullptr;
  std::vector<Node*> children_;
  int32_t index_ = 0;
};

class NodeList {
 public:
  explicit NodeList(TreeView& owner) : owner_(owner) {}

  // Error 35601 when no node has the key.
  Node& operator()(const std::string& key) const;
  // 1-based, in the order the nodes were added; error 35600 out of bounds.
  Node& operator()(int32_t index) const;
  Node* Find(const std::string& key) const;
  int32_t Count() const { return static_cast<int32_t>(nodes_.size()); }
  // Adds a node. An empty relative adds a top-level node (first with tvwFirst, else
  // last). An empty key gives a node found only by position.
  Node& Add(const std::string& relative, int relationship, std::string key, std::string text,
            int image = 0, int selectedImage = 0);
  Node& Add(std::string key, std::string text, int image = 0, int selectedImage = 0) {
    return Add({}, tvwLast, std::move(key), std::move(text), image, selectedImage);
  }
  // Removes a node with all its descendants.
  void Remove(const std::string& key);
  void Clear();
  const std::vector<Node*>& Roots() const { return roots_; }

 private:
  std::vector<Node*>& SiblingsOf(Node* parent) { return parent ? parent->children_ : roots_; }

  TreeView& owner_;
  std::vector<std::unique_ptr<Node>> nodes_;  // in the order added
  std::unordered_map<std::string, Node*> byKey_;
  std::vector<Node*> roots_;
};

class TreeView : public Control {
 public:
  TreeView(Form& form, ControlDesign design) : Control(form, std::move(design)), nodes_(*this) {}

  NodeList& Nodes() { Touch(); return nodes_; }
  Node* SelectedItem() const;
  // The node last scrolled into view, null before any.
  Node* ScrolledTo() const;
  bool LabelEditing() const { return editing_ != nullptr; }

  Event<Node&> NodeClick;
  Event<Node&> Expand;
  Event<Node&> Collapse;
  Event<int&> BeforeLabelEdit;               // Cancel
  Event<int&, std::string&> AfterLabelEdit;  // Cancel, NewString

  // A person's actions, as the keyboard user and renderers report them.
  void ClickNode(Node& node, int button = vbLeftButton, int shift = 0);
  // Opens or closes a node with its plus sign.
  void ToggleNode(Node& node);
  bool StartLabelEdit(Node& node);
  bool EndLabelEdit(std::string text);

  bool Focusable() const override { return true; }

 protected:
  void ResetState() override { nodes_.Clear(); }
  int32_t DefaultBackColor() const override { return vbWindowBackground; }

 private:
  friend class Node;
  friend class NodeList;
  NodeList nodes_;
  Node* selected_ = nullptr;
  Node* scrolledTo_ = nullptr;
  Node* editing_ = nullptr;
};

}  // namespace forms
