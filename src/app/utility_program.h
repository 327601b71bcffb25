// UtilityProgram: tendril-utility, put together.
#pragma once

#include <memory>

#include "app/qt_platform.h"
#include "platform/process_list.h"
#include "platform/qt/qt_serial_device.h"
#include "platform/qt/qt_tcp_socket.h"
#include "platform/registry_store.h"
#include "prefs/registry.h"
#include "serial/command_log.h"
#include "serial/hw_serial.h"
#include "ui/frm_new_servo_config.h"
#include "unitops/control_panel.h"

namespace tendril {

// The parts of the program on this computer's adapters, handed to each other. A QApplication must exist; the window is not shown
// yet. For support, QT_LOGGING_RULES=tendril.serial.debug=true prints what the serial link does; network
// preferences that cannot be read are a warning of tendril.preferences.
struct UtilityProgram {
  UtilityProgram();

  QtPlatform platform;
  std::unique_ptr<SerialDevice> device;
  FileCommandLog log;
  HwSerial Serial1;
  QtTcpSocket wsCLI;
  std::unique_ptr<RegistryStore> registry_store;
  Registry registry;
  std::unique_ptr<ProcessList> processes;
  ControlPanel control_panel;
  frmNewServoConfig window;
};

}  // namespace tendril
