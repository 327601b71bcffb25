// PortSelection: the comm ports that can be chosen, and the opening of the chosen one.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <string>
#include <utility>
#include <vector>

#include "platform/message_boxes.h"
#include "platform/runtime_error.h"
#include "serial/hw_serial.h"
#include "unitops/control_panel.h"
#include "unitops/port_facts.h"

namespace tendril {

// The model of the window's comm port list.
class PortSelection {
 public:
  // All must outlive it.
  PortSelection(HwSerial& link, MessageBoxes& boxes, ControlPanel& control_panel);
  ~PortSelection();

  // Looks for ports 1 to 25 and returns the lines of the list: "Select", then "Comm n" for each that exists.
  std::vector<std::string> ListCommPorts();
  // The same while line `selected` is selected: that line is there in any case, and `selected` becomes its place. Opens
  // and closes nothing.
  std::vector<std::string> RereadCommPorts(std::size_t& selected);
  // Which device the port of line `entry` is: what its maker calls it, and its path. Empty for "Select".
  std::string DescribePort(std::size_t entry) const;

  // `handler` is called when devices may have come or gone, at most once a second.
  void WatchPorts(const std::function<void()>& handler) { link_.WatchComPorts(handler); }
  // `handler` is called when Facts() may have changed.
  void SetChangedHandler(std::function<void()> handler) { changed_ = std::move(handler); }
  // `handler` is called when a port is about to be opened.
  void SetOpeningHandler(std::function<void()> handler) { opening_ = std::move(handler); }

  // Opens the port of line `entry` at once. Line 0, "Select", leaves the port as it is. Shows a failure; a port
  // that the Control Panel holds can be asked for.
  void Choose(std::size_t entry);
  // The link has opened or closed its port, for whatever reason.
  void OnPort(bool open);

  PortFacts Facts() const;

 private:
  std::vector<std::string> ReadCommPorts(std::int16_t always);
  void ReportPortOpenError(const RuntimeError& fault);
  void KeepWhyNotOpen(const RuntimeError& fault, bool control_panel);
  void Changed() const;

  HwSerial& link_;
  MessageBoxes& boxes_;
  ControlPanel& control_panel_;
  std::function<void()> opening_;
  std::function<void()> changed_;
  std::vector<std::int16_t> port_table_;  // the port number of each line; 0 for "Select"
  PortFacts kept_;                        // what neither the link nor the Control Panel knows
  bool choosing_ = false;                 // the link may close one port to open another
};

}  // namespace tendril
