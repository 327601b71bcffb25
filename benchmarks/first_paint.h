// FirstPaint: ends a program once its window has been painted.
#pragma once

#include <QApplication>
#include <QEvent>
#include <cstdio>
#include <cstdlib>

#include "measuring.h"

namespace tendril {

// Prints the resident memory in MiB once the window, or what covers it, has been painted, and ends the process.
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
          std::printf("%f\n", ResidentBytes() / (1024 * 1024));
          std::fflush(stdout);
          std::_Exit(EXIT_SUCCESS);
        },
        Qt::QueuedConnection);
    return false;
  }
};

}  // namespace tendril
