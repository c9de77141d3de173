#pragma once
// Colours as the model keeps them: a Long holding either a plain colour in BGR order
// (&HBBGGRR) or, with the high bit set, the index of a system colour. System colours
// follow the desktop's palette, so a locked field looks grey on any theme.

#include <QColor>
#include <QPalette>
#include <cstdint>

class QWidget;

namespace dvqt {

QColor ColorOf(int32_t color, const QPalette& palette);
// Paints the widget's background in the colour; input fields colour their text area,
// the others their whole face.
void ApplyBackColor(QWidget& widget, int32_t color);

}  // namespace dvqt
