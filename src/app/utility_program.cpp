#include "app/utility_program.h"

#include <QLoggingCategory>
#include <string>

#include "app/version.h"
#include "platform/posix/paths.h"

namespace tendril {
namespace {

Q_LOGGING_CATEGORY(serial_trace, "tendril.serial", QtInfoMsg)

void Trace(const std::string& line) { qCDebug(serial_trace, "%s", line.c_str()); }

}  // namespace

UtilityProgram::UtilityProgram()
    : device(platform.on_fault, Trace),
      log(CommandLogPath()),
      Serial1(device, platform.timers, platform.clock, log),
      window(Serial1, platform.timers, platform.boxes, kVersion) {
  Serial1.SetTraceSink(Trace);
  Serial1.SetTraceOutput(serial_trace().isDebugEnabled());
  platform.boxes.SetParent(&window);
}

}  // namespace tendril
