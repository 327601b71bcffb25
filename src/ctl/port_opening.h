// PortOpening: opens the port that the command line names, and closes it at the end.
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>

#include "ctl/borrowed_port.h"
#include "ctl/command_line.h"
#include "ctl/environment.h"
#include "ctl/report.h"
#include "ctl/unit_session.h"
#include "platform/runtime_error.h"

namespace tendril::ctl {

// With --take-port, a port that the Control Panel holds is borrowed. Without it the Control Panel is never contacted.
class PortOpening {
 public:
  // All must outlive it.
  PortOpening(const CommandLine& line, Environment& environment, UnitSession& units);

  // Opens the port for the session. Returns the command's report when it cannot be opened.
  std::optional<Report> Open();
  // Opens the port with RTS cleared, for a command that reads from the environment's device and leaves the line to
  // others. Returns the same.
  std::optional<Report> OpenToListen();
  // The port's number; 0 before it is opened.
  std::int16_t Number() const { return number_; }
  // Closes the port, if it is open, and gives it back, if it is borrowed. Returns why that is not done: a sentence; empty
  // otherwise.
  QString GiveBack();

 private:
  // Opens port `number_`. Raises what the device raises.
  using Opener = std::function<void()>;

  std::optional<Report> OpenBy(const Opener& open);
  std::optional<Report> Choose();
  std::optional<Report> Borrow(const Opener& open);
  std::optional<RuntimeError> Try(const Opener& open);
  std::string Sentence(const RuntimeError& fault);
  std::string InUse();

  const CommandLine& line_;
  Environment& environment_;
  UnitSession& units_;
  BorrowedPort borrowed_;
  std::int16_t number_ = 0;
};

}  // namespace tendril::ctl
