#pragma once
// The numbers windows code speaks in: key codes as Windows numbers them, shift and
// mouse-button masks, colours, pointers, window states, unload modes, alignments and
// tree relationships, under the names Basic gives them.

#include <cstdint>

namespace forms {

// Key codes (virtual keys).
inline constexpr int vbKeyBack = 8;
inline constexpr int vbKeyTab = 9;
inline constexpr int vbKeyReturn = 13;
inline constexpr int vbKeyShift = 16;
inline constexpr int vbKeyControl = 17;
inline constexpr int vbKeyEscape = 27;
inline constexpr int vbKeySpace = 32;
inline constexpr int vbKeyPageUp = 33;
inline constexpr int vbKeyPageDown = 34;
inline constexpr int vbKeyEnd = 35;
inline constexpr int vbKeyHome = 36;
inline constexpr int vbKeyLeft = 37;
inline constexpr int vbKeyUp = 38;
inline constexpr int vbKeyRight = 39;
inline constexpr int vbKeyDown = 40;
inline constexpr int vbKeyInsert = 45;
inline constexpr int vbKeyDelete = 46;
inline constexpr int vbKeyAdd = 107;  // numeric keypad plus
inline constexpr int vbKeySubtract = 109;
inline constexpr int vbKeyF1 = 112;
inline constexpr int vbKeyF2 = 113;
inline constexpr int vbKeyF3 = 114;
inline constexpr int vbKeyF4 = 115;
inline constexpr int vbKeyF12 = 123;
// What Windows reports for a character that no key of the layout produces by itself
// (composed or entered through an input method).
inline constexpr int vbKeyProcessKey = 229;

// Shift argument of KeyDown and the mouse events.
inline constexpr int vbShiftMask = 1;
inline constexpr int vbCtrlMask = 2;
inline constexpr int vbAltMask = 4;

// Button argument of the mouse events.
inline constexpr int vbLeftButton = 1;
inline constexpr int vbRightButton = 2;
inline constexpr int vbMiddleButton = 4;

// Colours. The system colours carry the high bit, so they are negative as a Long.
inline constexpr int32_t vbButtonFace = static_cast<int32_t>(0x8000000FU);
inline constexpr int32_t vbWindowBackground = static_cast<int32_t>(0x80000005U);
inline constexpr int32_t vbWindowText = static_cast<int32_t>(0x80000008U);
inline constexpr int32_t vbButtonText = static_cast<int32_t>(0x80000012U);
inline constexpr int32_t vbWhite = 0xFFFFFF;
inline constexpr int32_t vbBlack = 0x000000;

// Mouse pointers.
inline constexpr int vbDefault = 0;
inline constexpr int vbArrow = 1;
inline constexpr int vbHourglass = 11;

// Window states.
inline constexpr int vbNormal = 0;
inline constexpr int vbMinimized = 1;
inline constexpr int vbMaximized = 2;

// Show styles.
inline constexpr int vbModeless = 0;
inline constexpr int vbModal = 1;

// Why a form is being unloaded (QueryUnload's UnloadMode).
inline constexpr int vbFormControlMenu = 0;  // the close box or the window menu
inline constexpr int vbFormCode = 1;         // Unload in code
inline constexpr int vbAppWindows = 2;
inline constexpr int vbAppTaskManager = 3;
inline constexpr int vbFormOwner = 5;

// Text alignment of text boxes and labels.
inline constexpr int vbLeftJustify = 0;
inline constexpr int vbRightJustify = 1;
inline constexpr int vbCenter = 2;

// Column alignment of list views.
inline constexpr int lvwColumnLeft = 0;
inline constexpr int lvwColumnRight = 1;
inline constexpr int lvwColumnCenter = 2;

// Check box values.
inline constexpr int vbUnchecked = 0;
inline constexpr int vbChecked = 1;
inline constexpr int vbGrayed = 2;

// Combo box styles.
inline constexpr int vbComboDropDown = 0;
inline constexpr int vbComboSimple = 1;
inline constexpr int vbComboDropDownList = 2;

// Where a tree node goes relative to the node named with it.
inline constexpr int tvwFirst = 0;
inline constexpr int tvwLast = 1;
inline constexpr int tvwNext = 2;
inline constexpr int tvwPrevious = 3;
inline constexpr int tvwChild = 4;

// SetWindowPos.
inline constexpr int32_t HWND_TOP = 0;
inline constexpr int32_t HWND_BOTTOM = 1;
inline constexpr int32_t HWND_TOPMOST = -1;
inline constexpr int32_t HWND_NOTOPMOST = -2;
inline constexpr uint32_t SWP_NOSIZE = 1;
inline constexpr uint32_t SWP_NOMOVE = 2;

// Twips per pixel at the usual 96 dots per inch.
inline constexpr int kTwipsPerPixel = 15;

}  // namespace forms
