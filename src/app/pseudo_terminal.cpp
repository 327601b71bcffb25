#include "app/pseudo_terminal.h"

#include <fcntl.h>
#include <sys/select.h>
#include <termios.h>
#include <unistd.h>
#ifdef __linux__
#include <sys/inotify.h>
#include <sys/ioctl.h>
#endif

#include <cerrno>
#include <cstdlib>
#include <stdexcept>
#include <system_error>

#include "platform/posix/proc_folders.h"

namespace tendril {
namespace {

namespace fs = std::filesystem;

constexpr speed_t kSpeed = B19200;

int Checked(int result, const char* what) {
  if (result < 0) throw std::system_error(errno, std::generic_category(), what);
  return result;
}

bool IsPseudoTerminal(const fs::path& device) {
  const std::string name = device.string();
#ifdef __APPLE__
  return name.starts_with("/dev/ttys");
#else
  return name.starts_with("/dev/pts/");
#endif
}

}  // namespace

PseudoTerminal::PseudoTerminal() {
  constexpr char kNone[] = "The system has no pseudo-terminal left";
  try {
    far_end_ = Checked(::posix_openpt(O_RDWR | O_NOCTTY), kNone);
    Checked(::grantpt(far_end_), kNone);
    Checked(::unlockpt(far_end_), kNone);
    Checked(::fcntl(far_end_, F_SETFL, O_NONBLOCK), kNone);
    Checked(::fcntl(far_end_, F_SETFD, FD_CLOEXEC), kNone);
    device_ = ::ptsname(far_end_);
    near_end_ = Checked(::open(device_.c_str(), O_RDWR | O_NOCTTY | O_NONBLOCK | O_CLOEXEC), kNone);
    MakeRaw();
  } catch (...) {
    if (far_end_ >= 0) ::close(far_end_);
    throw;
  }
#ifdef __linux__
  closings_ = ::inotify_init1(IN_NONBLOCK | IN_CLOEXEC);
  if (closings_ >= 0) ::inotify_add_watch(closings_, device_.c_str(), IN_CLOSE);
#endif
}

PseudoTerminal::~PseudoTerminal() {
  if (closings_ >= 0) ::close(closings_);
  ::close(near_end_);
  ::close(far_end_);
}

void PseudoTerminal::MakeRaw() const {
  termios settings = {};
  ::tcgetattr(near_end_, &settings);
  ::cfmakeraw(&settings);
  settings.c_cc[VMIN] = 1;
  settings.c_cc[VTIME] = 0;
  ::cfsetispeed(&settings, kSpeed);
  ::cfsetospeed(&settings, kSpeed);
  ::tcsetattr(near_end_, TCSANOW, &settings);
}

Bytes PseudoTerminal::Read() const {
  Bytes bytes(4096);
  const ssize_t got = ::read(far_end_, bytes.data(), bytes.size());
  bytes.resize(got > 0 ? static_cast<std::size_t>(got) : 0);
  return bytes;
}

bool PseudoTerminal::Write(std::span<const std::uint8_t> bytes) const {
  return ::write(far_end_, bytes.data(), bytes.size()) == static_cast<ssize_t>(bytes.size());
}

void PseudoTerminal::WaitForInput(std::chrono::microseconds time) const {
  fd_set readable;
  FD_ZERO(&readable);
  FD_SET(far_end_, &readable);
  const timespec limit = {.tv_sec = 0, .tv_nsec = static_cast<long>(time.count()) * 1000};
  ::pselect(far_end_ + 1, &readable, nullptr, nullptr, &limit, nullptr);
}

#ifdef __linux__

void PseudoTerminal::ForgetClosings() const {
  alignas(inotify_event) char events[4096];
  while (::read(closings_, events, sizeof events) > 0) {
  }
}

bool PseudoTerminal::ProgramHasGone() const {
  ForgetClosings();
  if (ProcessWithOpen(device_) != 0) return false;
  ::tcflush(near_end_, TCIOFLUSH);
  ::tcflush(far_end_, TCIFLUSH);
  // A program that was killed leaves its exclusive mode behind, which would keep every other one out.
  ::ioctl(near_end_, TIOCNXCL);
  MakeRaw();
  return true;
}

#else

void PseudoTerminal::ForgetClosings() const {}
bool PseudoTerminal::ProgramHasGone() const { return false; }

#endif

DeviceLink::DeviceLink(const fs::path& link, const fs::path& device)
    : link_(fs::absolute(link)), device_(device) {
  const fs::path folder = link_.parent_path();
  std::error_code error;
  fs::create_directories(folder, error);
  if (error) {
    throw std::runtime_error("The folder " + folder.string() + " cannot be made: " + error.message() + ".");
  }
  const fs::file_status present = fs::symlink_status(link_, error);
  if (fs::exists(present)) {
    if (!fs::is_symlink(present)) {
      throw std::runtime_error(link_.string() +
                               " exists and is no link. Move it away, or choose another --link.");
    }
    replaced_ = fs::read_symlink(link_, error);
    if (fs::exists(link_, error) && !IsPseudoTerminal(replaced_)) {
      throw std::runtime_error(link_.string() + " is a link to " + replaced_.string() +
                               ". Remove it, or choose another --link.");
    }
  }
  // Made beside and moved over, so that there is no moment without the link.
  const fs::path beside = link_.string() + "." + std::to_string(::getpid());
  fs::create_symlink(device_, beside, error);
  if (!error) fs::rename(beside, link_, error);
  if (error) {
    std::error_code ignored;
    fs::remove(beside, ignored);
    throw std::runtime_error("The link " + link_.string() + " cannot be made: " + error.message() + ".");
  }
}

DeviceLink::~DeviceLink() {
  std::error_code ignored;
  if (fs::read_symlink(link_, ignored) == device_) fs::remove(link_, ignored);
}

}  // namespace tendril
