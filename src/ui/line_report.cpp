#include "ui/line_report.h"

#include <QDateTime>
#include <algorithm>

#include "platform/hex_text.h"
#include "ui/system_info.h"
#include "ui/trace_model.h"

namespace tendril {
namespace {

// The local time, as the lines have it, with its offset from UTC. Qt writes "Z" for an offset of zero.
QString LocalTime() {
  const QDateTime now = QDateTime::currentDateTime();
  return now.toOffsetFromUtc(now.offsetFromUtc())
      .toString(Qt::ISODate)
      .replace(QLatin1Char('Z'), QStringLiteral("+00:00"));
}

QString DescribePort(const HwSerial& link) {
  const std::int16_t number = link.CommPort();
  if (number == 0) return QStringLiteral("none chosen");
  const std::string device = link.DescribeComPort(number);
  return QStringLiteral("Comm %1, %2, %3")
      .arg(number)
      .arg(device.empty() ? QStringLiteral("no device") : QString::fromStdString(device),
           link.PortOpen() ? QStringLiteral("open") : QStringLiteral("not open"));
}

template <typename Text>
QString TableLine(Text text) {
  QStringList texts;
  for (const TraceColumn column : kTraceColumns) texts += text(column);
  return texts.join(QLatin1Char('\t')) + QLatin1Char('\n');
}

}  // namespace

QString LineReport(const ProgramInfo& info, const HwSerial& link, std::uint8_t unit,
                   const std::string& verdict, const std::deque<TraceEntry>& entries) {
  const std::size_t lines = std::min(entries.size(), kReportedLines);
  QString report = QStringLiteral("Tendril Configuration Utility %1\n").arg(info.version.Text());
  const auto add = [&report](const char* what, const QString& value) {
    report += QString::fromLatin1(what) + QStringLiteral(": ") + value + QLatin1Char('\n');
  };
  add("System", DescribeSystem());
  add("Qt", DescribeQt());
  add("Copied", LocalTime());
  add("Port", DescribePort(link));
  add("Unit", QString::fromStdString(HexByte(unit)));
  add("Verdict", QString::fromStdString(verdict));
  add("Lines", QStringLiteral("the last %1 of %2").arg(lines).arg(entries.size()));
  report += QLatin1Char('\n') + TableLine(TraceHeading);
  for (auto entry = entries.end() - static_cast<std::ptrdiff_t>(lines); entry != entries.end(); ++entry)
    report += TableLine([entry](TraceColumn column) { return TraceText(*entry, column); });
  return report;
}

}  // namespace tendril
