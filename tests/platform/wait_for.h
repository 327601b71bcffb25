// Waiting in tests, with the event loop running.
#pragma once

#include <QCoreApplication>
#include <QDeadlineTimer>
#include <QTimer>
#include <functional>

namespace tendril::test {

// Runs the event loop until `done` holds; false after `limit_ms`.
inline bool WaitFor(const std::function<bool()>& done, int limit_ms = 10'000) {
  const QDeadlineTimer deadline(limit_ms);
  QTimer look_again;  // `done` may depend on more than events
  look_again.start(1);
  while (!done()) {
    if (deadline.hasExpired()) return false;
    QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
  }
  return true;
}

// Runs the event loop for `ms`, to show that nothing happens.
inline void RunFor(int ms) {
  WaitFor([] { return false; }, ms);
}

}  // namespace tendril::test
