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
#include <QTimer>
#endif

namespace tendril {
namespace {

constexpr int kUsualColumns = 80;

#ifdef _WIN32
bool IsTerminal(std::FILE* stream) { return ::_isatty(::_fileno(stream)) != 0; }

int Columns(std::FILE* /*stream*/) { return kUsualColumns; }

void DropTypedInput() {}

QString WriteAll(std::FILE* stream, const QByteArray& text) {
  const auto size = static_cast<std::size_t>(text.size());
  errno = 0;
  if (std::fwrite(text.constData(), 1, size, stream) == size && std::fflush(stream) == 0) return {};
  return QString::fromStdString(std::generic_category().message(errno));
}

// Stops are not noticed meanwhile.
std::optional<QString> ReadLine(ctl::Waiting& /*waiting*/, const ctl::StopRequest& /*stop*/) {
  char line[256];
  if (std::fgets(line, sizeof line, stdin) == nullptr) return std::nullopt;
  return QString::fromLocal8Bit(line).trimmed();
}
#else
constexpr int kSignalMs = 100;  // in which a signal is delivered

bool IsTerminal(std::FILE* stream) { return ::isatty(::fileno(stream)) != 0; }

int Columns(std::FILE* stream) {
  winsize size = {};
  if (::ioctl(::fileno(stream), TIOCGWINSZ, &size) != 0 || size.ws_col == 0) return kUsualColumns;
  return size.ws_col;
}

// What was typed before a question does not answer it.
void DropTypedInput() { ::tcflush(STDIN_FILENO, TCIFLUSH); }

// A terminal that is closed ends the input, and sends a signal.
void AwaitStop(ctl::Waiting& waiting, const ctl::StopRequest& stop) {
  QTimer limit;
  limit.setSingleShot(true);
  limit.start(kSignalMs);
  waiting.Until([&] { return !limit.isActive() || stop.Made(); });
}

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
  if (size <= 0) {
    AwaitStop(waiting, stop);
    return std::nullopt;
  }
  return QString::fromLocal8Bit(line, size).trimmed();
}

// A signal ends the wait for a reader that stands still. What is left is not kept, since the program's end would wait for
// that reader again.
QString WriteAll(std::FILE* stream, const QByteArray& text) {
  for (qsizetype written = 0; written < text.size();) {
    const auto some = ::write(::fileno(stream), text.constData() + written,
                              static_cast<std::size_t>(text.size() - written));
    if (some < 0) return QString::fromStdString(std::generic_category().message(errno));
    written += some;
  }
  return {};
}
#endif

}  // namespace

QString SystemTerminal::Print(const QByteArray& text) { return WriteAll(stdout, text); }

void SystemTerminal::PrintError(const QByteArray& text) {
  if (!error_stalled_ && !WriteAll(stderr, text).isEmpty()) error_stalled_ = errno == EINTR;
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
