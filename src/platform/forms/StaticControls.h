#pragma once
// Controls that only show something: labels, frames, pictures and image lists.

#include <string>
#include <vector>

#include "platform/forms/Control.h"

namespace forms {

class Label : public Control {
 public:
  using Control::Control;

  const std::string& Caption() const;
  void SetCaption(std::string caption);
  int Alignment() const;
  void SetAlignment(int alignment);

  // A label's Change comes when its Caption changes.
  Event<> Change;

  vb::Variant Get(const std::string& name) override;
  void Let(const std::string& name, const vb::Variant& value) override;

 protected:
  void ResetState() override { state_ = {}; }
  void ApplyCaption(const std::string& caption) override { state_.caption = caption; }

 private:
  struct State {
    std::string caption;
    int alignment = vbLeftJustify;
  } state_;
};

class Frame : public Control {
 public:
  using Control::Control;

  const std::string& Caption() const;
  void SetCaption(std::string caption);

  vb::Variant Get(const std::string& name) override;
  void Let(const std::string& name, const vb::Variant& value) override;

 protected:
  void ResetState() override { caption_.clear(); }
  void ApplyCaption(const std::string& caption) override { caption_ = caption; }

 private:
  std::string caption_;
};

// An image list holds pictures by 1-based index and by key; a picture is known by
// its name (a resource the renderer draws).
class ImageList : public Control {
 public:
  using Control::Control;

  int32_t Count() const;
  // The picture at a 1-based index; error 35600 out of bounds.
  const std::string& Picture(int32_t index) const;
  // The picture with a key; error 35601 when there is none.
  const std::string& Picture(const std::string& key) const;
  void Add(std::string key, std::string picture);

 protected:
  void ResetState() override { images_.clear(); }
  void ApplyItems(const std::vector<ItemDesign>& items) override;

 private:
  struct Image {
    std::string key;
    std::string picture;
  };
  std::vector<Image> images_;
};

class Image : public Control {
 public:
  using Control::Control;

  const std::string& Picture() const;
  void SetPicture(std::string picture);

  vb::Variant Get(const std::string& name) override;
  void Let(const std::string& name, const vb::Variant& value) override;

 protected:
  void ResetState() override { picture_.clear(); }
  void ApplyCaption(const std::string& caption) override { picture_ = caption; }

 private:
  std::string picture_;
};

}  // namespace forms
