// Waiting in tests: the event loop runs until something is so.
#pragma once

#include <QCoreApplication>
#include <QDeadlineTimer>
#include <QTimer>
#include <functional>

namespace tendril::test {

// Runs the event loop until `done`; false when that takes longer than `limit_ms`.
inline bool WaitFor(const std::function<bool()>& done, int limit_ms = 10'000) {
  const QDeadlineTimer deadline(limit_ms);
  QTimer look_again;  // not everything that is waited for is an event
  look_again.start(1);
  while (!done()) {
    if (deadline.hasExpired()) return false;
    QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
  }
  return true;
}

// Runs the event loop for a while, to see that something does not happen.
inline void RunFor(int ms) {
  WaitFor([] { return false; }, ms);
}

}  // namespace tendril::test
