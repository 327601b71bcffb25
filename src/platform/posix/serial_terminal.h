// SerialTerminal: an open serial port of Linux or macOS.
#pragma once

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <memory>
#include <span>

#include "platform/posix/serial_hold.h"

namespace tendril {

// A terminal device for this program alone, set to raw bytes with 8 data bits, no parity, one stop bit and no
// handshaking. No call waits for the device, also when it takes nothing. A driver may: that of a USB adapter which has
// stalled holds a turn of RTS, and the closing while output is queued, for seconds.
class SerialTerminal {
 public:
  // Opens `device` at `baud` bit/s; what had arrived before is dropped. Raises what SerialHold raises, and
  // kErrSettingsRefused when the device cannot do the speed.
  SerialTerminal(const std::filesystem::path& device, std::int32_t baud);
  // Drops what waits in either direction, and puts back the line settings that the device had.
  ~SerialTerminal();
  SerialTerminal(const SerialTerminal&) = delete;
  SerialTerminal& operator=(const SerialTerminal&) = delete;

  // For the event loop.
  int descriptor() const { return hold_.descriptor(); }

  // Puts what has arrived into `buffer` and returns how many bytes; 0 says no more than that there is nothing, be it
  // that the device has gone or not.
  std::size_t Read(std::span<std::uint8_t> buffer);
  // Hands over as many of `bytes` as the system takes now, and returns how many. Raises kErrDeviceIo.
  std::size_t Write(std::span<const std::uint8_t> bytes);
  // Bytes that the system has taken over and not sent yet.
  std::size_t QueuedOutput() const;
  // Drops what has arrived and was not read.
  void ClearInput();
  // Asserts or clears RTS; false when the device has no such line. Raises kErrDeviceIo when it does not obey.
  bool SetRts(bool asserted);
  // Whether the device has gone away.
  bool HungUp() const;

 private:
  struct Settings;

  explicit SerialTerminal(const std::filesystem::path& device);
  void Configure(std::int32_t baud);

  std::filesystem::path device_;
  SerialHold hold_;
  std::unique_ptr<Settings> before_;  // the settings that the device had; null until they are known
};

// The speed that a terminal device is set to, in bit/s; 0 when it does not say.
std::uint32_t LineSpeed(int descriptor);

}  // namespace tendril
