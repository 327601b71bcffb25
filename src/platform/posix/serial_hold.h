// SerialHold: a serial device kept for this program alone.
#pragma once

#include <filesystem>
#include <string>

namespace tendril {

// Opens a device and claims it for its lifetime.
//
// The claim is a lock: the superuser passes the exclusive mode that keeps everybody else out of a device in use. An
// ordinary user's claim on a device in exclusive mode fails before it touches the line. Opening a device that is
// not in exclusive mode raises its DTR and RTS, as the system does at every opening, before the lock is looked at.
class SerialHold {
 public:
  // Raises kErrInvalidPort (no such device), kErrPortAlreadyOpen (in use) or kErrNotAllowed (with what to do about
  // it).
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

// What keeps a user from a device.
struct DeviceAccess {
  std::string device;
  std::string group;            // the group that owns the device
  bool group_may_use = false;   // whether that group may read and write it
  std::string user;             // who runs the program
  bool user_is_member = false;  // whether that user belongs to the group by now
};

// Says in plain words why the device is not available and what to do about it.
std::string ExplainNotAllowed(const DeviceAccess& access);

}  // namespace tendril
