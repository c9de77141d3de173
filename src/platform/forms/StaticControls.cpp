#include "platform/forms/StaticControls.h"

#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace forms {

namespace {

const PropertyTable<Label>& LabelProperties() {
  static const PropertyTable<Label> table = {
      {"caption",
       {[](Label& c) { return vb::Variant(c.Caption()); },
        [](Label& c, const vb::Variant& v) { c.SetCaption(vb::CStr(v)); }}},
      {"alignment",
       {[](Label& c) { return vb::Variant(int32_t{c.Alignment()}); },
        [](Label& c, const vb::Variant& v) { c.SetAlignment(vb::CLng(v)); }}},
  };
  return table;
}

const PropertyTable<Frame>& FrameProperties() {
  static const PropertyTable<Frame> table = {
      {"caption",
       {[](Frame& c) { return vb::Variant(c.Caption()); },
        [](Frame& c, const vb::Variant& v) { c.SetCaption(vb::CStr(v)); }}},
  };
  return table;
}

const PropertyTable<Image>& ImageProperties() {
  static const PropertyTable<Image> table = {
      {"picture",
       {[](Image& c) { return vb::Variant(c.Picture()); },
        [](Image& c, const vb::Variant& v) { c.SetPicture(vb::CStr(v)); }}},
  };
  return table;
}

}  // namespace

const std::string& Label::Caption() const { Touch(); return state_.caption; }
void Label::SetCaption(std::string caption) {
  Touch();
  if (state_.caption == caption) return;
  state_.caption = std::move(caption);
  Changed("Caption");
  Raise(Change);
}

int Label::Alignment() const { Touch(); return state_.alignment; }
void Label::SetAlignment(int alignment) {
  Touch();
  if (alignment < vbLeftJustify || alignment > vbCenter)
    throw vb::Error(380, "Invalid property value");
  if (state_.alignment == alignment) return;
  state_.alignment = alignment;
  Changed("Alignment");
}

vb::Variant Label::Get(const std::string& name) { return GetProperty(LabelProperties(), *this, name); }
void Label::Let(const std::string& name, const vb::Variant& value) {
  LetProperty(LabelProperties(), *this, name, value);
}

const std::string& Frame::Caption() const { Touch(); return caption_; }
void Frame::SetCaption(std::string caption) {
  Touch();
  if (caption_ == caption) return;
  caption_ = std::move(caption);
  Changed("Caption");
}

vb::Variant Frame::Get(const std::string& name) { return GetProperty(FrameProperties(), *this, name); }
void Frame::Let(const std::string& name, const vb::Variant& value) {
  LetProperty(FrameProperties(), *this, name, value);
}

int32_t ImageList::Count() const { Touch(); return static_cast<int32_t>(images_.size()); }

const std::string& ImageList::Picture(int32_t index) const {
  Touch();
  if (index < 1 || index > static_cast<int32_t>(images_.size()))
    throw vb::Error(35600, "Index out of bounds");
  return images_[static_cast<size_t>(index - 1)].picture;
}

const std::string& ImageList::Picture(const std::string& key) const {
  Touch();
  // An image list holds a handful of pictures; a scan is all it needs.
  for (const Image& image : images_)
    if (image.key == key) return image.picture;
  throw vb::Error(vb::kErrElementNotFound, "Element not found");
}

void ImageList::Add(std::string key, std::string picture) {
  Touch();
  images_.push_back({std::move(key), std::move(picture)});
  Changed("ListImages");
}

void ImageList::ApplyItems(const std::vector<ItemDesign>& items) {
  for (const ItemDesign& item : items) images_.push_back({item.key, item.caption});
}

const std::string& Image::Picture() const { Touch(); return picture_; }
void Image::SetPicture(std::string picture) {
  Touch();
  if (picture_ == picture) return;
  picture_ = std::move(picture);
  Changed("Picture");
}

vb::Variant Image::Get(const std::string& name) { return GetProperty(ImageProperties(), *this, name); }
void Image::Let(const std::string& name, const vb::Variant& value) {
  LetProperty(ImageProperties(), *this, name, value);
}

}  // namespace forms
