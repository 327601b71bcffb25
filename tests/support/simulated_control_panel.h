// SimulatedControlPanel: the show's Control Panel beside a SimulatedWorld, and the program's end of it.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "bench/virtual_control_panel.h"
#include "bench/virtual_tcp_socket.h"
#include "platform/memory_registry.h"
#include "platform/process_list.h"
#include "prefs/registry.h"
#include "support/simulated_world.h"
#include "unitops/control_panel.h"

namespace tendril::test {

struct SimulatedProcesses final : public ProcessList {
  bool IsRunning(std::string_view program) const override { return program == running; }
  std::string running;
};

// A Control Panel that runs, listens at 8837, the port that the preferences name by default, and holds no port
// of the bench until it is given one.
struct SimulatedControlPanel {
  explicit SimulatedControlPanel(SimulatedWorld& simulated) : world(simulated) {
    processes.running = "NyxTray.exe";
    panel.SetPortHandler([this](std::uint8_t port, bool held) { world.bench.SetHeldByAnother(port, held); });
  }

  // Lets the panel have port `number`, and hold it.
  void Take(std::uint8_t number) {
    panel.AddPort(number);
    world.bench.SetHeldByAnother(number, true);
  }
  // The comm port control requests that the panel has had, "3:0" for one that asks for port 3 and "3:1" for one
  // that gives it back.
  std::vector<std::string> PortRequests() const {
    std::vector<std::string> requests;
    for (const PanelRequest& request : panel.requests()) {
      if (request.identifier != 'C') continue;
      requests.push_back(std::to_string(request.payload.at(0)) + ":" + std::to_string(request.payload.at(1)));
    }
    return requests;
  }

  SimulatedWorld& world;
  VirtualControlPanel panel{world.time};
  VirtualTcpSocket wsCLI{panel, 8837, world.time};
  MemoryRegistry store;
  Registry registry{store, [](const std::string& /*warning*/) {}};
  SimulatedProcesses processes;
  ControlPanel control_panel{world.time, world.boxes, wsCLI, registry, processes};
};

}  // namespace tendril::test
