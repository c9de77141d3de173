#include "qt/DatePickerView.h"

#include <QLineEdit>
#include <cmath>

#include "platform/forms/KeyboardUser.h"
#include "qt/FormWindow.h"

namespace dvqt {

namespace {
const QDate kSerialEpoch(1899, 12, 30);
}

QDate ToQDate(vb::Date date) {
  return kSerialEpoch.addDays(static_cast<qint64>(std::floor(date.serial)));
}

vb::Date FromQDate(const QDate& date) {
  return vb::Date{static_cast<double>(kSerialEpoch.daysTo(date))};
}

DatePickerView::DatePickerView(FormWindow& window, forms::DTPicker& picker)
    : ControlView(window, picker, new QDateEdit(window.client())), model_(picker),
      edit_(static_cast<QDateEdit*>(widget())) {
  edit_->setDisplayFormat(QStringLiteral("dd-MM-yyyy"));
  edit_->setCalendarPopup(true);
  edit_->setMinimumDate(QDate(1753, 1, 1));
  edit_->setContextMenuPolicy(Qt::NoContextMenu);
  if (QLineEdit* line = edit_->findChild<QLineEdit*>()) Watch(line);
  QObject::connect(edit_, &QDateEdit::dateChanged, this, [this](QDate date) {
    if (!date.isValid() || ToQDate(model_.Value()) == date) return;
    Input([&] { forms::KeyboardUser(form()).ChooseDate(model_, FromQDate(date)); });
    // The model may have refused the date (a handler put another one back).
    if (this->window().Live()) SyncOwn("Value");
  });
}

bool DatePickerView::SyncOwn(std::string_view property) {
  if (property != "Value") return false;
  QDate date = ToQDate(model_.Value());
  if (edit_->date() != date) {
    QSignalBlocker blocker(edit_);
    edit_->setDate(date);
  }
  return true;
}

void DatePickerView::SyncOwnAll() { SyncOwn("Value"); }

bool DatePickerView::OnKey(QKeyEvent& event) {
  if (auto stroke = TranslateKey(event)) KeyThroughWidget(event, *stroke);
  return true;
}

}  // namespace dvqt
