// UtilityProgram: tendril-utility, put together.
#pragma once

#include "app/qt_platform.h"
#include "platform/qt/qt_serial_device.h"
#include "serial/command_log.h"
#include "serial/hw_serial.h"
#include "ui/frm_new_servo_config.h"

namespace tendril {

// The parts on this computer's real adapters, handed to each other. A QApplication must exist; the window is not shown
// yet. For support, QT_LOGGING_RULES=tendril.serial.debug=true prints what the serial link does.
struct UtilityProgram {
  UtilityProgram();

  QtPlatform platform;
  QtSerialDevice device;
  FileCommandLog log;
  HwSerial Serial1;
  frmNewServoConfig window;
};

}  // namespace tendril
