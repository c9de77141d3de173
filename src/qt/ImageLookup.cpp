#include "qt/ImageLookup.h"

#include "platform/forms/Form.h"
#include "platform/forms/StaticControls.h"
#include "qt/Icons.h"

namespace dvqt {

QIcon ImageOfForm(const forms::Form& form, int index) {
  if (index <= 0) return {};
  for (const auto& control : form.Controls()) {
    auto* images = dynamic_cast<forms::ImageList*>(control.get());
    if (images && index <= images->Count()) return PictureIcon(images->Picture(index));
  }
  return {};
}

}  // namespace dvqt
