// PortOpening: opens the port that the command line names.
#pragma once

#include <optional>

#include "ctl/command_line.h"
#include "ctl/environment.h"
#include "ctl/report.h"
#include "serial/hw_serial.h"

namespace tendril::ctl {

class PortOpening {
 public:
  // All must outlive it.
  PortOpening(const CommandLine& line, Environment& environment, HwSerial& link)
      : line_(line), environment_(environment), link_(link) {}

  // Opens the port. Returns the command's report when it cannot be opened.
  std::optional<Report> Open();
  // Closes the port, if it is open.
  void GiveBack();

 private:
  const CommandLine& line_;
  Environment& environment_;
  HwSerial& link_;
};

}  // namespace tendril::ctl
