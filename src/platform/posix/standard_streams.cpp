#include "platform/standard_streams.h"

#include <sys/ioctl.h>
#include <termios.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>

namespace tendril {
namespace {

constexpr int kUsualColumns = 80;

int Descriptor(Stream stream) {
  switch (stream) {
    case Stream::kInput:
      return STDIN_FILENO;
    case Stream::kOutput:
      return STDOUT_FILENO;
    case Stream::kError:
      break;
  }
  return STDERR_FILENO;
}

}  // namespace

// A port is given back even when nothing reads the output any more, or a file becomes too large.
void PrepareStreams() {
  std::signal(SIGPIPE, SIG_IGN);
  std::signal(SIGXFSZ, SIG_IGN);
}

bool IsTerminal(Stream stream) { return ::isatty(Descriptor(stream)) != 0; }

int TerminalColumns(Stream stream) {
  if (!IsTerminal(stream)) return 0;
  winsize size = {};
  if (::ioctl(Descriptor(stream), TIOCGWINSZ, &size) != 0 || size.ws_col == 0) return kUsualColumns;
  return size.ws_col;
}

bool TerminalHasColours(Stream stream) { return IsTerminal(stream); }

std::error_code WriteAll(Stream stream, std::string_view text) {
  while (!text.empty()) {
    const auto written = ::write(Descriptor(stream), text.data(), text.size());
    if (written < 0) return {errno, std::generic_category()};
    text.remove_prefix(static_cast<std::size_t>(written));
  }
  return {};
}

std::string ReasonText(const std::error_code& fault) { return fault.message(); }

void DropTypedInput() { ::tcflush(STDIN_FILENO, TCIFLUSH); }

}  // namespace tendril
