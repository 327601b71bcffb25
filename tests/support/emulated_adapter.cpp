#include "support/emulated_adapter.h"

#include <asm/termbits.h>
#include <dlfcn.h>
#include <linux/serial.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <sys/sysmacros.h>
#include <unistd.h>

#include <cerrno>
#include <cstdarg>

namespace tendril::test {
namespace {

int adapter_descriptor = -1;  // that was set up as a serial port last
std::uint64_t reads = 0;

// Descriptors are used again for other files.
bool IsAdapter(int descriptor) {
  constexpr unsigned kFirstPseudoTerminal = 136, kLastPseudoTerminal = 143;
  struct stat about {};
  return descriptor >= 0 && descriptor == adapter_descriptor && ::fstat(descriptor, &about) == 0 &&
         S_ISCHR(about.st_mode) && major(about.st_rdev) >= kFirstPseudoTerminal &&
         major(about.st_rdev) <= kLastPseudoTerminal;
}

EmulatedAdapter::LineSettings Decode(const termios2& settings) {
  return {.baud = settings.c_ospeed,
          .data_bits = 5 + static_cast<int>((settings.c_cflag & CSIZE) / CS6),
          .parity = (settings.c_cflag & PARENB) != 0,
          .stop_bits = (settings.c_cflag & CSTOPB) != 0 ? 2 : 1,
          .handshaking = (settings.c_cflag & CRTSCTS) != 0 || (settings.c_iflag & (IXON | IXOFF)) != 0,
          .receives_without_carrier = (settings.c_cflag & (CREAD | CLOCAL)) == (CREAD | CLOCAL),
          .reads_at_once = settings.c_cc[VMIN] == 0 && settings.c_cc[VTIME] == 0};
}

int TurnRts(int descriptor, bool asserted) {
  EmulatedAdapter& adapter = Adapter();
  int error = adapter.rts_error ? adapter.rts_error(asserted) : 0;
  timespec at_once = {};
  pollfd state = {descriptor, 0, 0};
  if (::ppoll(&state, 1, &at_once, nullptr) > 0 && (state.revents & POLLHUP) != 0) error = EIO;
  if (error != 0) {
    errno = error;
    return -1;
  }
  adapter.rts.push_back(asserted);
  return 0;
}

}  // namespace

EmulatedAdapter& Adapter() {
  static EmulatedAdapter adapter;
  return adapter;
}

namespace {

// The calls as they are without this file.
template <typename Function>
Function* Real(const char* name) {
  return reinterpret_cast<Function*>(::dlsym(RTLD_NEXT, name));
}

int RealIoctl(int descriptor, unsigned long request, void* argument) {
  static auto* const real = Real<int(int, unsigned long, ...)>("ioctl");
  return real(descriptor, request, argument);
}

int AdapterIoctl(int descriptor, unsigned long request, void* argument) {
  EmulatedAdapter& adapter = Adapter();
  switch (request) {
    case TIOCMBIS:
    case TIOCMBIC:
      if (*static_cast<int*>(argument) != TIOCM_RTS) break;
      return TurnRts(descriptor, request == TIOCMBIS);
    case TIOCGSERIAL:
      *static_cast<serial_struct*>(argument) = {};
      return 0;
    case TIOCSSERIAL:
      adapter.low_latency = (static_cast<serial_struct*>(argument)->flags & ASYNC_LOW_LATENCY) != 0;
      return 0;
    case TCFLSH:
      adapter.flushes.push_back(static_cast<int>(reinterpret_cast<std::intptr_t>(argument)));
      break;
    case TIOCOUTQ:
      *static_cast<int*>(argument) = adapter.queued_output;
      return 0;
    case TCGETS2: {
      const int result = RealIoctl(descriptor, request, argument);
      if (adapter.fixed_baud != 0) static_cast<termios2*>(argument)->c_ospeed = adapter.fixed_baud;
      return result;
    }
    default:
      break;
  }
  return RealIoctl(descriptor, request, argument);
}

}  // namespace
}  // namespace tendril::test

extern "C" int ioctl(int descriptor, unsigned long request, ...) noexcept {
  using namespace tendril::test;
  va_list arguments;
  va_start(arguments, request);
  void* const argument = va_arg(arguments, void*);
  va_end(arguments);
  if (request == TCSETS2) {
    adapter_descriptor = descriptor;
    if (IsAdapter(descriptor)) Adapter().settings.push_back(Decode(*static_cast<termios2*>(argument)));
  }
  return IsAdapter(descriptor) ? AdapterIoctl(descriptor, request, argument)
                               : RealIoctl(descriptor, request, argument);
}

extern "C" ssize_t read(int descriptor, void* buffer, std::size_t size) {
  using namespace tendril::test;
  static auto* const real = Real<ssize_t(int, void*, std::size_t)>("read");
  if (!IsAdapter(descriptor)) return real(descriptor, buffer, size);
  EmulatedAdapter& adapter = Adapter();
  const bool empty = adapter.empty_read_every != 0 && ++reads % adapter.empty_read_every == 0;
  const ssize_t got = empty ? 0 : real(descriptor, buffer, size);
  if (got == 0) {
    ++adapter.empty_reads;
    errno = EAGAIN;  // an old one: the read itself did not fail
  }
  return got;
}

extern "C" ssize_t write(int descriptor, const void* bytes, std::size_t size) {
  using namespace tendril::test;
  static auto* const real = Real<ssize_t(int, const void*, std::size_t)>("write");
  if (!IsAdapter(descriptor) || Adapter().write_error == 0) return real(descriptor, bytes, size);
  errno = Adapter().write_error;
  return -1;
}

extern "C" int poll(pollfd* states, nfds_t count, int timeout_ms) {
  using namespace tendril::test;
  static auto* const real = Real<int(pollfd*, nfds_t, int)>("poll");
  if (count == 1 && IsAdapter(states->fd) && Adapter().gone_silently) {
    states->revents = POLLHUP;
    return 1;
  }
  return real(states, count, timeout_ms);
}
