// SerialHold: a serial device kept for this program alone, and the few things that only the system knows of
// it. Each system compiles its own implementation: posix/ or windows/.
#pragma once

#include <cstddef>
#include <filesystem>
#include <string>

namespace tendril {

// Claims a device for its lifetime. Make it before the device is opened for traffic: a claim that fails has
// not touched the line of the program that has the device.
//
// Linux and macOS keep a second descriptor on the device and lock it. The lock is there because the
// superuser passes the exclusive mode that holds everybody else off. Windows opens every serial port
// exclusively by itself, so there the claim is empty.
class SerialHold {
 public:
  // Raises kErrInvalidPort (no such device), kErrPortAlreadyOpen (somebody has it) or kErrNotAllowed (with
  // what to do about it).
  explicit SerialHold(const std::filesystem::path& device);
  ~SerialHold();
  SerialHold(const SerialHold&) = delete;
  SerialHold& operator=(const SerialHold&) = delete;

  // Whether the device has gone away since.
  bool DeviceGone() const;

  // Bytes that the system has taken over and not sent yet. 0 where the system does not say.
  std::size_t QueuedOutput() const;

  // Asks the driver to hand received bytes on at once: some adapters gather them for 16 ms otherwise. Call it
  // when the speed is set. A driver that cannot is left as it is.
  void AskForLowLatency() const;

 private:
  explicit SerialHold(int descriptor) : descriptor_(descriptor) {}

  std::filesystem::path device_;          // what Windows asks about
  [[maybe_unused]] int descriptor_ = -1;  // what the others ask
};

#ifndef _WIN32
// What keeps a person from a device.
struct DeviceAccess {
  std::string device;
  std::string group;            // the group that owns the device
  bool group_may_use = false;   // whether that group may read and write it
  std::string user;             // who runs the program
  bool user_is_member = false;  // whether that user belongs to the group by now
};

// Says in plain words why the device is not to be had and what to do about it.
std::string ExplainNotAllowed(const DeviceAccess& access);
#endif

}  // namespace tendril
