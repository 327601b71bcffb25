#include "platform/posix/serial_terminal.h"

#include <poll.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <string>
#include <system_error>
#ifdef __APPLE__
#include <IOKit/serial/ioss.h>
#include <termios.h>
#else
#include <asm/termbits.h>  // any speed, which <termios.h> does not have; the two exclude each other
#include <linux/serial.h>
#endif

#include "platform/runtime_error.h"

namespace tendril {
namespace {

// A larger error makes bytes unreadable: it adds up over a byte's ten bits.
constexpr std::int64_t kMaxSpeedErrorPercent = 3;

std::string Reason(int error) { return std::generic_category().message(error); }

#ifdef __APPLE__

using SystemSettings = termios;

bool Load(int descriptor, termios& settings) { return ::tcgetattr(descriptor, &settings) == 0; }

bool Store(int descriptor, const termios& settings) {
  return ::tcsetattr(descriptor, TCSANOW, &settings) == 0;
}

bool StoreWithSpeed(int descriptor, termios& settings, std::int32_t baud) {
  if (!Store(descriptor, settings)) return false;
  speed_t speed = static_cast<speed_t>(baud);
  if (::ioctl(descriptor, IOSSIOSPEED, &speed) == 0) return true;
  ::cfsetspeed(&settings, speed);  // a pseudo-terminal
  return Store(descriptor, settings);
}

std::uint32_t Speed(const termios& settings) { return static_cast<std::uint32_t>(::cfgetospeed(&settings)); }

void Flush(int descriptor, int queues) { (void)::tcflush(descriptor, queues); }

void AskForLowLatency(int /*descriptor*/) {}

#else

using SystemSettings = termios2;

bool Load(int descriptor, termios2& settings) { return ::ioctl(descriptor, TCGETS2, &settings) == 0; }

bool Store(int descriptor, const termios2& settings) { return ::ioctl(descriptor, TCSETS2, &settings) == 0; }

bool StoreWithSpeed(int descriptor, termios2& settings, std::int32_t baud) {
  settings.c_cflag |= BOTHER | (BOTHER << IBSHIFT);
  settings.c_ispeed = settings.c_ospeed = static_cast<speed_t>(baud);
  return Store(descriptor, settings);
}

std::uint32_t Speed(const termios2& settings) { return settings.c_ospeed; }

void Flush(int descriptor, int queues) { (void)::ioctl(descriptor, TCFLSH, queues); }

// Some adapters gather received bytes for 16 ms by default. A driver that cannot change that is left as it is.
void AskForLowLatency(int descriptor) {
  serial_struct settings = {};
  if (::ioctl(descriptor, TIOCGSERIAL, &settings) != 0) return;
  settings.flags |= ASYNC_LOW_LATENCY;
  (void)::ioctl(descriptor, TIOCSSERIAL, &settings);
}

#endif

}  // namespace

struct SerialTerminal::Settings {
  SystemSettings values;
};

SerialTerminal::SerialTerminal(const std::filesystem::path& device) : device_(device), hold_(device) {
  (void)::ioctl(descriptor(), TIOCEXCL);
}

SerialTerminal::SerialTerminal(const std::filesystem::path& device, std::int32_t baud)
    : SerialTerminal(device) {
  Configure(baud);
  Flush(descriptor(), TCIOFLUSH);
  AskForLowLatency(descriptor());
}

SerialTerminal::~SerialTerminal() {
  // Otherwise closing waits until the system has sent its queue. (Drivers of USB adapters have another queue, which
  // cannot be emptied.)
  Flush(descriptor(), TCIOFLUSH);
  if (before_) (void)Store(descriptor(), before_->values);
  (void)::ioctl(descriptor(), TIOCNXCL);
}

void SerialTerminal::Configure(std::int32_t baud) {
  const auto refuse = [&](const std::string& reason) {
    if (HungUp()) {  // it has gone since it was opened
      throw RuntimeError(kErrInvalidPort, "There is no serial device at " + device_.string() + ".");
    }
    throw RuntimeError(kErrSettingsRefused, device_.string() + " cannot be set to " + std::to_string(baud) +
                                                " bit/s: " + reason + ".");
  };
  auto before = std::make_unique<Settings>();
  if (!Load(descriptor(), before->values)) refuse(Reason(errno));
  before_ = std::move(before);

  SystemSettings raw = before_->values;
  raw.c_iflag = 0;
  raw.c_oflag = 0;
  raw.c_lflag = 0;
  raw.c_cflag = (raw.c_cflag & HUPCL) | CS8 | CREAD | CLOCAL;
  raw.c_cc[VMIN] = 0;
  raw.c_cc[VTIME] = 0;
  if (!StoreWithSpeed(descriptor(), raw, baud)) refuse(Reason(errno));

  // A driver takes the nearest speed that it can do, and reports it.
  if (!Load(descriptor(), raw)) refuse(Reason(errno));
  const std::int64_t speed = Speed(raw);
  if (std::abs(speed - baud) * 100 > baud * kMaxSpeedErrorPercent) {
    refuse("the nearest that it does is " + std::to_string(speed));
  }
}

std::size_t SerialTerminal::Read(std::span<std::uint8_t> buffer) {
  const ssize_t got = ::read(descriptor(), buffer.data(), buffer.size());
  return got > 0 ? static_cast<std::size_t>(got) : 0;
}

std::size_t SerialTerminal::Write(std::span<const std::uint8_t> bytes) {
  const ssize_t taken = ::write(descriptor(), bytes.data(), bytes.size());
  if (taken >= 0) return static_cast<std::size_t>(taken);
  if (errno == EAGAIN || errno == EINTR) return 0;
  throw RuntimeError(kErrDeviceIo, device_.string() + " cannot be written to: " + Reason(errno) + ".");
}

std::size_t SerialTerminal::QueuedOutput() const {
  int bytes = 0;
  if (::ioctl(descriptor(), TIOCOUTQ, &bytes) != 0) return 0;
  return static_cast<std::size_t>(std::max(bytes, 0));
}

void SerialTerminal::ClearInput() { Flush(descriptor(), TCIFLUSH); }

bool SerialTerminal::SetRts(bool asserted) {
  int line = TIOCM_RTS;
  if (::ioctl(descriptor(), asserted ? TIOCMBIS : TIOCMBIC, &line) == 0) return true;
  if (errno == ENOTTY || errno == EINVAL) return false;
  throw RuntimeError(kErrDeviceIo, "RTS of " + device_.string() + " cannot be " +
                                       (asserted ? "asserted" : "cleared") + ": " + Reason(errno) + ".");
}

bool SerialTerminal::HungUp() const {
  pollfd state = {descriptor(), 0, 0};
  return ::poll(&state, 1, 0) > 0 && (state.revents & POLLHUP) != 0;
}

std::uint32_t LineSpeed(int descriptor) {
  SystemSettings settings;
  return Load(descriptor, settings) ? Speed(settings) : 0;
}

}  // namespace tendril
