#include "ctl/program.h"

#include <QJsonDocument>
#include <QJsonObject>
#include <optional>

#include "ctl/commands.h"
#include "ctl/trace_output.h"

namespace tendril::ctl {
namespace {

constexpr int kDocumentVersion = 1;

Report RunJob(Job& job) {
  switch (job.line.command) {
    case Command::kPorts:
      return Ports(job);
    case Command::kFind:
      return Find(job);
    case Command::kGet:
      return Get(job);
    case Command::kSend:
      return Send(job);
    case Command::kCompare:
      return Compare(job);
    case Command::kBackup:
      return Backup(job);
    case Command::kRestore:
      return Restore(job);
    case Command::kSetId:
      return SetId(job);
    case Command::kShow:
      return Show(job);
    case Command::kPreset:
      return WritePreset(job);
    case Command::kMonitor:
      return Monitor(job);
  }
  return {};
}

QByteArray Document(const CommandLine& line, const Report& report) {
  QJsonObject document = report.members;
  document[QStringLiteral("format")] = QStringLiteral("tendril-ctl");
  document[QStringLiteral("version")] = kDocumentVersion;
  document[QStringLiteral("command")] = CommandName(line.command);
  document[QStringLiteral("exitCode")] = report.exit_code;
  if (!report.problem.isEmpty()) document[QStringLiteral("problem")] = report.problem;
  return QJsonDocument(document).toJson();
}

}  // namespace

int RunCommand(const CommandLine& line, Environment& environment) {
  Report report;
  {
    UnitSession units(environment);
    std::optional<TraceOutput> trace;
    if (line.trace) trace.emplace(units.Trace(), environment.terminal);
    PortOpening port(line, environment, units);
    Job job{line, environment, units, port};
    report = RunJob(job);
    port.GiveBack();
  }
  if (environment.stop.Made()) report.exit_code = environment.stop.ExitCode();
  const QString fault = environment.terminal.Print(line.json ? Document(line, report) : report.text);
  const auto complain = [&environment](const QString& sentence) {
    if (!sentence.isEmpty()) environment.terminal.PrintError("tendril-ctl: " + sentence.toUtf8() + "\n");
  };
  complain(report.problem);
  if (fault.isEmpty()) return report.exit_code;
  complain(QStringLiteral("The result cannot be written: ") + fault);
  return report.exit_code == kExitSuccess ? kExitNotAsWished : report.exit_code;
}

}  // namespace tendril::ctl
