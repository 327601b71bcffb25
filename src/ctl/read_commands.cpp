// Commands that read units into files: get and backup.
#include <QDir>
#include <QFileInfo>
#include <algorithm>
#include <cstdint>
#include <iterator>
#include <optional>
#include <span>
#include <vector>

#include "ctl/commands.h"
#include "ctl/configuration_files.h"
#include "ctl/find_command.h"
#include "ctl/unit_work.h"
#include "unitops/unit_target.h"

namespace tendril::ctl {
namespace {

using namespace Qt::StringLiterals;
using Outcome = UnitResult::Outcome;

std::vector<UnitResult> KeepUnits(Job& job, std::span<const std::uint8_t> units, const PathOfUnit& path_of) {
  return ForEachUnit(job, units, [&](UnitWork& work) {
    OptionTable held;
    if (work.Read(held, {}, 1)) work.Keep(held, path_of(work.Unit()));
  });
}

Report ReportOfFiles(const Job& job, const std::vector<UnitResult>& results) {
  return ReportOf(results, {.file = u"file"_s}, job.environment.terminal);
}

// The only unit's configuration is all that goes to standard output.
Report GetToOutput(Job& job) {
  if (auto fault = job.port.Open()) return *fault;
  const auto results = KeepUnits(job, job.line.units, [](std::uint8_t /*unit*/) { return QString(); });
  const UnitResult& result = results.front();
  Report report = ReportOf(results, {}, job.environment.terminal);
  report.text = result.configuration;
  if (result.outcome == Outcome::kDiffers)
    report.problem = u"The configuration cannot have all: %1."_s.arg(Remarks(result).join(u"; "_s));
  return report;
}

// Searches the whole line. Returns the report when there is nothing to read.
std::optional<Report> FindUnits(Job& job) {
  const CommandResult end = FindWithProgress(job, kFirstUnitId, kLastUnitId);
  const UnitSearch& search = job.units.Search();
  if (end.Done() && !search.found.empty()) return std::nullopt;
  return Report{.exit_code = kExitNotAsWished, .problem = SearchSentence(end, search)};
}

// What is at an ID that does not simply answer.
UnitResult NotRead(const FoundUnit& found) {
  return {.unit = found.id,
          .outcome = Outcome::kFailed,
          .reason = u"Not read: %1."_s.arg(QString::fromStdString(found.Words()))};
}

Report BackUpFoundUnits(Job& job, const PathOfUnit& path_of) {
  if (auto fault = FindUnits(job)) return *fault;
  std::vector<std::uint8_t> units;
  std::vector<UnitResult> others;
  for (const FoundUnit& found : job.units.Search().found) {
    if (found.what == FoundUnit::What::kAnswers) {
      units.push_back(found.id);
    } else {
      others.push_back(NotRead(found));
    }
  }
  std::vector<UnitResult> results = KeepUnits(job, units, path_of);
  std::ranges::move(others, std::back_inserter(results));
  std::ranges::sort(results, {}, &UnitResult::unit);
  return ReportOfFiles(job, results);
}

}  // namespace

Report Get(Job& job) {
  const CommandLine& line = job.line;
  const bool one = line.units.size() == 1;
  if (one && line.output.isEmpty()) return GetToOutput(job);
  const bool names_folder = QDir::fromNativeSeparators(line.output).endsWith(u'/');
  const bool folder = !one || names_folder || QFileInfo(line.output).isDir();
  const PathOfUnit path_of = [&](std::uint8_t unit) {
    return folder ? UnitFilePath(line.output, unit) : line.output;
  };
  const QString fault = WhyNoneWritable(line.units, path_of, line);
  if (!fault.isEmpty()) return Refused(fault);
  if (auto report = job.port.Open()) return *report;
  return ReportOfFiles(job, KeepUnits(job, line.units, path_of));
}

Report Backup(Job& job) {
  const CommandLine& line = job.line;
  const PathOfUnit path_of = [&](std::uint8_t unit) { return UnitFilePath(line.folder, unit); };
  std::vector<std::uint8_t> perhaps = line.units;
  for (int id = kFirstUnitId; line.units.empty() && id <= kLastUnitId; ++id)
    perhaps.push_back(static_cast<std::uint8_t>(id));
  const QString fault = WhyNoneWritable(perhaps, path_of, line);
  if (!fault.isEmpty()) return Refused(fault);
  if (auto report = job.port.Open()) return *report;
  if (line.units.empty()) return BackUpFoundUnits(job, path_of);
  return ReportOfFiles(job, KeepUnits(job, line.units, path_of));
}

}  // namespace tendril::ctl
