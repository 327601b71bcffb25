// SerialHold: a serial device, opened for this program alone.
#pragma once

#include <filesystem>
#include <string>

namespace tendril {

// Opens a device and claims it for its lifetime.
//
// The claim is a lock, because the superuser passes the exclusive mode of a device in use. For other users, opening a
// device in exclusive mode fails before it touches the line. Any other opening raises DTR and RTS, before the lock is
// checked.
class SerialHold {
 public:
  // Raises kErrInvalidPort (no such device), kErrPortAlreadyOpen (in use) or kErrNotAllowed (with the remedy).
  explicit SerialHold(const std::filesystem::path& device);
  ~SerialHold();
  SerialHold(const SerialHold&) = delete;
  SerialHold& operator=(const SerialHold&) = delete;

  // The open device; non-blocking.
  int descriptor() const { return descriptor_; }

 private:
  explicit SerialHold(int descriptor) : descriptor_(descriptor) {}

  int descriptor_;
};

// Who may use a device.
struct DeviceAccess {
  std::string device;
  std::string group;            // the group that owns the device
  bool group_may_use = false;   // may read and write the device
  std::string user;             // that runs the program
  bool user_is_member = false;  // of the group
};

// Why the device is not available, and the remedy, for the user.
std::string ExplainNotAllowed(const DeviceAccess& access);

}  // namespace tendril
