// dv_qt_demo: the demo windows on the Qt desktop. With --quit-after MS it closes itself
// after that many milliseconds (for screenshots under Xvfb); --finder shows the finder
// instead of the entry window.

#include <QApplication>
#include <QTimer>
#include <cstring>
#include <memory>
#include <string>

#include "qt/QtDesktop.h"
#include "qt/demo/DemoForms.h"

int main(int argc, char** argv) {
  QApplication app(argc, argv);
  auto desktop = std::make_shared<dvqt::QtDesktop>();
  forms::Desktop::Install(desktop);

  int quitAfter = 0;
  bool finder = false;
  for (int i = 1; i < argc; ++i) {
    if (std::strcmp(argv[i], "--quit-after") == 0 && i + 1 < argc) quitAfter = std::stoi(argv[++i]);
    if (std::strcmp(argv[i], "--finder") == 0) finder = true;
  }
  if (quitAfter > 0) QTimer::singleShot(quitAfter, &app, [] { std::exit(0); });

  dvqt::demo::frmDemoEntry entry;
  dvqt::demo::frmDemoFinder finderForm;
  if (finder)
    finderForm.Show();
  else
    entry.Show();
  desktop->RunWhileFormsShow();
  forms::Desktop::Install(nullptr);
  return 0;
}

// Under the sanitizers, what the system libraries keep until exit is not ours to report.
extern "C" const char* __lsan_default_suppressions() {
  return "leak:libfontconfig\nleak:libdbus-1\nleak:libQt6Core\nleak:libQt6Gui\nleak:libxcb\nleak:libX11\n";
}
