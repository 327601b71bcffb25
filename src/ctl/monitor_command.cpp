#include <string>

#include "ctl/commands.h"
#include "ctl/line_monitor.h"
#include "ctl/trace_output.h"
#include "platform/serial_device.h"

namespace tendril::ctl {

using namespace Qt::StringLiterals;

Report Monitor(Job& job) {
  if (auto problem = job.port.OpenToListen()) return *problem;
  Environment& environment = job.environment;
  if (!job.line.quiet) {
    environment.terminal.PrintError("Listening on " + QByteArray::fromStdString(CommName(job.port.Number())) +
                                    "; Ctrl+C ends it.\n");
  }
  QString fault;
  const LineMonitor monitor(environment, [&](const TraceEntry& entry) {
    const bool packet = entry.kind != TraceEntry::Kind::kNoise;
    if (fault.isEmpty())
      fault = environment.terminal.Print(TraceLine(entry, packet ? entry.Direction() : std::string()));
  });
  environment.waiting.Until([&] { return environment.stop.Made() || monitor.Lost() || !fault.isEmpty(); });
  if (!fault.isEmpty()) return ResultNotWritten(environment, fault);
  if (monitor.Lost()) {
    return {.exit_code = kExitNotAsWished, .problem = u"The port went away: plug the adapter in again."_s};
  }
  return {};
}

}  // namespace tendril::ctl
