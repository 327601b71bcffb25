#include "app/demo_program.h"

#include <filesystem>

#include "app/version.h"

namespace tendril {
namespace {

QString DemoLog(const QTemporaryDir& scratch) { return scratch.filePath(QStringLiteral("HUtest.txt")); }

}  // namespace

DemoProgram::DemoProgram()
    : log(std::filesystem::path(DemoLog(scratch).toStdString())),
      wsCLI(bench.panel, kDemoListenerPort, platform.timers),
      window(Serial1, platform.timers, platform.boxes, control_panel,
             {kVersion, DemoLog(scratch), QStringLiteral("in memory")}) {
  platform.boxes.SetParent(&window);
}

}  // namespace tendril
