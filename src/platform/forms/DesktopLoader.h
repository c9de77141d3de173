#pragma once
// Real windows for a host that installed no desktop of its own. The Qt desktop lives in
// its own library, libdv_qt.so beside the forms library, and is loaded only when a
// display is there, so that headless hosts and the component itself never link Qt.

namespace forms {

// Loads libdv_qt.so and installs its desktop when no desktop is installed and a display
// is there (DISPLAY, WAYLAND_DISPLAY or QT_QPA_PLATFORM set). False, with nothing
// changed, when it cannot.
bool LoadGraphicalDesktop();

// Runs the graphical desktop's event loop until no form is on screen: the main loop of
// a host without one. False when no graphical desktop is installed.
bool RunGraphicalDesktop();

}  // namespace forms
