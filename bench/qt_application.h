// Qt's application object, one for all benchmarks of the process: they run in any order, and Qt allows no second one.
#pragma once

#include <QApplication>

// Makes it, without a display, when it is needed first. It is never ended.
inline void StartQt() {
  if (QCoreApplication::instance() != nullptr) return;
  static char name[] = "qxbench", option[] = "-platform", platform[] = "offscreen";
  static char* arguments[] = {name, option, platform, nullptr};
  static int count = 3;
  new QApplication(count, arguments);
}
