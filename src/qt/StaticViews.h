#pragma once
// Controls that only show something: labels, frames, pictures, progress bars.

#include <QGroupBox>
#include <QLabel>
#include <QProgressBar>

#include "platform/forms/ProgressBar.h"
#include "platform/forms/StaticControls.h"
#include "qt/ControlView.h"

namespace dvqt {

class LabelView : public ControlView {
 public:
  LabelView(FormWindow& window, forms::Label& label);
  // A label's mnemonic hands the focus to the control after it in tab order.
  void SetBuddy(QWidget* buddy) override;

 protected:
  bool SyncOwn(std::string_view property) override;
  void SyncOwnAll() override;

 private:
  forms::Label& model_;
  QLabel* label_;
};

class FrameView : public ControlView {
 public:
  FrameView(FormWindow& window, forms::Frame& frame);

 protected:
  bool SyncOwn(std::string_view property) override;
  void SyncOwnAll() override;

 private:
  forms::Frame& model_;
  QGroupBox* box_;
};

class ImageView : public ControlView {
 public:
  ImageView(FormWindow& window, forms::Image& image);

 protected:
  bool SyncOwn(std::string_view property) override;
  void SyncOwnAll() override;

 private:
  forms::Image& model_;
  QLabel* picture_;
};

class ProgressBarView : public ControlView {
 public:
  ProgressBarView(FormWindow& window, forms::ProgressBar& bar);

 protected:
  bool SyncOwn(std::string_view property) override;
  void SyncOwnAll() override;

 private:
  forms::ProgressBar& model_;
  QProgressBar* bar_;
};

// The text of a caption without its mnemonic marks, for widgets that cannot show one:
// "&&" is a literal ampersand.
QString WithoutMnemonic(const QString& caption);

}  // namespace dvqt
