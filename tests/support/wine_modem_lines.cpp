// Gives pseudo-terminals the modem lines that wine asks a serial port for. A library of Linux, for LD_PRELOAD: it takes
// ioctl(), tcsetattr(), read() and open() of wine's processes, and all other calls pass unchanged.
//
//   g++ -shared -fPIC -o wine_modem_lines.so wine_modem_lines.cpp
//   LD_PRELOAD=$PWD/wine_modem_lines.so TENDRIL_PORT_NOTES=$PWD/notes wine64 program.exe
//
// TENDRIL_PORT_NOTES names a file that gets a line for each turn of RTS, "rts 1" or "rts 0", and for each change of the
// settings, as in "settings 19200 8 0 1 0": baud, data bits, parity, stop bits, handshaking.
#include <dlfcn.h>
#include <fcntl.h>
#include <linux/serial.h>
#include <sys/file.h>
#include <sys/ioctl.h>
#include <sys/poll.h>
#include <sys/stat.h>
#include <sys/sysmacros.h>
#include <termios.h>
#include <unistd.h>

#include <cerrno>
#include <cstdarg>
#include <cstdio>
#include <cstdlib>

namespace {

constexpr int kOutputs = TIOCM_DTR | TIOCM_RTS;
constexpr int kInputs = TIOCM_CTS | TIOCM_DSR | TIOCM_CAR;  // the device at the other end is ready

int lines = kInputs | kOutputs;  // of the only serial port that a process has open

bool IsPseudoTerminal(int descriptor) {
  constexpr unsigned kFirst = 136, kLast = 143;
  struct stat about {};
  return ::fstat(descriptor, &about) == 0 && S_ISCHR(about.st_mode) && major(about.st_rdev) >= kFirst &&
         major(about.st_rdev) <= kLast;
}

bool HungUp(int descriptor) {
  pollfd state = {descriptor, 0, 0};
  return ::poll(&state, 1, 0) > 0 && (state.revents & POLLHUP) != 0;
}

void Note(const char* format, ...) {
  const char* const notes = std::getenv("TENDRIL_PORT_NOTES");
  const int file = notes == nullptr ? -1 : ::open(notes, O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC, 0644);
  if (file < 0) return;
  va_list arguments;
  va_start(arguments, format);
  ::vdprintf(file, format, arguments);
  va_end(arguments);
  ::close(file);
}

void SetOutputs(int outputs) {
  lines = kInputs | (outputs & kOutputs);
  Note("rts %d\n", (lines & TIOCM_RTS) != 0);
}

// Returns whether the request is one that a pseudo-terminal does not know.
bool Answer(unsigned long request, void* argument) {
  int* const bits = static_cast<int*>(argument);
  switch (request) {
    case TIOCMGET:
      *bits = lines;
      return true;
    case TIOCMSET:
      SetOutputs(*bits);
      return true;
    case TIOCMBIS:
      SetOutputs(lines | *bits);
      return true;
    case TIOCMBIC:
      SetOutputs(lines & ~*bits);
      return true;
    case TIOCGICOUNT:
      *static_cast<serial_icounter_struct*>(argument) = {};
      return true;
    case TIOCGSERIAL:
      *static_cast<serial_struct*>(argument) = {};
      return true;
    case TIOCSERGETLSR:
      *bits = TIOCSER_TEMT;
      return true;
    default:
      return false;
  }
}

template <typename Function>
Function* Real(const char* name) {
  return reinterpret_cast<Function*>(::dlsym(RTLD_NEXT, name));
}

}  // namespace

extern "C" int ioctl(int descriptor, unsigned long request, ...) noexcept {
  static auto* const real = Real<int(int, unsigned long, ...)>("ioctl");
  va_list arguments;
  va_start(arguments, request);
  void* const argument = va_arg(arguments, void*);
  va_end(arguments);
  // Wine's requests are few: "T" is the letter of the terminals'.
  if ((request >> 8) != 'T' || !IsPseudoTerminal(descriptor)) return real(descriptor, request, argument);
  if (HungUp(descriptor)) {
    errno = EIO;
    return -1;
  }
  return Answer(request, argument) ? 0 : real(descriptor, request, argument);
}

extern "C" int tcsetattr(int descriptor, int actions, const termios* settings) noexcept {
  static auto* const real = Real<int(int, int, const termios*)>("tcsetattr");
  const tcflag_t flags = settings->c_cflag;
  const int baud = ::cfgetospeed(settings) == B19200 ? 19200 : 0;  // or another
  const bool handshaking = (flags & CRTSCTS) != 0 || (settings->c_iflag & (IXON | IXOFF)) != 0;
  if (IsPseudoTerminal(descriptor)) {
    Note("settings %d %d %d %d %d\n", baud, 5 + static_cast<int>((flags & CSIZE) / CS6),
         (flags & PARENB) != 0, (flags & CSTOPB) != 0 ? 2 : 1, handshaking);
  }
  return real(descriptor, actions, settings);
}

// Wine takes a read that finds nothing for a loss, and a purge may come between its wait and its read.
extern "C" ssize_t read(int descriptor, void* buffer, std::size_t size) {
  static auto* const real = Real<ssize_t(int, void*, std::size_t)>("read");
  const ssize_t got = real(descriptor, buffer, size);
  if (got != 0 || size == 0 || !IsPseudoTerminal(descriptor) || HungUp(descriptor)) return got;
  errno = EAGAIN;
  return -1;
}

// The device is for one program alone, as on Windows; and it must not become wineserver's controlling terminal, since its
// loss would be a signal to wineserver.
extern "C" int open(const char* path, int flags, ...) {
  static auto* const real = Real<int(const char*, int, ...)>("open");
  va_list arguments;
  va_start(arguments, flags);
  const mode_t mode = (flags & (O_CREAT | O_TMPFILE)) != 0 ? va_arg(arguments, mode_t) : 0;
  va_end(arguments);
  const int descriptor = real(path, flags | O_NOCTTY, mode);
  if (descriptor < 0 || !IsPseudoTerminal(descriptor) || ::flock(descriptor, LOCK_EX | LOCK_NB) == 0)
    return descriptor;
  ::close(descriptor);
  errno = EACCES;
  return -1;
}
