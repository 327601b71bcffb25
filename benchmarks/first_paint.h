// FirstPaint: ends a program once its window has been painted.
#pragma once

#include <unistd.h>

#include <QApplication>
#include <QEvent>
#include <cstdio>
#include <cstdlib>
#include <fstream>

namespace tendril {

// Resident memory of this process in KiB.
inline long ResidentKib() {
  long pages = 0;
  long resident = 0;
  std::ifstream("/proc/self/statm") >> pages >> resident;
  return resident * (sysconf(_SC_PAGESIZE) / 1024);
}

// Prints the resident memory once the window, or what covers it, has been painted, and ends the process.
class FirstPaint : public QObject {
 public:
  FirstPaint() { qApp->installEventFilter(this); }

  bool eventFilter(QObject* /*watched*/, QEvent* event) override {
    if (event->type() != QEvent::Paint) return false;
    qApp->removeEventFilter(this);
    // Queued, so that all of the window is painted by then.
    QMetaObject::invokeMethod(
        qApp,
        [] {
          std::printf("%ld\n", ResidentKib());
          std::fflush(stdout);
          std::_Exit(EXIT_SUCCESS);
        },
        Qt::QueuedConnection);
    return false;
  }
};

}  // namespace tendril
