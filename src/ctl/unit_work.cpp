#include "ctl/unit_work.h"

#include <QDateTime>
#include <utility>

#include "ctl/configuration_files.h"

namespace tendril::ctl {

using namespace Qt::StringLiterals;
using Outcome = UnitResult::Outcome;

OptionTable OptionsOf(const ChannelTable& records) {
  OptionTable options;
  for (std::size_t slot = 0; slot < kPortCount; ++slot)
    options[slot] = std::get<OptionBytes>(EncodeOptions(records.At(slot)));
  return options;
}

ChannelTable RecordsOf(const OptionTable& held) {
  ChannelTable records;
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    records.At(slot) = DecodeOptions(held[slot]);
    records.At(slot).Received = false;  // the mark is for tables that are being read
  }
  return records;
}

ConfigurationText ConfigurationOf(const Environment& environment, std::uint8_t unit,
                                  const OptionTable& held) {
  const QDateTime now = QDateTime::fromMSecsSinceEpoch(environment.now_ms());
  ConfigurationText configuration;
  configuration.unit = unit;
  configuration.read = now.toOffsetFromUtc(now.offsetFromUtc()).toString(Qt::ISODate);
  configuration.records = RecordsOf(held);
  return configuration;
}

bool UnitWork::Read(OptionTable& held, const QString& what, double share) {
  progress_.BeginPhase(what, share);
  return Take(job_.units.Read(Unit(), held));
}

bool UnitWork::Write(const OptionTable& wanted, double share) {
  progress_.BeginPhase({}, share);
  // Nothing is written at an ID where nothing answers, or several units do.
  if (!Take(job_.units.LookFor(Unit()))) return false;
  const CommandResult end = job_.units.Send(Unit(), RecordsOf(wanted));
  result_.written = end.written;
  if (!end.Done()) result_.aftermath = QString::fromStdString(end.aftermath);
  return Take(end);
}

bool UnitWork::Compare(const OptionTable& wanted, const QString& what, double share) {
  OptionTable held;
  if (!Read(held, what, share)) return false;
  result_.compared = true;
  return SetDifferences(DifferencesBetween(wanted, held));
}

bool UnitWork::Keep(const OptionTable& held, const QString& path) {
  const ConfigurationText configuration = ConfigurationOf(job_.environment, Unit(), held);
  const auto text = WriteConfiguration(configuration);
  if (const auto* refusal = std::get_if<Refusal>(&text))
    return Fail(u"A file cannot have what the unit holds: %1."_s.arg(refusal->Sentence()));
  if (path.isEmpty()) {
    result_.configuration = std::get<QByteArray>(text);
  } else {
    const QString fault = WriteNewFile(path, std::get<QByteArray>(text), job_.line);
    if (!fault.isEmpty()) return Fail(fault);
    result_.file = path;
  }
  return SetDifferences(DifferencesBetween(OptionsOf(configuration.records), held));
}

bool UnitWork::BackUp(const QString& path, double share) {
  OptionTable held;
  if (Read(held, u"backup"_s, share) && Keep(held, path)) return true;
  if (result_.outcome == Outcome::kFailed)
    result_.reason = u"Not written, since there is no backup. "_s + result_.reason;
  if (result_.outcome != Outcome::kDiffers) return false;
  QString reason = u"Not written: a file cannot have all that the unit holds."_s;
  for (const QString& difference : Remarks(result_))
    reason += u" %1%2."_s.arg(difference.left(1).toUpper(), difference.sliced(1));
  return Fail(reason);
}

bool UnitWork::Take(const CommandResult& end) {
  if (end.kind == CommandResult::Kind::kFailed) return Fail(QString::fromStdString(end.reason));
  result_.outcome = end.Done() ? Outcome::kDone : Outcome::kCancelled;
  return end.Done();
}

bool UnitWork::Fail(const QString& reason) {
  result_.outcome = Outcome::kFailed;
  result_.reason = reason;
  return false;
}

bool UnitWork::SetDifferences(std::vector<PortsDifference> differences) {
  result_.differences = std::move(differences);
  result_.outcome = result_.differences.empty() ? Outcome::kDone : Outcome::kDiffers;
  return result_.differences.empty();
}

std::vector<UnitResult> ForEachUnit(Job& job, std::span<const std::uint8_t> units,
                                    const std::function<void(UnitWork&)>& work) {
  UnitProgress progress(job, units.size());
  std::vector<UnitResult> results;
  for (const std::uint8_t unit : units) {
    UnitResult& result = results.emplace_back();
    result.unit = unit;
    if (job.environment.stop.Made() || !job.units.Link().PortOpen()) continue;
    progress.BeginUnit(unit);
    UnitWork steps(job, progress, result);
    work(steps);
    progress.EndUnit(InWords(result));
  }
  return results;
}

}  // namespace tendril::ctl
