// LineMonitor: reads what crosses the line, and sends nothing.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>

#include "ctl/environment.h"
#include "platform/serial_device.h"
#include "trace/line_trace.h"
#include "trace/packet_meaning.h"

namespace tendril::ctl {

// The line of an open device cut into packets. What begins with the program's address is a unit's reply, all else with
// the form of a packet some program's command. Bytes without an end are noise, when nothing follows them for a while.
class LineMonitor {
 public:
  using EntryHandler = std::function<void(const TraceEntry&)>;

  // Takes the device's events. The environment must outlive it; its device is open.
  LineMonitor(Environment& environment, EntryHandler on_entry);
  ~LineMonitor();
  LineMonitor(const LineMonitor&) = delete;
  LineMonitor& operator=(const LineMonitor&) = delete;

  // Whether the device was unplugged.
  bool Lost() const { return lost_; }

 private:
  void OnEvent(SerialEvent event);
  void Read();
  // Reports the bytes since the last packet, if there are any.
  void Flush();

  Environment& environment_;
  EntryHandler on_entry_;
  std::unique_ptr<Timer> pause_;  // runs while bytes wait for the rest of their packet
  PacketSplitter bytes_;
  bool lost_ = false;
};

}  // namespace tendril::ctl
