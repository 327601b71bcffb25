// PseudoTerminal: a serial device made by the kernel, seen from its far end; and DeviceLink, the name under
// which a program finds it.
#pragma once

#include <chrono>
#include <cstdint>
#include <filesystem>
#include <span>
#include <string>

#include "platform/bytes.h"
#include "platform/posix/serial_terminal.h"

namespace tendril {

// Programs may open and close the device as often as they like; it lasts as long as this object. Nothing here
// waits, apart from WaitForInput().
class PseudoTerminal {
 public:
  // Makes a device in raw mode at 19200 baud. Raises std::system_error when the system has none left.
  PseudoTerminal();
  ~PseudoTerminal();
  PseudoTerminal(const PseudoTerminal&) = delete;
  PseudoTerminal& operator=(const PseudoTerminal&) = delete;

  // What a program opens, as in "/dev/pts/3".
  const std::string& device() const { return device_; }
  // Readable when the program has sent something.
  int input_descriptor() const { return far_end_; }
  // Readable when a program has closed the device; -1 where the system does not report that.
  int closing_descriptor() const { return closings_; }

  // Takes what the program has sent.
  Bytes Read() const;
  // Sends to the program. False when it has not read for so long that no room is left; the bytes are lost
  // then.
  bool Write(std::span<const std::uint8_t> bytes) const;
  // Waits until the program has sent something, or for `time` (less than a second) if it does not.
  void WaitForInput(std::chrono::microseconds time) const;
  // The speed that the program has set, in bit/s; 0 when the system does not say.
  std::uint32_t ProgramBaud() const { return LineSpeed(near_end_); }

  // To be called when closing_descriptor() is readable. True when no program has the device open any more:
  // unread bytes, at either end, are dropped then, and the device is as at the beginning.
  bool ProgramHasGone() const;
  // Drops pending notifications of closing_descriptor(). To be called when this process itself has just closed the
  // device: the next program may be there already.
  void ForgetClosings() const;

 private:
  void MakeRaw() const;

  std::string device_;
  int far_end_ = -1;
  int near_end_ = -1;  // kept open, so that the device stays as it is when a program closes it
  int closings_ = -1;
};

// A symbolic link to a device, for as long as this object lasts.
class DeviceLink {
 public:
  // Makes `link` point to `device`, with the folders that it needs. A link that leads nowhere or to another
  // pseudo-terminal is replaced. Raises std::runtime_error for any other file there.
  DeviceLink(const std::filesystem::path& link, const std::filesystem::path& device);
  // Removes the link if it still points to the device.
  ~DeviceLink();
  DeviceLink(const DeviceLink&) = delete;
  DeviceLink& operator=(const DeviceLink&) = delete;

  // Where the link that was replaced pointed to; empty if there was none.
  const std::filesystem::path& replaced() const { return replaced_; }

 private:
  std::filesystem::path link_;
  std::filesystem::path device_;
  std::filesystem::path replaced_;
};

}  // namespace tendril
