// QuitOnSignal: the system's request to end the program, as the event loop hears it.
#pragma once

#ifndef _WIN32  // there the system closes the windows instead

#include <QCoreApplication>
#include <QSocketNotifier>

namespace tendril {

// While it lives, Ctrl+C, a closed terminal and the end of the session quit the application as a person does: its
// windows are asked to close first. What was set to be ignored stays so. One at a time; make it after the
// QCoreApplication.
class QuitOnSignal {
 public:
  // Raises std::system_error when the system has no pipe to give.
  QuitOnSignal();
  ~QuitOnSignal();
  QuitOnSignal(const QuitOnSignal&) = delete;
  QuitOnSignal& operator=(const QuitOnSignal&) = delete;

 private:
  QSocketNotifier notifier_;
};

}  // namespace tendril

#endif
