#include "qt/Colors.h"

#include <QAbstractScrollArea>
#include <QApplication>
#include <QWidget>

#include "platform/forms/Constants.h"

namespace dvqt {

namespace {

// The palette role standing for each system colour index (COLOR_BTNFACE and friends).
QPalette::ColorRole SystemRole(uint32_t index) {
  switch (index) {
    case 0x05: return QPalette::Base;             // window background
    case 0x06: return QPalette::Shadow;           // window frame
    case 0x07: return QPalette::WindowText;       // menu text
    case 0x08: return QPalette::Text;             // window text
    case 0x0D: return QPalette::Highlight;
    case 0x0E: return QPalette::HighlightedText;
    case 0x10: return QPalette::Mid;              // button shadow
    case 0x11: return QPalette::PlaceholderText;  // grey text
    case 0x12: return QPalette::ButtonText;
    case 0x14: return QPalette::Light;            // 3-D highlight
    case 0x15: return QPalette::Dark;             // 3-D dark shadow
    case 0x17: return QPalette::ToolTipText;
    case 0x18: return QPalette::ToolTipBase;
    default: return QPalette::Button;  // button face, menus, the desktop: the grey face
  }
}

bool IsInputField(const QWidget& widget) {
  return widget.backgroundRole() == QPalette::Base ||
         dynamic_cast<const QAbstractScrollArea*>(&widget) != nullptr;
}

}  // namespace

QColor ColorOf(int32_t color, const QPalette& palette) {
  auto bits = static_cast<uint32_t>(color);
  if (bits & 0x80000000U) return palette.color(QPalette::Active, SystemRole(bits & 0xFFU));
  return QColor(static_cast<int>(bits & 0xFFU), static_cast<int>((bits >> 8) & 0xFFU),
                static_cast<int>((bits >> 16) & 0xFFU));
}

void ApplyBackColor(QWidget& widget, int32_t color) {
  const QPalette& base = QApplication::palette(&widget);
  QColor shade = ColorOf(color, base);
  QPalette palette = widget.palette();
  if (IsInputField(widget)) {
    // A disabled field keeps the face the model gives it; Qt only greys its text.
    for (auto group : {QPalette::Active, QPalette::Inactive, QPalette::Disabled})
      palette.setColor(group, QPalette::Base, shade);
    widget.setPalette(palette);
    return;
  }
  for (auto group : {QPalette::Active, QPalette::Inactive, QPalette::Disabled}) {
    palette.setColor(group, QPalette::Window, shade);
    palette.setColor(group, QPalette::Button, shade);
  }
  widget.setPalette(palette);
  // The button face is the form's own background: only another colour needs filling.
  widget.setAutoFillBackground(color != forms::vbButtonFace);
}

}  // namespace dvqt
