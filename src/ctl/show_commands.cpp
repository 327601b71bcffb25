// Commands that need no port: show and preset.
#include <algorithm>
#include <iterator>
#include <variant>

#include "ctl/commands.h"
#include "ctl/configuration_files.h"
#include "ctl/text_table.h"
#include "ctl/unit_ids.h"
#include "exchange/format_names.h"

namespace tendril::ctl {
namespace {

using namespace Qt::StringLiterals;

QString Range(const PulsePair& pair) { return u"%1 to %2"_s.arg(pair[0]).arg(pair[1]); }

template <typename Words>
TableCell Word(const Words& words, int index) {
  return {QString::fromLatin1(words.at(static_cast<std::size_t>(index)))};
}

// A name can be as long as the file; the table has room for this.
constexpr qsizetype kNameColumns = 24;

QString Shortened(const QString& name) {
  if (name.size() <= kNameColumns) return name;
  const qsizetype end = kNameColumns - 3;
  const bool splits = name.at(end - 1).isHighSurrogate();
  return name.left(splits ? end - 1 : end) + u"..."_s;
}

// The words of the file: those of the window would make the table too wide for a terminal.
std::vector<TableCell> PortRow(const ChannelConfig& record) {
  return {Word(exchange::kKinds, record.PortType - kPortServo),
          {Range(record.ActualRange)},
          {Range(record.VirtualRange)},
          {Range(record.VirtualStops)},
          {QString::number(record.DefaultPosition)},
          {QString::number(record.NeutralPosition)},
          Word(exchange::kPowerUps, record.PowerUPOpt - kPowerUpDefault),
          Word(exchange::kLostCommunications, record.LostCommOption - kLostCommHold)};
}

QByteArray TableOf(const ConfigurationText& configuration, const Terminal& terminal) {
  const bool names =
      std::ranges::any_of(configuration.names, [](const auto& name) { return name.has_value(); });
  QStringList headings{u"port"_s};
  if (names) headings += u"name"_s;
  headings += {u"kind"_s,    u"actual range"_s, u"virtual range"_s, u"stops"_s,
               u"default"_s, u"neutral"_s,      u"power up"_s,      u"lost comm."_s};
  TextTable table(headings);
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    std::vector<TableCell> row{{QString::number(slot + 1)}};
    if (names) row.push_back({Shortened(configuration.names[slot].value_or(QString()))});
    std::ranges::move(PortRow(configuration.records.At(slot)), std::back_inserter(row));
    table.AddRow(std::move(row));
  }
  return table.Text(terminal);
}

// What the file says of itself, a line each.
QByteArray HeadOf(const ConfigurationText& configuration) {
  QStringList lines;
  if (configuration.unit) lines += u"Unit %1"_s.arg(IdText(*configuration.unit));
  if (configuration.read) lines += u"Read %1"_s.arg(*configuration.read);
  if (configuration.note) lines += u"Note: %1"_s.arg(Printable(*configuration.note));
  return lines.isEmpty() ? QByteArray() : (lines.join(u'\n') + u"\n\n"_s).toUtf8();
}

}  // namespace

Report Show(Job& job) {
  const auto read = ReadConfigurationFile(job.line.file);
  if (const auto* fault = std::get_if<QString>(&read)) return Refused(*fault);
  const auto& configuration = std::get<ConfigurationText>(read);
  const auto text = WriteConfiguration(configuration);
  if (const auto* refusal = std::get_if<Refusal>(&text))
    return Refused(u"%1: with a field a line, %2."_s.arg(NameOfFile(job.line.file), refusal->Sentence()));
  return {.text = HeadOf(configuration) + TableOf(configuration, job.environment.terminal),
          .members = {{u"configuration"_s, AsJson(std::get<QByteArray>(text))}}};
}

Report WritePreset(Job& job) {
  ConfigurationText configuration;
  for (std::size_t slot = 0; slot < kPortCount; ++slot)
    SetFromPreset(*job.line.preset, configuration.records.At(slot));
  const auto text = std::get<QByteArray>(WriteConfiguration(configuration));
  const QString& path = job.line.output;
  if (path.isEmpty()) return {.text = text, .members = {{u"configuration"_s, AsJson(text)}}};
  const QString refusal = WhyNotWritable(path, job.line);
  if (!refusal.isEmpty()) return Refused(refusal);
  const QString fault = WriteNewFile(path, text, job.line);
  if (!fault.isEmpty()) return {.exit_code = kExitNotAsWished, .problem = fault};
  return {.members = {{u"file"_s, path}}};
}

}  // namespace tendril::ctl
