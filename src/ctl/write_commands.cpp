// Commands that write configurations into units: send and restore.
#include <QDir>
#include <QFileInfo>
#include <QRegularExpression>
#include <QSet>
#include <algorithm>
#include <cstdint>
#include <iterator>
#include <optional>
#include <span>
#include <string>
#include <variant>
#include <vector>

#include "ctl/commands.h"
#include "ctl/configuration_files.h"
#include "ctl/unit_ids.h"
#include "ctl/unit_work.h"
#include "platform/hex_text.h"
#include "unitops/unit_target.h"

namespace tendril::ctl {
namespace {

using namespace Qt::StringLiterals;

// What goes into a unit, and the file that has it.
struct Writing {
  std::uint8_t unit;
  OptionTable options;
  QString file;
};

// What parts of the work take, in times of a read.
constexpr double kReadTime = 1;
constexpr double kWriteTime = 8;

// Why a backup of `units` cannot be written: a sentence; empty when it can.
QString WhyNoBackup(const CommandLine& line, const std::vector<Writing>& writings,
                    std::span<const std::uint8_t> units) {
  QSet<QString> sources;
  for (const Writing& writing : writings) sources += QFileInfo(writing.file).canonicalFilePath();
  for (const std::uint8_t unit : units) {
    const QString path = UnitFilePath(line.backup, unit);
    if (QFileInfo::exists(path) && sources.contains(QFileInfo(path).canonicalFilePath())) {
      return u"The backup %1 would overwrite a file that this command reads: choose another folder."_s.arg(
          path);
    }
  }
  return WhyNoneWritable(
      units, [&](std::uint8_t unit) { return UnitFilePath(line.backup, unit); }, line);
}

Report WriteUnits(Job& job, const std::vector<Writing>& writings) {
  const CommandLine& line = job.line;
  const bool back_up = !line.backup.isEmpty();
  std::vector<std::uint8_t> units;
  std::ranges::transform(writings, std::back_inserter(units), &Writing::unit);
  const QString no_backup = back_up ? WhyNoBackup(line, writings, units) : QString();
  if (!no_backup.isEmpty()) return Refused(no_backup);
  if (auto fault = job.port.Open()) return *fault;

  const double whole = kWriteTime + (back_up ? kReadTime : 0) + (line.compare ? kReadTime : 0);
  const auto results = ForEachUnit(job, units, [&](UnitWork& work) {
    if (back_up && !work.BackUp(UnitFilePath(line.backup, work.Unit()), kReadTime / whole)) return;
    const auto& wanted = std::ranges::find(writings, work.Unit(), &Writing::unit)->options;
    if (work.Write(wanted, kWriteTime / whole) && line.compare)
      work.Compare(wanted, u"compare"_s, kReadTime / whole);
  });
  Report report =
      ReportOf(results, {.written = true, .compared = true, .file = back_up ? u"backup"_s : QString()},
               job.environment.terminal);
  // Those have their backups already.
  const bool again = std::ranges::any_of(results, [](const UnitResult& result) {
    return result.outcome != UnitResult::Outcome::kDone && !result.file.isEmpty();
  });
  if (again) report.problem += u" Give --backup another folder then."_s;
  return report;
}

// The ID that a file of a backup is named after; nothing when it is none. The case of the name does not matter.
std::optional<std::uint8_t> UnitOfName(const QString& name) {
  static const QRegularExpression kPattern(u"^unit-([0-9A-F]{2})\\.json$"_s,
                                           QRegularExpression::CaseInsensitiveOption);
  const auto match = kPattern.match(name);
  if (!match.hasMatch()) return std::nullopt;
  return static_cast<std::uint8_t>(match.captured(1).toUInt(nullptr, 16));
}

// A file of a backup, and what it is named after.
struct BackupFile {
  std::uint8_t unit;
  QString path;
};

// Those of the command line, or all that the folder has, in order of ID.
std::vector<BackupFile> BackupFiles(const CommandLine& line) {
  std::vector<BackupFile> files;
  for (const std::uint8_t unit : line.units) files.push_back({unit, UnitFilePath(line.folder, unit)});
  if (!files.empty()) return files;
  const QDir folder(line.folder);
  // Also what cannot be read, like a link to nothing: a backup is restored as a whole or not at all.
  for (const QString& name : folder.entryList(QDir::AllEntries | QDir::Hidden | QDir::System)) {
    if (const auto unit = UnitOfName(name))
      files.push_back({*unit, QDir::toNativeSeparators(folder.filePath(name))});
  }
  std::ranges::sort(files, {}, &BackupFile::unit);
  return files;
}

// Why the configuration is not for the unit that its file is named after; empty: it is.
QString WhyNotOfUnit(const BackupFile& file, const ConfigurationText& configuration) {
  if (configuration.unit == file.unit) return {};
  const QString why = configuration.unit ? u"it was read from unit %1"_s.arg(IdText(*configuration.unit))
                                         : u"it does not say which unit it was read from"_s;
  return u"%1: %2; --yes writes it into unit %3 all the same."_s.arg(file.path, why, IdText(file.unit));
}

std::variant<Writing, QString> ReadBackupFile(const BackupFile& file, bool any_unit) {
  const auto id = ParseUnitIds(HexByte(file.unit));
  if (const auto* fault = std::get_if<std::string>(&id))
    return u"%1: %2"_s.arg(file.path, QString::fromStdString(*fault));
  const QFileInfo info(file.path);
  if (info.exists() && !info.isFile()) return u"%1 is not a regular file."_s.arg(file.path);
  auto read = ReadConfigurationFile(file.path);
  if (auto* fault = std::get_if<QString>(&read)) return *fault;
  const auto& configuration = std::get<ConfigurationText>(read);
  const QString fault = any_unit ? QString() : WhyNotOfUnit(file, configuration);
  if (!fault.isEmpty()) return fault;
  return Writing{file.unit, OptionsOf(configuration.records), file.path};
}

}  // namespace

Report Send(Job& job) {
  const auto read = ReadConfigurationFile(job.line.file);
  if (const auto* fault = std::get_if<QString>(&read)) return Refused(*fault);
  const OptionTable options = OptionsOf(std::get<ConfigurationText>(read).records);
  std::vector<Writing> writings;
  for (const std::uint8_t unit : job.line.units) writings.push_back({unit, options, job.line.file});
  return WriteUnits(job, writings);
}

Report Restore(Job& job) {
  const CommandLine& line = job.line;
  if (!QFileInfo(line.folder).isDir()) return Refused(u"There is no folder %1."_s.arg(line.folder));
  if (line.units.empty() && !QDir(line.folder).isReadable())
    return Refused(u"The folder %1 cannot be read: it is read-protected."_s.arg(line.folder));
  const std::vector<BackupFile> files = BackupFiles(line);
  if (files.empty())
    return Refused(u"The folder %1 has no backup: no file like unit-0A.json."_s.arg(line.folder));
  std::vector<Writing> writings;
  for (const BackupFile& file : files) {
    auto read = ReadBackupFile(file, line.yes);
    if (const auto* fault = std::get_if<QString>(&read)) return Refused(*fault);
    if (!writings.empty() && writings.back().unit == file.unit)
      return Refused(u"%1 is the second file of its unit in this folder."_s.arg(file.path));
    writings.push_back(std::get<Writing>(read));
  }
  return WriteUnits(job, writings);
}

}  // namespace tendril::ctl
