// QuitOnSignal: the system's request to end the program, delivered by the event loop.
#pragma once

#ifndef _WIN32  // there the system closes the windows instead

#include <QCoreApplication>
#include <QSocketNotifier>

namespace tendril {

// While it lives, Ctrl+C, a closed terminal and the end of the session quit the application as a user does: its
// windows are asked to close first. Ignored signals stay ignored. One at a time; make it after the QCoreApplication.
class QuitOnSignal {
 public:
  // Raises std::system_error when the system has no pipe left.
  QuitOnSignal();
  ~QuitOnSignal();
  QuitOnSignal(const QuitOnSignal&) = delete;
  QuitOnSignal& operator=(const QuitOnSignal&) = delete;

 private:
  QSocketNotifier notifier_;
};

}  // namespace tendril

#endif
