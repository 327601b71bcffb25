// PortSelection: the comm ports that can be chosen, and the opening of the chosen one.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <string>
#include <utility>
#include <vector>

#include "platform/message_boxes.h"
#include "serial/hw_serial.h"

namespace tendril {

// The window's comm port list asks it what to list, and tells it what was chosen.
class PortSelection {
 public:
  // Both must outlive it.
  PortSelection(HwSerial& link, MessageBoxes& boxes);

  // Looks for ports 1 to 25 and returns the lines of the list: "Select", then "Comm n" for each that exists.
  std::vector<std::string> ListCommPorts();

  // Who is told when a port is about to be opened.
  void SetOpeningHandler(std::function<void()> handler) { opening_ = std::move(handler); }

  // Opens the port of line `entry` at once. Line 0, "Select", leaves the port as it is. Shows a failure.
  void Choose(std::size_t entry);

 private:
  void ReportPortOpenError(std::int32_t number, const std::string& description);

  HwSerial& link_;
  MessageBoxes& boxes_;
  std::function<void()> opening_;
  std::vector<std::int16_t> port_table_;  // the port number of each line; 0 for "Select"
};

}  // namespace tendril
