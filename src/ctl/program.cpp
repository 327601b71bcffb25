#include "ctl/program.h"

#include <QJsonDocument>
#include <QJsonObject>
#include <cstdint>
#include <optional>

#include "ctl/bounded_wait.h"
#include "ctl/commands.h"
#include "ctl/text_table.h"
#include "ctl/trace_output.h"
#include "platform/runtime_error.h"

namespace tendril::ctl {
namespace {

constexpr int kDocumentVersion = 1;
// In which the event loop delivers a signal that has interrupted a write.
constexpr std::int32_t kSignalMs = 50;

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

QByteArray Document(const QString& command, const Report& report) {
  QJsonObject document = report.members;
  document[QStringLiteral("format")] = QStringLiteral("tendril-ctl");
  document[QStringLiteral("version")] = kDocumentVersion;
  if (!command.isEmpty()) document[QStringLiteral("command")] = command;
  document[QStringLiteral("exitCode")] = report.exit_code;
  if (!report.problem.isEmpty()) document[QStringLiteral("problem")] = report.problem;
  return QJsonDocument(document).toJson();
}

void Complain(const QString& problem, Terminal& terminal) {
  if (!problem.isEmpty()) terminal.PrintError("tendril-ctl: " + Printable(problem).toUtf8() + "\n");
}

// Whatever happens, a port that was borrowed goes back.
Report RunAndGiveBack(const CommandLine& line, Environment& environment) {
  UnitSession units(environment);
  std::optional<TraceOutput> trace;
  if (line.trace) trace.emplace(units.Trace(), environment.terminal);
  PortOpening port(line, environment, units);
  Job job{line, environment, units, port};
  Report report;
  try {
    report = RunJob(job);
  } catch (...) {
    report = {.exit_code = kExitNotAsWished, .problem = QString::fromStdString(DescribeCurrentFault())};
  }
  const QString not_given_back = port.GiveBack();
  if (not_given_back.isEmpty()) return report;
  if (report.exit_code == kExitSuccess) report.exit_code = kExitNotAsWished;
  report.problem += (report.problem.isEmpty() ? QString() : QStringLiteral(" ")) + not_given_back;
  return report;
}

}  // namespace

int PrintEarlyEnd(const EarlyEnd& end, bool json, Terminal& terminal) {
  const bool wrong_use = end.exit_code != kExitSuccess;
  if (wrong_use) Complain(end.text, terminal);
  if (wrong_use && !json) return end.exit_code;
  const QString fault = terminal.Print(
      wrong_use ? Document({}, {.exit_code = end.exit_code, .problem = end.text}) : end.text.toUtf8());
  return fault.isEmpty() || wrong_use ? end.exit_code : kExitNotAsWished;
}

Report ResultNotWritten(Environment& environment, const QString& fault) {
  WaitUntil(environment, kSignalMs, [&environment] { return environment.stop.Made(); });
  if (environment.stop.Made()) return {};
  return {.exit_code = kExitNotAsWished,
          .problem = QStringLiteral("The result cannot be written: %1.").arg(fault)};
}

int RunCommand(const CommandLine& line, Environment& environment) {
  Report report = RunAndGiveBack(line, environment);
  if (environment.stop.Made()) report.exit_code = environment.stop.ExitCode();
  const QString fault =
      environment.terminal.Print(line.json ? Document(CommandName(line.command), report) : report.text);
  Complain(report.problem, environment.terminal);
  if (!fault.isEmpty()) {
    const Report not_written = ResultNotWritten(environment, fault);
    Complain(not_written.problem, environment.terminal);
    if (report.exit_code == kExitSuccess) report.exit_code = not_written.exit_code;
  }
  return environment.stop.Made() ? environment.stop.ExitCode() : report.exit_code;
}

}  // namespace tendril::ctl
