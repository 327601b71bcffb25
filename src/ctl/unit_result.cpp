#include "ctl/unit_result.h"

#include <QJsonObject>
#include <QRegularExpression>
#include <algorithm>
#include <array>
#include <cstddef>
#include <iterator>
#include <utility>

#include "ctl/configuration_files.h"
#include "ctl/text_table.h"
#include "ctl/unit_ids.h"

namespace tendril::ctl {
namespace {

using namespace Qt::StringLiterals;
using Outcome = UnitResult::Outcome;
using Written = SendOperation::Written;

// The name of a whole part in a configuration file.
QString FileName(ComparedPart part) {
  constexpr std::array kNames{"kind",         "actualRange",      "virtualRange",    "virtualStops",
                              "virtualStops", "virtualStops",     "defaultPosition", "neutralPosition",
                              "powerUp",      "lostCommunication"};
  return QString::fromLatin1(kNames.at(static_cast<std::size_t>(part)));
}

QString Word(Outcome outcome) {
  switch (outcome) {
    case Outcome::kDone:
      return u"done"_s;
    case Outcome::kDiffers:
      return u"differs"_s;
    case Outcome::kFailed:
      return u"failed"_s;
    case Outcome::kCancelled:
      return u"cancelled"_s;
    case Outcome::kNotTried:
      return u"notTried"_s;
  }
  return {};
}

// For the document, and for the table.
struct WrittenWords {
  QString name, word;
};
WrittenWords Words(Written written) {
  switch (written) {
    case Written::kNothing:
      return {u"none"_s, u"no"_s};
    case Written::kPerhaps:
      return {u"perhaps"_s, u"perhaps"_s};
    case Written::kPart:
      return {u"part"_s, u"partly"_s};
    case Written::kAll:
      return {u"all"_s, u"yes"_s};
  }
  return {};
}

// "It holds half a configuration: ports 1 to 3 are written, 4 perhaps, 5 to 8 are not."
QString HowItIsLeft(const UnitResult& result) {
  if (result.written != Written::kPart) return result.aftermath;
  return u"It holds half a configuration: "_s + result.aftermath.left(1).toLower() + result.aftermath.mid(1);
}

QString Spaced(const QStringList& sentences) {
  QStringList some = sentences;
  some.removeAll(QString());
  return some.join(u' ');
}

// "port 3, virtual range: 1000 to 2000 in the file, 1000 to 2010 in the unit".
QString InWords(const PortsDifference& difference) {
  return u"port%1 %2, %3: %4 in the file, %5 in the unit"_s.arg(
      difference.ports.size() > 1 ? u"s"_s : QString(), difference.Ports(), difference.Name(),
      QString::fromStdString(difference.part.wanted), QString::fromStdString(difference.part.held));
}

TableCell WrittenCell(const UnitResult& result) {
  const bool all = result.written == Written::kAll;
  return {Words(result.written).word, all ? Tone::kGood : Tone::kBad};
}

TableCell ComparedCell(const UnitResult& result) {
  if (!result.compared) return {u"-"_s};
  return result.differences.empty() ? TableCell{u"equal"_s, Tone::kGood}
                                    : TableCell{u"differs"_s, Tone::kBad};
}

QByteArray TableOf(const std::vector<UnitResult>& results, const ResultColumns& columns,
                   const Terminal& terminal) {
  QStringList headings{u"unit"_s};
  if (columns.written) headings += u"written"_s;
  if (columns.compared) headings += u"compared"_s;
  if (!columns.file.isEmpty()) headings += columns.file;
  const auto remark_column = static_cast<std::size_t>(headings.size());
  TextTable table(headings);
  for (const UnitResult& result : results) {
    std::vector<TableCell> row{{IdText(result.unit)}};
    if (columns.written) row.push_back(WrittenCell(result));
    if (columns.compared) row.push_back(ComparedCell(result));
    if (!columns.file.isEmpty()) row.push_back({result.file.isEmpty() ? u"-"_s : result.file});
    for (const QString& remark : Remarks(result)) {
      row.resize(remark_column);
      row.push_back({remark});
      table.AddRow(std::exchange(row, {}));
    }
    if (!row.empty()) table.AddRow(row);
  }
  return table.Text(terminal);
}

QJsonObject ToJson(const UnitResult& result, const ResultColumns& columns) {
  QJsonObject row{{u"unit"_s, IdText(result.unit)}, {u"outcome"_s, Word(result.outcome)}};
  if (columns.written) row[u"written"_s] = Words(result.written).name;
  if (result.compared) row[u"compared"_s] = result.differences.empty() ? u"equal"_s : u"differs"_s;
  if (!result.file.isEmpty()) row[u"file"_s] = result.file;
  if (!result.configuration.isEmpty()) row[u"configuration"_s] = AsJson(result.configuration);
  if (!result.reason.isEmpty()) row[u"reason"_s] = result.reason;
  if (!result.aftermath.isEmpty()) row[u"aftermath"_s] = result.aftermath;
  if (!result.differences.empty()) row[u"differences"_s] = ToJson(result.differences);
  return row;
}

// "2 of 40 units differ, 1 failed, 3 were not tried."; of a single unit that failed, why.
QString Summary(const std::vector<UnitResult>& results) {
  struct Clause {
    Outcome outcome;
    QLatin1StringView one, several;
  };
  constexpr std::array<Clause, 3> kClauses{{{Outcome::kDiffers, "differs"_L1, "differ"_L1},
                                            {Outcome::kFailed, "failed"_L1, "failed"_L1},
                                            {Outcome::kNotTried, "was not tried"_L1, "were not tried"_L1}}};
  QStringList clauses;
  for (const auto& [outcome, one, several] : kClauses) {
    const auto units = std::ranges::count(results, outcome, &UnitResult::outcome);
    if (units == 0) continue;
    if (results.size() == 1 && outcome == Outcome::kFailed) return Remarks(results.front()).join(u' ');
    if (results.size() == 1) return u"Unit %1 %2."_s.arg(IdText(results.front().unit), one);
    const QString of = clauses.isEmpty() ? u" of %1 units"_s.arg(results.size()) : QString();
    clauses += u"%1%2 %3"_s.arg(QString::number(units), of, units == 1 ? one : several);
  }
  return clauses.isEmpty() ? QString() : clauses.join(u", "_s) + u'.';
}

// Where the stop has come, or why else some units are not tried; empty: all are, or the stop came between two.
QString WhereStopped(const std::vector<UnitResult>& results) {
  const auto not_tried = std::ranges::find(results, Outcome::kNotTried, &UnitResult::outcome);
  const auto stopped = std::ranges::find(results, Outcome::kCancelled, &UnitResult::outcome);
  if (stopped == results.end()) {
    const bool lost = not_tried != results.begin() && not_tried != results.end();
    return lost ? std::prev(not_tried)->reason : QString();
  }
  if (stopped->written == Written::kAll)
    return u"Stopped: unit %1 is written, and not compared."_s.arg(IdText(stopped->unit));
  return Spaced({u"Stopped at unit %1."_s.arg(IdText(stopped->unit)), HowItIsLeft(*stopped)});
}

// Those that are not done, as a command takes them.
QString UnitsForAnotherRun(const std::vector<UnitResult>& results) {
  std::vector<std::uint8_t> units;
  for (const UnitResult& result : results) {
    if (result.outcome != Outcome::kDone) units.push_back(result.unit);
  }
  return QString::fromStdString(UnitIdList(units));
}

}  // namespace

QString PortsDifference::Ports() const {
  QString text;
  for (std::size_t i = 0; i < ports.size(); ++i) {
    std::size_t last = i;
    while (last + 1 < ports.size() && ports[last + 1] == ports[last] + 1) ++last;
    if (i > 0) text += u", "_s;
    text += QString::number(ports[i]);
    if (last > i) text += u"-"_s + QString::number(ports[last]);
    i = last;
  }
  return text;
}

QString PortsDifference::Name() const { return QString::fromLatin1(NameOf(part.part)).toLower(); }

std::vector<PortsDifference> DifferencesBetween(const OptionTable& wanted, const OptionTable& held) {
  std::vector<PortsDifference> differences;
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    for (const OptionDifference& part : tendril::DifferencesBetween(wanted[slot], held[slot])) {
      auto same = std::ranges::find(differences, part, &PortsDifference::part);
      if (same == differences.end()) same = differences.insert(same, {{}, part});
      same->ports.push_back(static_cast<int>(slot) + 1);
    }
  }
  return differences;
}

