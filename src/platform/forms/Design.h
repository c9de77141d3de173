#pragma once
// A window's design as data: its caption and size and one row per control, written
// as a table apart from the window's handlers. A form applies it every time it loads,
// so an unloaded form comes back as designed.

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "platform/vb/Variant.h"

namespace forms {

enum class ControlType {
  TextBox,
  Label,
  ComboBox,
  ListBox,
  CheckBox,
  OptionButton,
  CommandButton,
  DTPicker,
  Frame,
  Image,
  ImageList,
  ProgressBar,
  Toolbar,
  ListView,
  TreeView,
  Menu,
};

const char* TypeName(ControlType type);

// A part of a control fixed at design time: a toolbar button (key, caption), a list
// view column (key, caption as header text, width, alignment), an image of an image
// list (key, caption as the picture's name).
struct ItemDesign {
  std::string key{};
  std::string caption{};
  int32_t width = 0;
  int alignment = 0;
};

struct ControlDesign {
  std::string name{};
  ControlType type = ControlType::Label;
  int32_t left = 0, top = 0, width = 0, height = 0;  // twips
  // Caption of labels, buttons, frames, check boxes and menus; Text of text boxes.
  std::string caption{};
  // Position in a control array (Label2(0), Label2(1)); -1 for a control on its own.
  int index = -1;
  // The frame the control sits in, or the menu a menu item belongs to.
  std::string container{};
  // Any other design-time property, by its name: {"Locked", true}, {"Style", 2}.
  std::vector<std::pair<std::string, vb::Variant>> properties{};
  std::vector<ItemDesign> items{};
};

struct FormDesign {
  std::string name{};
  std::string caption{};
  int32_t left = 0, top = 0, width = 4800, height = 3600;  // twips
  std::vector<ControlDesign> controls{};
};

}  // namespace forms
