#include "qt/ButtonViews.h"

#include <QMouseEvent>

#include "platform/forms/KeyboardUser.h"
#include "qt/FormWindow.h"
#include "qt/QtText.h"

namespace dvqt {

ButtonLikeView::ButtonLikeView(FormWindow& window, forms::Control& control,
                               QAbstractButton* button)
    : ControlView(window, control, button), button_(button) {
  // A mnemonic (Alt+letter) clicks through Qt's shortcut; the model takes it from there
  // as the click of a person, focus first.
  QObject::connect(button_, &QAbstractButton::clicked, this, [this] {
    Input([this] { forms::KeyboardUser(form()).Click(this->control()); });
    Sync("Value");
  });
}

bool ButtonLikeView::OnMousePress(QMouseEvent& event, QWidget& target) {
  bool consumed = ControlView::OnMousePress(event, target);
  if (event.button() == Qt::LeftButton && this->window().Live() && button_->isEnabled())
    button_->setDown(true);
  return consumed;
}

bool ButtonLikeView::OnMouseRelease(QMouseEvent& event, QWidget& target) {
  if (event.button() == Qt::LeftButton) button_->setDown(false);
  return ControlView::OnMouseRelease(event, target);
}

CommandButtonView::CommandButtonView(FormWindow& window, forms::CommandButton& button)
    : ButtonLikeView(window, button, new QPushButton(window.client())), model_(button),
      push_(static_cast<QPushButton*>(widget())) {
  // Enter is the form's (Form::KeyStroke), not the button box's.
  push_->setAutoDefault(false);
}

bool CommandButtonView::SyncOwn(std::string_view property) {
  if (property == "Caption") push_->setText(ToQ(model_.Caption()));
  else if (property == "Default") push_->setDefault(model_.Default());
  else return false;
  return true;
}

void CommandButtonView::SyncOwnAll() {
  push_->setText(ToQ(model_.Caption()));
  push_->setDefault(model_.Default());
}

CheckBoxView::CheckBoxView(FormWindow& window, forms::CheckBox& box)
    : ButtonLikeView(window, box, new QCheckBox(window.client())), model_(box),
      check_(static_cast<QCheckBox*>(widget())) {}

bool CheckBoxView::SyncOwn(std::string_view property) {
  if (property == "Caption") {
    check_->setText(ToQ(model_.Caption()));
  } else if (property == "Value") {
    QSignalBlocker blocker(check_);
    check_->setTristate(model_.Value() == forms::vbGrayed);
    check_->setCheckState(model_.Value() == forms::vbChecked  ? Qt::Checked
                          : model_.Value() == forms::vbGrayed ? Qt::PartiallyChecked
                                                              : Qt::Unchecked);
  } else {
    return false;
  }
  return true;
}

void CheckBoxView::SyncOwnAll() {
  SyncOwn("Caption");
  SyncOwn("Value");
}

OptionButtonView::OptionButtonView(FormWindow& window, forms::OptionButton& option)
    : ButtonLikeView(window, option, new QRadioButton(window.client())), model_(option),
      radio_(static_cast<QRadioButton*>(widget())) {
  // Which option of a container is chosen is the model's business.
  radio_->setAutoExclusive(false);
}

bool OptionButtonView::SyncOwn(std::string_view property) {
  if (property == "Caption") {
    radio_->setText(ToQ(model_.Caption()));
  } else if (property == "Value") {
    QSignalBlocker blocker(radio_);
    radio_->setChecked(model_.Value());
  } else {
    return false;
  }
  return true;
}

void OptionButtonView::SyncOwnAll() {
  SyncOwn("Caption");
  SyncOwn("Value");
}

}  // namespace dvqt
