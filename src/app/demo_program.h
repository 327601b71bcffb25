// DemoProgram: the utility's window on a virtual bench inside the process.
#pragma once

#include <QTemporaryDir>
#include <memory>

#include "app/demo_bench.h"
#include "app/qt_platform.h"
#include "bench/virtual_tcp_socket.h"
#include "platform/memory_registry.h"
#include "prefs/registry.h"
#include "serial/command_log.h"
#include "serial/hw_serial.h"
#include "ui/frm_new_servo_config.h"
#include "unitops/control_panel.h"

namespace tendril {

// The parts of the program on that bench, handed to each other. A QApplication must exist; the window is not shown yet.
struct DemoProgram {
  DemoProgram();

  QTemporaryDir scratch;  // holds the command log: a demonstration leaves nothing behind
  QtPlatform platform;
  DemoBench bench{platform.clock, platform.timers};
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
