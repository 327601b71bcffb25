// QuitOnSignal: the system's request to end the program, delivered by the event loop.
#pragma once

#include <QCoreApplication>
#include <functional>
#include <memory>

namespace tendril {

// While it lives, Ctrl+C, a closed terminal and the end of the session call a handler, by default one that quits the
// application as a user does: its windows are asked to close first. Ignored signals stay ignored. One at a time; make it
// after the QCoreApplication, in the main thread.
class QuitOnSignal {
 public:
  // `handler` gets the signal's number, from the event loop. Windows has the numbers of the other systems: 2 for Ctrl+C
  // and Ctrl+Break, 1 for a closed terminal, 15 for the end of the session. Raises std::system_error when the system has
  // no pipe left.
  explicit QuitOnSignal(std::function<void(int)> handler = [](int) { QCoreApplication::quit(); });
  ~QuitOnSignal();
  QuitOnSignal(const QuitOnSignal&) = delete;
  QuitOnSignal& operator=(const QuitOnSignal&) = delete;

 private:
  class Delivery;

  std::unique_ptr<Delivery> delivery_;
};

}  // namespace tendril
