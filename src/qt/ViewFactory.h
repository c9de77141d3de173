#pragma once
// The view of each kind of control.

#include <memory>

namespace forms {
class Control;
}

namespace dvqt {

class ControlView;
class FormWindow;

// Null for controls that have no widget of their own (image lists, menus).
std::unique_ptr<ControlView> CreateView(FormWindow& window, forms::Control& control);

}  // namespace dvqt
