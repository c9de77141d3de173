#pragma once
// Lists and trees name their pictures by a 1-based index into the form's image list.

#include <QIcon>

namespace forms {
class Form;
}

namespace dvqt {

// The icon of image `index` of the form's first image list that has it; a null icon
// for 0 or an index no image list has.
QIcon ImageOfForm(const forms::Form& form, int index);

}  // namespace dvqt
