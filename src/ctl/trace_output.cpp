#include "ctl/trace_output.h"

#include <QDateTime>

#include "trace/trace_text.h"

namespace tendril::ctl {
namespace {

constexpr qsizetype kFromColumns = 7;    // "program"
constexpr qsizetype kBytesColumns = 24;  // a poll, and most replies

QByteArray Padded(const std::string& text, qsizetype columns) {
  return QByteArray::fromStdString(text).leftJustified(columns) + "  ";
}

}  // namespace

QByteArray TraceLine(const TraceEntry& entry, const std::string& from) {
  const QString time = QDateTime::fromMSecsSinceEpoch(entry.time_ms).toString(QStringLiteral("HH:mm:ss.zzz"));
  return time.toUtf8() + "  " + Padded(from, kFromColumns) + Padded(TraceBytes(entry), kBytesColumns) +
         QByteArray::fromStdString(TraceMeaning(entry)) + '\n';
}

TraceOutput::TraceOutput(LineTrace& trace, Terminal& terminal) : trace_(trace), terminal_(terminal) {
  trace_.SetChangedHandler([this] { PrintNew(); });
}

TraceOutput::~TraceOutput() { trace_.SetChangedHandler(nullptr); }

void TraceOutput::PrintNew() {
  const auto& entries = trace_.Entries();
  // An echo is printed with what follows it: first the line has to be released for the reply.
  if (entries.empty() || entries.back().kind == TraceEntry::Kind::kEcho) return;
  for (const TraceEntry& entry : entries) {
    if (entry.number >= next_) terminal_.PrintError(TraceLine(entry, entry.Direction()));
  }
  next_ = entries.back().number + 1;
}

}  // namespace tendril::ctl
