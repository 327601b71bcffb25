#include "app/demo_program.h"

#include <QDir>

#include "app/version.h"
#include "platform/qt/path_text.h"

namespace tendril {
namespace {

QString DemoLog(const QTemporaryDir& scratch) {
  return QDir::toNativeSeparators(scratch.filePath(QStringLiteral("HUtest.txt")));
}

}  // namespace

DemoProgram::DemoProgram()
    : log(ToPath(DemoLog(scratch))),
      wsCLI(bench.panel, kDemoListenerPort, platform.timers),
      window(Serial1, platform.timers, platform.boxes, control_panel,
             {kVersion, DemoLog(scratch), QStringLiteral("in memory")}) {
  platform.boxes.SetParent(&window);
}

}  // namespace tendril
