// SimulatedWorld: all that the program touches, under the control of a test.
#pragma once

#include <memory>

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

  SimulatedTime time;
  SimulatedBoxes boxes;
  MemoryLog log;
  VirtualPorts bench{time, time};
  std::unique_ptr<SerialDevice> device;
};

}  // namespace tendril::test
