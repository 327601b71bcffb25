// tendril-utility: sets up Tendril units on this computer's serial ports.
#include <QApplication>
#include <QLoggingCategory>
#include <string>

#include "app/qt_platform.h"
#include "app/version.h"
#include "platform/posix/paths.h"
#include "platform/qt/qt_serial_device.h"
#include "serial/command_log.h"
#include "serial/hw_serial.h"
#include "ui/frm_new_servo_config.h"

// For support: QT_LOGGING_RULES=tendril.serial.debug=true prints what the serial link does.
Q_LOGGING_CATEGORY(serial_trace, "tendril.serial", QtInfoMsg)

int main(int argc, char** argv) {
  using namespace tendril;
  QApplication application(argc, argv);

  const auto trace = [](const std::string& line) { qCDebug(serial_trace, "%s", line.c_str()); };
  QtPlatform platform;
  QtSerialDevice device(platform.on_fault, trace);
  FileCommandLog log(CommandLogPath());
  HwSerial Serial1(device, platform.timers, platform.clock, log);
  Serial1.SetTraceSink(trace);
  Serial1.SetTraceOutput(serial_trace().isDebugEnabled());
  frmNewServoConfig window(Serial1, platform.timers, platform.boxes, kVersion);
  platform.boxes.SetParent(&window);
  window.show();
  return QApplication::exec();
}
