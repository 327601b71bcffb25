#include "app/utility_program.h"

#include <QLoggingCategory>
#include <string>

#include "app/version.h"
#include "platform/paths.h"
#include "platform/qt/path_text.h"
#include "platform/system_processes.h"
#include "platform/system_registry.h"

namespace tendril {
namespace {

Q_LOGGING_CATEGORY(serial_trace, "tendril.serial", QtInfoMsg)
Q_LOGGING_CATEGORY(preferences, "tendril.preferences")

void Trace(const std::string& line) { qCDebug(serial_trace, "%s", line.c_str()); }

void Warn(const std::string& line) { qCWarning(preferences, "%s", line.c_str()); }

}  // namespace

UtilityProgram::UtilityProgram()
    : device(std::make_unique<QtSerialDevice>(platform.on_fault, Trace)),
      log(CommandLogPath()),
      Serial1(*device, platform.timers, platform.clock, log),
      wsCLI(platform.on_fault),
      registry_store(OpenSystemRegistry(Warn)),
      registry(*registry_store, Warn),
      processes(OpenProcessList()),
      control_panel(platform.inexact_timers, platform.boxes, wsCLI, registry, *processes),
      window(Serial1, platform.timers, platform.boxes, control_panel,
             // The path of the log has a separator twice on Windows.
             {kVersion, FromPath(CommandLogPath().lexically_normal()), FromPath(RegistryPath())}) {
  Serial1.SetTraceSink(Trace);
  Serial1.SetTraceOutput(serial_trace().isDebugEnabled());
  platform.boxes.SetParent(&window);
}

}  // namespace tendril
