// SerialPort: one open serial port, as the operating system gives it.
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>

namespace tendril {

// A port for this program alone, set to raw bytes with 8 data bits, no parity, one stop bit and no handshaking. No call
// waits for the far end.
class SerialPort {
 public:
  // Drops what waits in either direction, and closes the port.
  virtual ~SerialPort() = default;

  // Moves what has arrived into `buffer` and returns how many bytes. 0: there is nothing, or the device has gone.
  virtual std::size_t Read(std::span<std::uint8_t> buffer) = 0;
  // Hands over as many of `bytes` as the system takes now, and returns how many. Raises kErrDeviceIo.
  virtual std::size_t Write(std::span<const std::uint8_t> bytes) = 0;
  // Whether the port reports when the system can take more.
  virtual void NotifyWritable(bool enabled) = 0;
  // Bytes that the system has taken and not sent yet.
  virtual std::size_t QueuedOutput() const = 0;
  // Drops what has arrived and was not read.
  virtual void ClearInput() = 0;
  // Asserts or clears RTS; false when the device has no such line. Raises kErrDeviceIo when it does not obey.
  virtual bool SetRts(bool asserted) = 0;
  // Whether the device has gone away.
  virtual bool HungUp() const = 0;
};

}  // namespace tendril
