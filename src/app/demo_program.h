// DemoProgram: the utility's window on a virtual bench inside the process.
#pragma once

#include <QTemporaryDir>
#include <memory>

#include "app/qt_platform.h"
#include "bench/virtual_control_panel.h"
#include "bench/virtual_ports.h"
#include "bench/virtual_tcp_socket.h"
#include "bench/virtual_unit.h"
#include "platform/memory_registry.h"
#include "platform/process_list.h"
#include "prefs/registry.h"
#include "serial/command_log.h"
#include "serial/hw_serial.h"
#include "ui/frm_new_servo_config.h"
#include "unitops/control_panel.h"

namespace tendril {

inline constexpr std::uint8_t kDemoPanelPort = 3;

// The Control Panel runs, and no other program does.
struct DemoProcesses final : ProcessList {
  bool IsRunning(std::string_view program) const override { return program == kControlPanelProgram; }
};

// Comm 1 has two working units, at 01 and 0A, and Comm 2 one fresh from the factory. Comm 3 has a working unit and is
// held by the Control Panel until the program asks for it. On Comm 4 no unit answers.
struct DemoBench {
  explicit DemoBench(QtPlatform& platform);

  VirtualPorts ports;
  VirtualControlPanel panel;
  VirtualUnit& unit_01;
  VirtualUnit& unit_0a;
};

// The parts of the program on that bench, handed to each other. A QApplication must exist; the window is not shown yet.
struct DemoProgram {
  DemoProgram();

  QTemporaryDir scratch;  // holds the command log: a demonstration leaves nothing behind
  QtPlatform platform;
  DemoBench bench{platform};
  std::unique_ptr<SerialDevice> device = bench.ports.CreateDevice();
  FileCommandLog log;
  HwSerial Serial1{*device, platform.timers, platform.clock, log};
  VirtualTcpSocket wsCLI;
  MemoryRegistry registry_store;
  Registry registry{registry_store, {}};
  DemoProcesses processes;
  ControlPanel control_panel{platform.timers, platform.boxes, wsCLI, registry, processes};
  frmNewServoConfig window;
};

}  // namespace tendril
