// The component's windows on the offscreen platform: real widgets, no display needed.

#include <gtest/gtest.h>

#include <unistd.h>

#include <QApplication>

// Present only in a sanitized build.
extern "C" void __sanitizer_set_report_fd(void* fd) __attribute__((weak));

int main(int argc, char** argv) {
  // The fixtures capture stderr to look for trapped errors; a sanitizer's report must
  // still reach the terminal.
  if (__sanitizer_set_report_fd) __sanitizer_set_report_fd(reinterpret_cast<void*>(static_cast<intptr_t>(::dup(2))));
  qputenv("QT_QPA_PLATFORM", "offscreen");
  QApplication app(argc, argv);
  ::testing::InitGoogleTest(&argc, argv);
  return RUN_ALL_TESTS();
}

// What the system libraries keep until exit is not ours to report.
extern "C" const char* __lsan_default_suppressions() {
  return "leak:libfontconfig\nleak:libdbus-1\nleak:libQt6Core\nleak:libQt6Gui\n";
}
