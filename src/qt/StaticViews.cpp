#include "qt/StaticViews.h"

#include <algorithm>
#include <cmath>

#include "qt/FormWindow.h"
#include "qt/Icons.h"
#include "qt/QtText.h"

namespace dvqt {

QString WithoutMnemonic(const QString& caption) {
  QString plain;
  plain.reserve(caption.size());
  for (qsizetype i = 0; i < caption.size(); ++i) {
    if (caption.at(i) == QLatin1Char('&') && i + 1 < caption.size()) ++i;
    plain.append(caption.at(i));
  }
  return plain;
}

namespace {

Qt::Alignment LabelAlignment(int alignment) {
  // Windows labels write from their top line down.
  switch (alignment) {
    case forms::vbRightJustify: return Qt::AlignRight | Qt::AlignTop;
    case forms::vbCenter: return Qt::AlignHCenter | Qt::AlignTop;
    default: return Qt::AlignLeft | Qt::AlignTop;
  }
}

}  // namespace

// ---- Label -------------------------------------------------------------------------

LabelView::LabelView(FormWindow& window, forms::Label& label)
    : ControlView(window, label, new QLabel(window.client())), model_(label),
      label_(static_cast<QLabel*>(widget())) {
  label_->setWordWrap(true);
  label_->setTextFormat(Qt::PlainText);
}

void LabelView::SetBuddy(QWidget* buddy) {
  label_->setBuddy(buddy);
  SyncOwn("Caption");
}

bool LabelView::SyncOwn(std::string_view property) {
  if (property == "Caption") {
    // Qt draws the mnemonic only for a label with a buddy; without one the marks must
    // not show as ampersands.
    QString caption = ToQ(model_.Caption());
    label_->setText(label_->buddy() ? caption : WithoutMnemonic(caption));
  } else if (property == "Alignment") {
    label_->setAlignment(LabelAlignment(model_.Alignment()));
  } else {
    return false;
  }
  return true;
}

void LabelView::SyncOwnAll() {
  SyncOwn("Caption");
  SyncOwn("Alignment");
}

// ---- Frame -------------------------------------------------------------------------

FrameView::FrameView(FormWindow& window, forms::Frame& frame)
    : ControlView(window, frame, new QGroupBox(window.client())), model_(frame),
      box_(static_cast<QGroupBox*>(widget())) {}

bool FrameView::SyncOwn(std::string_view property) {
  if (property != "Caption") return false;
  box_->setTitle(ToQ(model_.Caption()));
  return true;
}

void FrameView::SyncOwnAll() { SyncOwn("Caption"); }

// ---- Image -------------------------------------------------------------------------

ImageView::ImageView(FormWindow& window, forms::Image& image)
    : ControlView(window, image, new QLabel(window.client())), model_(image),
      picture_(static_cast<QLabel*>(widget())) {
  picture_->setAlignment(Qt::AlignLeft | Qt::AlignTop);
}

bool ImageView::SyncOwn(std::string_view property) {
  if (property != "Picture" && property != "Width" && property != "Height") return false;
  QIcon icon = PictureIcon(model_.Picture());
  int side = std::max(1, std::min(scale().X(model_.Width()), scale().Y(model_.Height())));
  picture_->setPixmap(icon.isNull() ? QPixmap() : icon.pixmap(side, side));
  return true;
}

void ImageView::SyncOwnAll() { SyncOwn("Picture"); }

// ---- ProgressBar -------------------------------------------------------------------

namespace {
constexpr int kProgressSteps = 1000;
}

ProgressBarView::ProgressBarView(FormWindow& window, forms::ProgressBar& bar)
    : ControlView(window, bar, new QProgressBar(window.client())), model_(bar),
      bar_(static_cast<QProgressBar*>(widget())) {
  // Min and Max are any doubles: the bar shows the fraction done.
  bar_->setRange(0, kProgressSteps);
  bar_->setTextVisible(false);
}

bool ProgressBarView::SyncOwn(std::string_view property) {
  if (property != "Value" && property != "Min" && property != "Max") return false;
  double span = model_.Max() - model_.Min();
  double done = span > 0 ? (model_.Value() - model_.Min()) / span : 0.0;
  bar_->setValue(static_cast<int>(std::lround(std::clamp(done, 0.0, 1.0) * kProgressSteps)));
  return true;
}

void ProgressBarView::SyncOwnAll() { SyncOwn("Value"); }

}  // namespace dvqt
