#pragma once
// Twips to pixels and back. Designs are drawn in twips, 1440 to the logical inch, so a
// window keeps its proportions on any screen: the pixels follow the screen's logical
// dots per inch.

#include <QPoint>
#include <QRect>
#include <QSize>
#include <cstdint>

namespace dvqt {

class TwipsScale {
 public:
  // Logical dots per inch of the screen, across and down.
  explicit TwipsScale(double dpiX = 96.0, double dpiY = 96.0);
  // The scale of the primary screen (96 dpi when there is none).
  static TwipsScale OfPrimaryScreen();

  double DpiX() const { return dpiX_; }
  double DpiY() const { return dpiY_; }

  int X(int32_t twips) const;
  int Y(int32_t twips) const;
  int32_t TwipsX(int pixels) const;
  int32_t TwipsY(int pixels) const;
  QRect Rect(int32_t left, int32_t top, int32_t width, int32_t height) const;
  QSize Size(int32_t width, int32_t height) const { return {X(width), Y(height)}; }

 private:
  double dpiX_;
  double dpiY_;
};

}  // namespace dvqt
