// DemoBench: the virtual bench of the demonstration.
#pragma once

#include <cstdint>
#include <string_view>

#include "bench/virtual_control_panel.h"
#include "bench/virtual_ports.h"
#include "bench/virtual_unit.h"
#include "platform/clock.h"
#include "platform/process_list.h"
#include "platform/timer.h"

namespace tendril {

// Where its Control Panel listens: the default of the network preferences.
inline constexpr std::uint16_t kDemoListenerPort = 8837;

inline constexpr std::uint8_t kDemoPanelPort = 3;

// The Control Panel runs, and no other program does.
struct DemoProcesses final : ProcessList {
  bool IsRunning(std::string_view program) const override { return program == kControlPanelProgram; }
};

// Comm 1 has two working units, at 01 and 0A, and Comm 2 one fresh from the factory. Comm 3 has a working unit and is
// held by the Control Panel until the program asks for it. On Comm 4 no unit answers.
struct DemoBench {
  // Both must outlive it.
  DemoBench(Clock& clock, TimerFactory& timers);

  VirtualPorts ports;
  VirtualControlPanel panel;
  VirtualUnit& unit_01;
  VirtualUnit& unit_0a;
};

}  // namespace tendril
