// QuitOnSignal: the system's request to end the program, delivered by the event loop.
#pragma once

#ifndef _WIN32  // there the system closes the windows instead

#include <QCoreApplication>
#include <QSocketNotifier>
#include <functional>

namespace tendril {

// While it lives, Ctrl+C, a closed terminal and the end of the session call a handler, by default one that quits the
// application as a user does: its windows are asked to close first. Ignored signals stay ignored. One at a time; make it
// after the QCoreApplication.
class QuitOnSignal {
 public:
  // `handler` gets the signal's number, from the event loop. Raises std::system_error when the system has no pipe left.
  explicit QuitOnSignal(std::function<void(int)> handler = [](int) { QCoreApplication::quit(); });
  ~QuitOnSignal();
  QuitOnSignal(const QuitOnSignal&) = delete;
  QuitOnSignal& operator=(const QuitOnSignal&) = delete;

 private:
  QSocketNotifier notifier_;
};

}  // namespace tendril

#endif
