#include "app/system_terminal.h"

#include <QTimer>
#include <string_view>
#include <system_error>

#include "app/typed_line.h"
#include "platform/standard_streams.h"

namespace tendril {
namespace {

std::string_view View(const QByteArray& text) {
  return {text.constData(), static_cast<std::size_t>(text.size())};
}

// What ends the input, Ctrl+C or a terminal that is closed, requests a stop besides.
void AwaitStop(ctl::Waiting& waiting, const ctl::StopRequest& stop) {
  constexpr int kStopMs = 100;
  QTimer limit;
  limit.setSingleShot(true);
  limit.start(kStopMs);
  waiting.Until([&] { return !limit.isActive() || stop.Made(); });
}

}  // namespace

QString SystemTerminal::Print(const QByteArray& text) {
  const std::error_code fault = WriteAll(Stream::kOutput, View(text));
  return fault ? QString::fromStdString(ReasonText(fault)) : QString();
}

void SystemTerminal::PrintError(const QByteArray& text) {
  if (!error_stalled_) error_stalled_ = WriteAll(Stream::kError, View(text)) == std::errc::interrupted;
}

int SystemTerminal::ErrorColumns() const { return TerminalColumns(Stream::kError); }

int SystemTerminal::OutputColumns() const { return TerminalColumns(Stream::kOutput); }

bool SystemTerminal::Colours() const {
  return qEnvironmentVariableIsEmpty("NO_COLOR") && TerminalHasColours(Stream::kOutput);
}

bool SystemTerminal::CanAsk() const { return IsTerminal(Stream::kInput) && IsTerminal(Stream::kError); }

std::optional<QString> SystemTerminal::Ask(const QByteArray& question) {
  if (!CanAsk()) return std::nullopt;
  DropTypedInput();
  PrintError(question);
  std::optional<QString> line = ReadTypedLine(waiting_, stop_);
  if (!line) AwaitStop(waiting_, stop_);
  return line;
}

}  // namespace tendril
