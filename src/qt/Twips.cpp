#include "qt/Twips.h"

#include <QGuiApplication>
#include <QScreen>
#include <cmath>

namespace dvqt {

namespace {
constexpr double kTwipsPerInch = 1440.0;
}

TwipsScale::TwipsScale(double dpiX, double dpiY)
    : dpiX_(dpiX > 0 ? dpiX : 96.0), dpiY_(dpiY > 0 ? dpiY : 96.0) {}

TwipsScale TwipsScale::OfPrimaryScreen() {
  if (QScreen* screen = QGuiApplication::primaryScreen())
    return TwipsScale(screen->logicalDotsPerInchX(), screen->logicalDotsPerInchY());
  return TwipsScale();
}

int TwipsScale::X(int32_t twips) const {
  return static_cast<int>(std::lround(twips * dpiX_ / kTwipsPerInch));
}

int TwipsScale::Y(int32_t twips) const {
  return static_cast<int>(std::lround(twips * dpiY_ / kTwipsPerInch));
}

int32_t TwipsScale::TwipsX(int pixels) const {
  return static_cast<int32_t>(std::lround(pixels * kTwipsPerInch / dpiX_));
}

int32_t TwipsScale::TwipsY(int pixels) const {
  return static_cast<int32_t>(std::lround(pixels * kTwipsPerInch / dpiY_));
}

QRect TwipsScale::Rect(int32_t left, int32_t top, int32_t width, int32_t height) const {
  // Both edges are rounded, not the size, so that controls designed edge to edge
  // stay edge to edge.
  int x = X(left), y = Y(top);
  return QRect(x, y, X(left + width) - x, Y(top + height) - y);
}

}  // namespace dvqt