QJsonArray ToJson(const std::vector<PortsDifference>& differences) {
  QJsonArray rows;
  for (const auto& [ports, part] : differences) {
    QJsonArray numbers;
    for (const int port : ports) numbers += port;
    rows += QJsonObject{{u"ports"_s, numbers},
                        {u"part"_s, FileName(part.part)},
                        {u"wanted"_s, QString::fromStdString(part.wanted)},
                        {u"held"_s, QString::fromStdString(part.held)}};
  }
  return rows;
}

QStringList Remarks(const UnitResult& result) {
  static const QRegularExpression kBetweenSentences(u"(?<=\\.) "_s);
  switch (result.outcome) {
    case Outcome::kDone:
      return {};
    case Outcome::kNotTried:
      return {u"Not tried."_s};
    case Outcome::kCancelled:
      return {Spaced({u"Stopped."_s, HowItIsLeft(result)})};
    case Outcome::kFailed:
      return Spaced({result.reason, HowItIsLeft(result)}).split(kBetweenSentences);
    case Outcome::kDiffers:
      break;
  }
  QStringList remarks;
  for (const PortsDifference& difference : result.differences) remarks += InWords(difference);
  return remarks;
}

QString InWords(const UnitResult& result) {
  if (result.outcome != Outcome::kDone && result.outcome != Outcome::kDiffers)
    return Remarks(result).join(u' ');
  QStringList words;
  if (result.written == Written::kAll) words += u"written"_s;
  if (result.outcome == Outcome::kDiffers) {
    words += u"differs"_s;
  } else if (result.compared) {
    words += u"holds it"_s;
  } else if (!result.file.isEmpty() || !result.configuration.isEmpty()) {
    words += u"read"_s;
  }
  return words.join(u", "_s);
}

Report ReportOf(const std::vector<UnitResult>& results, const ResultColumns& columns,
                const Terminal& terminal) {
  QJsonArray units;
  for (const UnitResult& result : results) units += ToJson(result, columns);
  Report report{.text = TableOf(results, columns, terminal), .members = {{u"units"_s, units}}};
  const QString again = UnitsForAnotherRun(results);
  if (again.isEmpty()) return report;
  report.exit_code = kExitNotAsWished;
  report.members[u"again"_s] = again;
  report.problem = Spaced({WhereStopped(results), Summary(results)});
  if (results.size() > 1) report.problem += u" For another run: %1."_s.arg(again);
  return report;
}

}  // namespace tendril::ctl
