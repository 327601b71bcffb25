// SimulatedWorld: all that the program touches, under the control of a test.
#pragma once

#include <memory>
#include <string>
#include <utility>

#include "bench/faulty_units.h"
#include "bench/virtual_ports.h"
#include "bench/virtual_unit.h"
#include "platform/serial_device.h"
#include "support/memory_log.h"
#include "support/simulated_boxes.h"
#include "support/simulated_time.h"

namespace tendril::test {

// Time, message boxes, the command log and a virtual bench. Comm 1 to 4 exist; their lines have no units
// until a test attaches some.
struct SimulatedWorld {
  explicit SimulatedWorld(std::uint32_t start_ms = 1000) : time(start_ms) {
    for (const int port : {1, 2, 3, 4}) bench.AddPort(port);
    device = bench.CreateDevice();
  }

  // Puts the unit called `fault` on the line of Comm 1; an empty name is a well-behaved one.
  VirtualUnit& Attach(const std::string& fault, std::uint8_t id) {
    auto unit = fault.empty() ? std::make_unique<VirtualUnit>(id) : FindFaultKind(fault)->make(id);
    VirtualUnit& attached = *unit;
    bench.Attach(1, std::move(unit));
    return attached;
  }

  SimulatedTime time;
  SimulatedBoxes boxes;
  MemoryLog log;
  VirtualPorts bench{time, time};
  std::unique_ptr<SerialDevice> device;
};

}  // namespace tendril::test
