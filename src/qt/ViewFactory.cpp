#include "qt/ViewFactory.h"

#include "platform/forms/Forms.h"
#include "qt/ButtonViews.h"
#include "qt/DatePickerView.h"
#include "qt/ListBoxViews.h"
#include "qt/NodeTreeView.h"
#include "qt/ReportView.h"
#include "qt/StaticViews.h"
#include "qt/TextBoxView.h"
#include "qt/ToolbarView.h"

namespace dvqt {

std::unique_ptr<ControlView> CreateView(FormWindow& window, forms::Control& control) {
  using forms::ControlType;
  switch (control.Type()) {
    case ControlType::TextBox:
      return std::make_unique<TextBoxView>(window, static_cast<forms::TextBox&>(control));
    case ControlType::Label:
      return std::make_unique<LabelView>(window, static_cast<forms::Label&>(control));
    case ControlType::ComboBox:
      return std::make_unique<ComboBoxView>(window, static_cast<forms::ComboBox&>(control));
    case ControlType::ListBox:
      return std::make_unique<ListBoxView>(window, static_cast<forms::ListBox&>(control));
    case ControlType::CheckBox:
      return std::make_unique<CheckBoxView>(window, static_cast<forms::CheckBox&>(control));
    case ControlType::OptionButton:
      return std::make_unique<OptionButtonView>(window, static_cast<forms::OptionButton&>(control));
    case ControlType::CommandButton:
      return std::make_unique<CommandButtonView>(window, static_cast<forms::CommandButton&>(control));
    case ControlType::DTPicker:
      return std::make_unique<DatePickerView>(window, static_cast<forms::DTPicker&>(control));
    case ControlType::Frame:
      return std::make_unique<FrameView>(window, static_cast<forms::Frame&>(control));
    case ControlType::Image:
      return std::make_unique<ImageView>(window, static_cast<forms::Image&>(control));
    case ControlType::ProgressBar:
      return std::make_unique<ProgressBarView>(window, static_cast<forms::ProgressBar&>(control));
    case ControlType::Toolbar:
      return std::make_unique<ToolbarView>(window, static_cast<forms::Toolbar&>(control));
    case ControlType::ListView:
      return std::make_unique<ReportView>(window, static_cast<forms::ListView&>(control));
    case ControlType::TreeView:
      return std::make_unique<NodeTreeView>(window, static_cast<forms::TreeView&>(control));
    case ControlType::ImageList:
    case ControlType::Menu:
      return nullptr;
  }
  return nullptr;
}

}  // namespace dvqt
