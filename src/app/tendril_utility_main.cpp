// tendril-utility: sets up Tendril units on this computer's serial ports.
#include <QApplication>

#include "app/qt_platform.h"
#include "app/version.h"
#include "platform/posix/paths.h"
#include "platform/qt/qt_serial_device.h"
#include "serial/command_log.h"
#include "serial/hw_serial.h"
#include "ui/frm_new_servo_config.h"

int main(int argc, char** argv) {
  using namespace tendril;
  QApplication application(argc, argv);

  QtPlatform platform;
  QtSerialDevice device(platform.on_fault);
  FileCommandLog log(CommandLogPath());
  HwSerial Serial1(device, platform.timers, platform.clock, log);
  frmNewServoConfig window(Serial1, platform.timers, platform.boxes, kVersion);
  platform.boxes.SetParent(&window);
  window.show();
  return QApplication::exec();
}
