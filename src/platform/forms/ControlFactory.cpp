#include "platform/forms/ControlFactory.h"

#include "platform/forms/Buttons.h"
#include "platform/forms/DTPicker.h"
#include "platform/forms/ListControls.h"
#include "platform/forms/ListView.h"
#include "platform/forms/Menu.h"
#include "platform/forms/ProgressBar.h"
#include "platform/forms/StaticControls.h"
#include "platform/forms/TextBox.h"
#include "platform/forms/Toolbar.h"
#include "platform/forms/TreeView.h"

namespace forms {

const char* TypeName(ControlType type) {
  switch (type) {
    case ControlType::TextBox: return "TextBox";
    case ControlType::Label: return "Label";
    case ControlType::ComboBox: return "ComboBox";
    case ControlType::ListBox: return "ListBox";
    case ControlType::CheckBox: return "CheckBox";
    case ControlType::OptionButton: return "OptionButton";
    case ControlType::CommandButton: return "CommandButton";
    case ControlType::DTPicker: return "DTPicker";
    case ControlType::Frame: return "Frame";
    case ControlType::Image: return "Image";
    case ControlType::ImageList: return "ImageList";
    case ControlType::ProgressBar: return "ProgressBar";
    case ControlType::Toolbar: return "Toolbar";
    case ControlType::ListView: return "ListView";
    case ControlType::TreeView: return "TreeView";
    case ControlType::Menu: return "Menu";
  }
  return "Control";
}

std::shared_ptr<Control> CreateControl(Form& form, const ControlDesign& design) {
  switch (design.type) {
    case ControlType::TextBox: return std::make_shared<TextBox>(form, design);
    case ControlType::Label: return std::make_shared<Label>(form, design);
    case ControlType::ComboBox: return std::make_shared<ComboBox>(form, design);
    case ControlType::ListBox: return std::make_shared<ListBox>(form, design);
    case ControlType::CheckBox: return std::make_shared<CheckBox>(form, design);
    case ControlType::OptionButton: return std::make_shared<OptionButton>(form, design);
    case ControlType::CommandButton: return std::make_shared<CommandButton>(form, design);
    case ControlType::DTPicker: return std::make_shared<DTPicker>(form, design);
    case ControlType::Frame: return std::make_shared<Frame>(form, design);
    case ControlType::Image: return std::make_shared<Image>(form, design);
    case ControlType::ImageList: return std::make_shared<ImageList>(form, design);
    case ControlType::ProgressBar: return std::make_shared<ProgressBar>(form, design);
    case ControlType::Toolbar: return std::make_shared<Toolbar>(form, design);
    case ControlType::ListView: return std::make_shared<ListView>(form, design);
    case ControlType::TreeView: return std::make_shared<TreeView>(form, design);
    case ControlType::Menu: return std::make_shared<Menu>(form, design);
  }
  throw std::logic_error("unknown control type for " + design.name);
}

}  // namespace forms
