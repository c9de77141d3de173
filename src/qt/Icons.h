#pragma once
// Pictures for toolbar buttons (by the button's key) and for image lists (by the
// picture's name): the desktop's icon theme when it has one, else a small drawing of
// our own, so a window never shows an empty button.

#include <QIcon>
#include <string>

namespace dvqt {

QIcon ToolbarIcon(const std::string& key, const std::string& caption);
QIcon PictureIcon(const std::string& name);

}  // namespace dvqt
