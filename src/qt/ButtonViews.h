#pragma once
// Command buttons, check boxes and option buttons. A click is the model's: the widget
// is pressed down while the mouse is, and the model decides what the click changes
// (the check box's value, which option is chosen); Space reaches the model as a key.

#include <QCheckBox>
#include <QPushButton>
#include <QRadioButton>

#include "platform/forms/Buttons.h"
#include "qt/ControlView.h"

namespace dvqt {

class ButtonLikeView : public ControlView {
 public:
  ButtonLikeView(FormWindow& window, forms::Control& control, QAbstractButton* button);

 protected:
  bool OnMousePress(QMouseEvent& event, QWidget& target) override;
  bool OnMouseRelease(QMouseEvent& event, QWidget& target) override;
  QAbstractButton* button() const { return button_; }

 private:
  QAbstractButton* button_;
};

class CommandButtonView : public ButtonLikeView {
 public:
  CommandButtonView(FormWindow& window, forms::CommandButton& button);

 protected:
  bool SyncOwn(std::string_view property) override;
  void SyncOwnAll() override;

 private:
  forms::CommandButton& model_;
  QPushButton* push_;
};

class CheckBoxView : public ButtonLikeView {
 public:
  CheckBoxView(FormWindow& window, forms::CheckBox& box);

 protected:
  bool SyncOwn(std::string_view property) override;
  void SyncOwnAll() override;

 private:
  forms::CheckBox& model_;
  QCheckBox* check_;
};

class OptionButtonView : public ButtonLikeView {
 public:
  OptionButtonView(FormWindow& window, forms::OptionButton& option);

 protected:
  bool SyncOwn(std::string_view property) override;
  void SyncOwnAll() override;

 private:
  forms::OptionButton& model_;
  QRadioButton* radio_;
};

}  // namespace dvqt
