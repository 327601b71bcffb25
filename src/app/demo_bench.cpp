#include "app/demo_bench.h"

namespace tendril {
namespace {

// Enough pads for the program to release the line in time even when its window has just been painted.
constexpr ReplyTiming kPatient{.turn_round_us = 2000, .pads = 45};

VirtualUnit& AttachUnit(VirtualPorts& ports, std::int32_t port, std::uint8_t id) {
  return ports.Attach<VirtualUnit>(port, id, kPatient);
}

VirtualPorts& AddPorts(VirtualPorts& ports) {
  for (const std::int32_t port : {1, 2, 3, 4}) ports.AddPort(port);
  return ports;
}

}  // namespace

DemoBench::DemoBench(Clock& clock, TimerFactory& timers)
    : ports(clock, timers),
      panel(timers),
      unit_01(AttachUnit(AddPorts(ports), 1, 0x01)),
      unit_0a(AttachUnit(ports, 1, 0x0A)) {
  AttachUnit(ports, 2, 0xFF);
  AttachUnit(ports, kDemoPanelPort, 0x01);
  panel.AddPort(kDemoPanelPort);
  ports.SetHeldByAnother(kDemoPanelPort, true);
  panel.SetPortHandler([this](std::uint8_t port, bool held) { ports.SetHeldByAnother(port, held); });
  // The units on Comm 1 are set up differently from what the window starts with.
  for (int port = 1; port <= kUnitPorts; ++port) {
    unit_01.SetPortOptions(port, {1, 80, 220, 125, 175, 125, 175, 150, 150});
    const auto by = [port](int width) { return static_cast<std::uint8_t>(width + 2 * port); };
    unit_0a.SetPortOptions(port, {1, 60, 240, by(80), by(170), by(90), by(160), by(120), by(130)});
  }
}

}  // namespace tendril
