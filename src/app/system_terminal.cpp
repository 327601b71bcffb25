#include "app/system_terminal.h"

#include <cerrno>
#include <cstdio>
#include <string>
#include <system_error>

#ifdef _WIN32
#include <io.h>
#else
#include <sys/ioctl.h>
#include <termios.h>
#include <unistd.h>

#include <QSocketNotifier>
#endif

namespace tendril {
namespace {

constexpr int kUsualColumns = 80;

#ifdef _WIN32
bool IsTerminal(std::FILE* stream) { return ::_isatty(::_fileno(stream)) != 0; }

int Columns(std::FILE* /*stream*/) { return kUsualColumns; }

void DropTypedInput() {}

// Stops are not noticed meanwhile.
std::optional<QString> ReadLine(ctl::Waiting& /*waiting*/, const ctl::StopRequest& /*stop*/) {
  char line[256];
  if (std::fgets(line, sizeof line, stdin) == nullptr) return std::nullopt;
  return QString::fromLocal8Bit(line).trimmed();
}
#else
bool IsTerminal(std::FILE* stream) { return ::isatty(::fileno(stream)) != 0; }

int Columns(std::FILE* stream) {
  winsize size = {};
  if (::ioctl(::fileno(stream), TIOCGWINSZ, &size) != 0 || size.ws_col == 0) return kUsualColumns;
  return size.ws_col;
}

// What was typed before a question does not answer it.
void DropTypedInput() { ::tcflush(STDIN_FILENO, TCIFLUSH); }

// A terminal hands a line over when it is complete.
std::optional<QString> ReadLine(ctl::Waiting& waiting, const ctl::StopRequest& stop) {
  bool readable = false;
  QSocketNotifier notifier(STDIN_FILENO, QSocketNotifier::Read);
  QObject::connect(&notifier, &QSocketNotifier::activated, &notifier, [&] {
    readable = true;
    notifier.setEnabled(false);
  });
  waiting.Until([&] { return readable || stop.Made(); });
  char line[256];
  const auto size = readable ? ::read(STDIN_FILENO, line, sizeof line) : -1;
  if (size <= 0) return std::nullopt;
  return QString::fromLocal8Bit(line, size).trimmed();
}
#endif

}  // namespace

QString SystemTerminal::Print(const QByteArray& text) {
  const auto size = static_cast<std::size_t>(text.size());
  errno = 0;
  if (std::fwrite(text.constData(), 1, size, stdout) == size && std::fflush(stdout) == 0) return {};
  return QString::fromStdString(std::generic_category().message(errno));
}

void SystemTerminal::PrintError(const QByteArray& text) {
  std::fwrite(text.constData(), 1, static_cast<std::size_t>(text.size()), stderr);
  std::fflush(stderr);
}

int SystemTerminal::ErrorColumns() const { return IsTerminal(stderr) ? Columns(stderr) : 0; }

int SystemTerminal::OutputColumns() const { return IsTerminal(stdout) ? Columns(stdout) : 0; }

bool SystemTerminal::Colours() const { return IsTerminal(stdout) && qEnvironmentVariableIsEmpty("NO_COLOR"); }

bool SystemTerminal::CanAsk() const { return IsTerminal(stdin) && IsTerminal(stderr); }

std::optional<QString> SystemTerminal::Ask(const QByteArray& question) {
  if (!CanAsk()) return std::nullopt;
  DropTypedInput();
  PrintError(question);
  return ReadLine(waiting_, stop_);
}

}  // namespace tendril
