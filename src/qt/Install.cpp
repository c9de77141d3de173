// The entry points forms::LoadGraphicalDesktop finds with dlsym: the library is loaded
// at run time, so these are plain C functions.

#include <QApplication>
#include <memory>

#include "qt/Guard.h"
#include "qt/QtDesktop.h"

namespace {

// The desktop this library installed, when it did.
dvqt::QtDesktop*& InstalledHere() {
  static dvqt::QtDesktop* desktop = nullptr;
  return desktop;
}

}  // namespace

extern "C" __attribute__((visibility("default"))) forms::Desktop* dv_qt_install_desktop() {
  forms::Desktop* result = nullptr;
  dvqt::Guarded([&] {
    if (!QApplication::instance()) {
      // A host without Qt of its own: the application object lives as long as the
      // process, as Qt wants one per process.
      static int argc = 1;
      static char name[] = "dorvantos";
      static char* argv[] = {name, nullptr};
      new QApplication(argc, argv);
    }
    if (!qobject_cast<QApplication*>(QCoreApplication::instance())) return;  // a console host's core app
    auto desktop = std::make_shared<dvqt::QtDesktop>();
    InstalledHere() = desktop.get();
    forms::Desktop::Install(desktop);
    result = desktop.get();
  }, "installing the Qt desktop");
  return result;
}

extern "C" __attribute__((visibility("default"))) int dv_qt_run_while_forms_show() {
  dvqt::QtDesktop* desktop = InstalledHere();
  if (!desktop || forms::Desktop::Installed().get() != desktop) return 0;
  bool ran = dvqt::Guarded([&] { desktop->RunWhileFormsShow(); }, "running the event loop");
  return ran ? 1 : 0;
}
