#include "platform/standard_streams.h"

#include <fcntl.h>
#include <io.h>
#include <windows.h>

#include <algorithm>
#include <cstdio>
#include <limits>

#include "platform/unicode.h"
#include "platform/windows/system_text.h"

namespace tendril {
namespace {

constexpr std::size_t kConsoleUnits = 8192;  // more at once fails on older systems

HANDLE HandleOf(Stream stream) {
  switch (stream) {
    case Stream::kInput:
      return ::GetStdHandle(STD_INPUT_HANDLE);
    case Stream::kOutput:
      return ::GetStdHandle(STD_OUTPUT_HANDLE);
    case Stream::kError:
      break;
  }
  return ::GetStdHandle(STD_ERROR_HANDLE);
}

std::error_code LastFault() {
  const auto number = static_cast<int>(::GetLastError());
  if (number == ERROR_OPERATION_ABORTED) return std::make_error_code(std::errc::interrupted);
  return {number, std::system_category()};
}

// While it lives, a console that can do so takes escape sequences. The console is the shell's, too.
class EscapeSequences {
 public:
  explicit EscapeSequences(HANDLE console) : console_(console) {
    is_console_ = ::GetConsoleMode(console_, &before_) != 0;
    understood_ = is_console_ && ::SetConsoleMode(console_, before_ | ENABLE_PROCESSED_OUTPUT |
                                                                ENABLE_VIRTUAL_TERMINAL_PROCESSING) != 0;
  }
  ~EscapeSequences() {
    if (understood_) ::SetConsoleMode(console_, before_);
  }
  EscapeSequences(const EscapeSequences&) = delete;
  EscapeSequences& operator=(const EscapeSequences&) = delete;

  bool Understood() const { return understood_; }

 private:
  HANDLE console_;
  DWORD before_ = 0;
  bool is_console_ = false;
  bool understood_ = false;
};

// As UTF-16: the bytes would be taken for characters of the console's code page.
std::error_code WriteToConsole(HANDLE console, std::string_view text) {
  const EscapeSequences sequences(console);
  const std::u16string units = Utf16(text);
  for (std::u16string_view left = units; !left.empty();) {
    std::size_t count = std::min(left.size(), kConsoleUnits);
    const bool cuts_a_character = count < left.size() && (left[count] & 0xFC00) == 0xDC00;
    if (cuts_a_character) --count;
    DWORD written = 0;
    if (::WriteConsoleW(console, left.data(), static_cast<DWORD>(count), &written, nullptr) == 0)
      return LastFault();
    left.remove_prefix(written);
  }
  return {};
}

std::error_code WriteBytes(HANDLE file, std::string_view text) {
  while (!text.empty()) {
    const auto count = std::min<std::size_t>(text.size(), std::numeric_limits<DWORD>::max());
    DWORD written = 0;
    if (::WriteFile(file, text.data(), static_cast<DWORD>(count), &written, nullptr) == 0) return LastFault();
    text.remove_prefix(written);
  }
  return {};
}

}  // namespace

void PrepareStreams() { ::_setmode(::_fileno(stdin), _O_BINARY); }

bool IsTerminal(Stream stream) {
  DWORD mode = 0;
  return ::GetConsoleMode(HandleOf(stream), &mode) != 0;
}

// What can be seen of the lines, which may be longer.
int TerminalColumns(Stream stream) {
  CONSOLE_SCREEN_BUFFER_INFO about = {};
  if (::GetConsoleScreenBufferInfo(HandleOf(stream), &about) == 0) return 0;
  return std::min<int>(about.srWindow.Right - about.srWindow.Left + 1, about.dwSize.X);
}

bool TerminalHasColours(Stream stream) { return EscapeSequences(HandleOf(stream)).Understood(); }

std::error_code WriteAll(Stream stream, std::string_view text) {
  const HANDLE handle = HandleOf(stream);
  return IsTerminal(stream) ? WriteToConsole(handle, text) : WriteBytes(handle, text);
}

std::string ReasonText(const std::error_code& fault) {
  const bool of_the_system = fault.category() == std::system_category();
  return of_the_system ? SystemText(static_cast<std::uint32_t>(fault.value())) : fault.message();
}

void DropTypedInput() { ::FlushConsoleInputBuffer(HandleOf(Stream::kInput)); }

}  // namespace tendril
