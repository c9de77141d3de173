// Twips, key codes and colours: the translations every view relies on.

#include <gtest/gtest.h>

#include <QKeyEvent>
#include <QPalette>

#include "platform/forms/Constants.h"
#include "qt/Colors.h"
#include "qt/Keys.h"
#include "qt/QtText.h"
#include "qt/Twips.h"

namespace dvqt {
namespace {

TEST(TwipsScale, RoundsEdgesSoThatNeighboursStayEdgeToEdge) {
  TwipsScale scale(96, 120);
  EXPECT_EQ(scale.X(1440), 96);
  EXPECT_EQ(scale.Y(1440), 120);
  // At 96 dpi 15 twips are a pixel; 100 twips are 6.67.
  QRect left = scale.Rect(0, 0, 100, 100), right = scale.Rect(100, 0, 100, 100);
  EXPECT_EQ(left.right() + 1, right.left());
  EXPECT_EQ(scale.TwipsX(96), 1440);
  EXPECT_EQ(TwipsScale(0, -1).X(1440), 96);  // no screen: the usual 96 dpi
}

Keystroke Translate(int key, Qt::KeyboardModifiers modifiers, const QString& text) {
  QKeyEvent event(QEvent::KeyPress, key, modifiers, text);
  auto stroke = TranslateKey(event);
  return stroke.value_or(Keystroke{-1, -1, -1});
}

TEST(TranslateKey, GivesWindowsKeyCodesAndTheCharacterTyped) {
  Keystroke a = Translate(Qt::Key_A, Qt::NoModifier, QStringLiteral("a"));
  EXPECT_EQ(a.keyCode, 'A');
  EXPECT_EQ(a.character, 'a');
  Keystroke plus = Translate(Qt::Key_Plus, Qt::KeypadModifier, QStringLiteral("+"));
  EXPECT_EQ(plus.keyCode, forms::vbKeyAdd);
  EXPECT_EQ(plus.character, '+');
  Keystroke seven = Translate(Qt::Key_7, Qt::KeypadModifier, QStringLiteral("7"));
  EXPECT_EQ(seven.keyCode, 103);
  Keystroke copy = Translate(Qt::Key_C, Qt::ControlModifier, QStringLiteral("\x03"));
  EXPECT_EQ(copy.keyCode, 'C');
  EXPECT_EQ(copy.shift, forms::vbCtrlMask);
  EXPECT_EQ(copy.character, 0);
  Keystroke enter = Translate(Qt::Key_Enter, Qt::KeypadModifier, QStringLiteral("\r"));
  EXPECT_EQ(enter.keyCode, forms::vbKeyReturn);
  EXPECT_EQ(enter.character, 13);
  Keystroke del = Translate(Qt::Key_Delete, Qt::NoModifier, QStringLiteral("\x7f"));
  EXPECT_EQ(del.keyCode, forms::vbKeyDelete);
  EXPECT_EQ(del.character, 0);
  Keystroke backtab = Translate(Qt::Key_Backtab, Qt::ShiftModifier, QString());
  EXPECT_EQ(backtab.keyCode, forms::vbKeyTab);
  EXPECT_EQ(backtab.shift, forms::vbShiftMask);
  // A letter no key code names (ç on a Portuguese keyboard) still types.
  Keystroke cedilla = Translate(Qt::Key_Ccedilla, Qt::NoModifier, QStringLiteral("ç"));
  EXPECT_EQ(cedilla.keyCode, forms::vbKeyProcessKey);
  EXPECT_EQ(cedilla.character, 0xE7);
  EXPECT_EQ(Translate(Qt::Key_VolumeUp, Qt::NoModifier, QString()).keyCode, -1);
}

TEST(ColorOf, MapsSystemColoursToThePaletteAndPlainOnesFromBgr) {
  QPalette palette;
  palette.setColor(QPalette::Active, QPalette::Button, QColor(1, 2, 3));
  palette.setColor(QPalette::Active, QPalette::Base, QColor(4, 5, 6));
  EXPECT_EQ(ColorOf(forms::vbButtonFace, palette), QColor(1, 2, 3));
  EXPECT_EQ(ColorOf(forms::vbWindowBackground, palette), QColor(4, 5, 6));
  EXPECT_EQ(ColorOf(0x00C08040, palette), QColor(0x40, 0x80, 0xC0));
}

TEST(Utf16Index, NeverSplitsASurrogatePair) {
  QString text = QString::fromUtf8("a\xF0\x9F\x98\x80" "b");  // a, an emoji, b
  EXPECT_EQ(Utf16Index(text, 2), 3);
  EXPECT_EQ(CodePointIndex(text, 3), 2);
  EXPECT_EQ(Utf16Index(text, 10), text.size());
}

}  // namespace
}  // namespace dvqt
