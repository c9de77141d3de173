#pragma once
// A date picker as a QDateEdit ("dd-MM-yyyy") with its calendar drop-down. The date
// edit changes its date natively, after the model's KeyDown and KeyPress let the key
// through; each date it arrives at is the model's new Value at once.

#include <QDateEdit>

#include "platform/forms/DTPicker.h"
#include "qt/ControlView.h"

namespace dvqt {

class DatePickerView : public ControlView {
 public:
  DatePickerView(FormWindow& window, forms::DTPicker& picker);

 protected:
  bool SyncOwn(std::string_view property) override;
  void SyncOwnAll() override;
  bool OnKey(QKeyEvent& event) override;
  bool NativeMouse() const override { return true; }

 private:
  forms::DTPicker& model_;
  QDateEdit* edit_;
};

// Serial dates (days since 30 December 1899) and calendar days.
QDate ToQDate(vb::Date date);
vb::Date FromQDate(const QDate& date);

}  // namespace dvqt
