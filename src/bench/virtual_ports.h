// VirtualPorts: serial ports inside the program, each with a virtual line behind it.
#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <utility>
#include <vector>

#include "bench/virtual_line.h"
#include "platform/clock.h"
#include "platform/serial_device.h"
#include "platform/timer.h"

namespace tendril {

// The ports and what stands behind them. The lines move by the clock and the timers that are handed in, in
// the program's real time or in a test's. Nothing runs while the lines are silent. A port number that was not
// added raises std::out_of_range.
class VirtualPorts {
 public:
  // Both must outlive the ports.
  VirtualPorts(Clock& clock, TimerFactory& timers);
  // The devices must be gone by then.
  ~VirtualPorts();

  // Makes port `number` (1 or more) exist, with a line of its own.
  VirtualLine& AddPort(std::int32_t number, const VirtualLineOptions& options = {});
  VirtualLine& Line(std::int32_t number);

  // Puts a unit on the line of a port, as in Attach<MuteUnit>(1, 0x05).
  template <typename Unit, typename... Args>
  Unit& Attach(std::int32_t number, Args&&... args) {
    auto unit = std::make_unique<Unit>(std::forward<Args>(args)...);
    Unit& attached = *unit;
    Attach(number, std::move(unit));
    return attached;
  }
  void Attach(std::int32_t number, std::unique_ptr<LineUnit> unit);
  // Takes a unit off its line and destroys it.
  void Detach(std::int32_t number, LineUnit& unit);

  // Whether another program holds the port, and which; an opening then fails with kErrPortAlreadyOpen.
  void SetHeldByAnother(std::int32_t number, bool held, const PortHolder& holder = {});
  // Whether this user may open the port; else an opening fails with kErrNotAllowed.
  void SetAllowed(std::int32_t number, bool allowed);
  // Pulls the adapter out. A device that has the port open closes itself as soon as the event loop runs.
  void Unplug(std::int32_t number);
  void Replug(std::int32_t number);

  // A device that can open any of the ports.
  std::unique_ptr<SerialDevice> CreateDevice();

 private:
  class Alarm;
  class Device;
  struct Port;

  Port& At(std::int32_t number);
  std::uint64_t NowUs();
  void NoticeChange();
  void ReportChange();
  void Pump();
  void Schedule();

  Clock& clock_;
  std::uint32_t last_ms_;
  std::uint64_t elapsed_ms_ = 0;  // does not wrap
  std::map<std::int32_t, std::unique_ptr<Port>> ports_;
  std::vector<Device*> devices_;
  std::unique_ptr<Alarm> alarm_;
  std::unique_ptr<Timer> change_timer_;  // enabled while a change of the ports is not reported yet
};

}  // namespace tendril
