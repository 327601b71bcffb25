// The program up to its first painted window, put together as its main function does.
#include <QApplication>
#include <QLoggingCategory>
#include <string>

#include "app/qt_platform.h"
#include "first_paint.h"
#include "platform/posix/paths.h"
#include "platform/qt/qt_serial_device.h"
#include "serial/command_log.h"
#include "serial/hw_serial.h"
#include "ui/frm_new_servo_config.h"

Q_LOGGING_CATEGORY(serial_trace, "tendril.serial", QtInfoMsg)

int main(int argc, char** argv) {
  using namespace tendril;
  QApplication application(argc, argv);
  const auto trace = [](const std::string& line) { qCDebug(serial_trace, "%s", line.c_str()); };
  QtPlatform platform;
  QtSerialDevice device(platform.on_fault, trace);
  FileCommandLog log(CommandLogPath());
  HwSerial link(device, platform.timers, platform.clock, log);
  link.SetTraceSink(trace);
  link.SetTraceOutput(serial_trace().isDebugEnabled());
  frmNewServoConfig window(link, platform.timers, platform.boxes, {1, 0, 0});
  platform.boxes.SetParent(&window);
  window.resize(1280, 800);  // on any screen
  const FirstPaint first_paint;
  window.show();
  return QApplication::exec();
}
