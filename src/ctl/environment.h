// Environment: the outside world of tendril-ctl.
#pragma once

#include <QByteArray>
#include <QString>
#include <cstdint>
#include <functional>
#include <optional>
#include <utility>

#include "platform/clock.h"
#include "platform/process_list.h"
#include "platform/serial_device.h"
#include "platform/tcp_socket.h"
#include "platform/timer.h"
#include "prefs/registry.h"
#include "serial/command_log.h"

namespace tendril::ctl {

// Runs the event loop for code that waits.
class Waiting {
 public:
  virtual ~Waiting() = default;
  // Returns when `done` holds. It is asked at once and after events.
  virtual void Until(const std::function<bool()>& done) = 0;
};

// The request to end the program early: Ctrl+C and its like.
class StopRequest {
 public:
  // `watch` makes requests reach this object.
  void SetWatch(std::function<void()> watch) { watch_ = std::move(watch); }
  // From now on a command ends in order. Before that the system ends the program, even while it waits for a file.
  void Watch() const {
    if (watch_) watch_();
  }
  // Of a signal with this number. The first one counts. Calls the handler.
  void Make(int signal) {
    if (Made()) return;
    signal_ = signal;
    if (handler_) handler_();
  }
  bool Made() const { return signal_ != 0; }
  // The program's exit code then, as shells have it: 130 after Ctrl+C.
  int ExitCode() const { return 128 + signal_; }
  // `handler` is called from the event loop, once; nullptr for none.
  void SetHandler(std::function<void()> handler) { handler_ = std::move(handler); }

 private:
  int signal_ = 0;
  std::function<void()> watch_;
  std::function<void()> handler_;
};

// Standard output, standard error and standard input. Texts are UTF-8.
class Terminal {
 public:
  virtual ~Terminal() = default;
  // Prints to standard output, and flushes it. Returns why not all of it was written; empty when it was.
  virtual QString Print(const QByteArray& text) = 0;
  // Prints to standard error. A failure has no consequence.
  virtual void PrintError(const QByteArray& text) = 0;
  // The columns of the terminal that shows standard error; 0 when none does.
  virtual int ErrorColumns() const = 0;
  // The columns of the terminal that shows standard output; 0 when none does.
  virtual int OutputColumns() const = 0;
  // Whether standard output may have colours: a terminal shows it, and the user does not object.
  virtual bool Colours() const = 0;
  // Asks on standard error and returns the line that the user types; nothing when there is no terminal to ask on, or
  // when a stop was requested meanwhile.
  virtual std::optional<QString> Ask(const QByteArray& question) = 0;
  // Whether Ask() can ask.
  virtual bool CanAsk() const = 0;
};

// All of it outlives the commands.
struct Environment {
  SerialDevice& device;
  TimerFactory& timers;
  Clock& clock;
  CommandLog& log;
  TcpSocket& socket;  // for the Control Panel
  Registry& registry;
  const ProcessList& processes;
  Waiting& waiting;
  StopRequest& stop;
  Terminal& terminal;
  std::function<std::int64_t()> now_ms;  // since 1970, UTC
};

}  // namespace tendril::ctl
