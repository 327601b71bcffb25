// The command compare.
#include <variant>

#include "ctl/commands.h"
#include "ctl/configuration_files.h"
#include "ctl/text_table.h"
#include "ctl/unit_work.h"

namespace tendril::ctl {
namespace {

using namespace Qt::StringLiterals;

// What the differences of two files are, as a unit would hold them.
Report CompareFiles(const CommandLine& line, const OptionTable& first, const OptionTable& second,
                    const Terminal& terminal) {
  const auto differences = DifferencesBetween(first, second);
  Report report{.members = {{u"differences"_s, ToJson(differences)}}};
  if (differences.empty()) {
    report.text = "A unit holds the same with either file.\n";
    return report;
  }
  TextTable table({u"ports"_s, u"part"_s, line.file, line.other_file});
  for (const PortsDifference& difference : differences) {
    table.AddRow({{difference.Ports()},
                  {difference.Name()},
                  {QString::fromStdString(difference.part.wanted)},
                  {QString::fromStdString(difference.part.held)}});
  }
  report.exit_code = kExitNotAsWished;
  report.text = table.Text(terminal);
  report.problem = u"The files differ."_s;
  return report;
}

}  // namespace

Report Compare(Job& job) {
  const Terminal& terminal = job.environment.terminal;
  const auto read = ReadConfigurationFile(job.line.file);
  if (const auto* fault = std::get_if<QString>(&read)) return Refused(*fault);
  const OptionTable wanted = OptionsOf(std::get<ConfigurationText>(read).records);
  if (!job.line.other_file.isEmpty()) {
    const auto other = ReadConfigurationFile(job.line.other_file);
    if (const auto* fault = std::get_if<QString>(&other)) return Refused(*fault);
    return CompareFiles(job.line, wanted, OptionsOf(std::get<ConfigurationText>(other).records), terminal);
  }
  if (auto fault = job.port.Open()) return *fault;
  const auto results = ForEachUnit(job, job.line.units, [&](UnitWork& work) { work.Compare(wanted, {}, 1); });
  return ReportOf(results, {.compared = true}, terminal);
}

}  // namespace tendril::ctl
