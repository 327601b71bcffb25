#include "platform/posix/serial_hold.h"

#include <fcntl.h>
#include <grp.h>
#include <pwd.h>
#include <sys/file.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <system_error>

#include "platform/posix/proc_folders.h"
#include "platform/runtime_error.h"

namespace tendril {
namespace {

namespace fs = std::filesystem;

RuntimeError Busy(const fs::path& device) {
  return {kErrPortAlreadyOpen, device.string() + " is in use by another program."};
}

RuntimeError NoSuchDevice(const fs::path& device) {
  return {kErrInvalidPort, "There is no serial device at " + device.string() + "."};
}

DeviceAccess LookUpAccess(const fs::path& device) {
  DeviceAccess access;
  access.device = device.string();

  struct stat about {};
  ::stat(device.c_str(), &about);
  constexpr mode_t kGroupReadWrite = S_IRGRP | S_IWGRP;
  access.group_may_use = (about.st_mode & kGroupReadWrite) == kGroupReadWrite;
  const passwd* user = ::getpwuid(::geteuid());
  if (user != nullptr) access.user = user->pw_name;
  const group* owner = ::getgrgid(about.st_gid);
  access.group = owner != nullptr ? owner->gr_name : std::to_string(about.st_gid);
  if (user != nullptr && owner != nullptr) {
    for (char** member = owner->gr_mem; *member != nullptr; ++member) {
      access.user_is_member = access.user_is_member || access.user == *member;
    }
  }
  return access;
}

int OpenDevice(const fs::path& device) {
  // Non-blocking: otherwise opening waits for a modem's carrier.
  const int descriptor = ::open(device.c_str(), O_RDWR | O_NOCTTY | O_NONBLOCK | O_CLOEXEC);
  if (descriptor >= 0) return descriptor;
  switch (errno) {
    case EACCES:
    case EPERM:
      throw RuntimeError(kErrNotAllowed, ExplainNotAllowed(LookUpAccess(device)));
    case EBUSY:
      throw Busy(device);
    case ENOENT:
    case ENOTDIR:
    case ENODEV:
    case ENXIO:
    case EIO:  // the far end of a pseudo-terminal is gone
      throw NoSuchDevice(device);
    default:
      throw RuntimeError(kErrInvalidPort, device.string() + " cannot be opened: " +
                                              std::generic_category().message(errno) + ".");
  }
}

#ifdef TIOCGEXCL
// Only the superuser can open a device in exclusive mode. The mode of a pseudo-terminal outlives a program that was
// killed, so it means "in use" only while another program has the device open.
bool HeldExclusively(const fs::path& device, int own) {
  int exclusive = 0;
  return ::ioctl(own, TIOCGEXCL, &exclusive) == 0 && exclusive != 0 && ProcessWithOpen(device) != 0;
}
#else
bool HeldExclusively(const fs::path& /*device*/, int /*own*/) { return false; }
#endif

}  // namespace

SerialHold::SerialHold(const fs::path& device) : SerialHold(OpenDevice(device)) {
  if (::isatty(descriptor_) == 0) throw NoSuchDevice(device);
  if (::flock(descriptor_, LOCK_EX | LOCK_NB) != 0 && errno == EWOULDBLOCK) throw Busy(device);
  if (HeldExclusively(device, descriptor_)) throw Busy(device);
}

SerialHold::~SerialHold() { ::close(descriptor_); }

std::string ExplainNotAllowed(const DeviceAccess& access) {
  const std::string text =
      "You are not allowed to use " + access.device + ". It belongs to the group \"" + access.group + "\"";
  // The superuser's own group opens far more than a serial port: never advise to join it.
  if (!access.group_may_use || access.group == "root" || access.group == "wheel") {
    return text +
           ", and joining that group is not advised: ask the administrator of this computer for access.";
  }
  if (access.user_is_member) {
    return text + ", which you have joined: log out and in again for that to take effect.";
  }
  const std::string user = access.user.empty() ? "YOUR-USER-NAME" : access.user;
#ifdef __APPLE__
  const std::string command = "sudo dseditgroup -o edit -a " + user + " -t user " + access.group;
#else
  const std::string command = "sudo usermod -aG " + access.group + " " + user;
#endif
  return text + ": run \"" + command + "\", then log out and in again.";
}

}  // namespace tendril
