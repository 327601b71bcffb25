// SerialDevice: the platform's serial port, chosen by number.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <span>
#include <string>

#include "platform/bytes.h"

namespace tendril {

// What the device tells its owner.
enum class SerialEvent {
  kDataReceived,     // at least as many bytes wait as the receive threshold says
  kReceiveOverflow,  // the input buffer is full; what is beyond it is lost
  kDeviceLost,       // the device went away (unplugged): it has closed itself, and says so once
  kLineError         // break, framing, overrun, parity
};

// How the port is run, apart from its speed.
struct LineOptions {
  bool handshaking = false;
  bool binary_input = true;
  bool discard_nul = false;               // the protocol lives on zero bytes
  std::int32_t transmit_threshold = 0;    // 0: no event on transmit
  std::int32_t input_buffer_size = 4050;  // bytes
  std::int32_t receive_threshold = 4000;  // bytes that must wait before kDataReceived comes; 0: never
};

// One serial port. Operations that need an open port raise kErrPortNotOpen (8012) on a closed one. Events are
// delivered from the event loop, never from inside one of these calls, and none after Close() or destruction.
class SerialDevice {
 public:
  virtual ~SerialDevice() = default;

  // Who gets the events; one owner.
  virtual void SetEventHandler(std::function<void(SerialEvent)> handler) = 0;

  // Whether a device stands behind port `number` (1 = the first). Does not open it.
  virtual bool Exists(std::int32_t number) const = 0;

  // Which device stands behind port `number`, for a person: what its maker calls it, as far as that is known,
  // and its path, as in "FT232R USB UART, FTDI, /dev/ttyUSB0". Empty when there is none. Does not open it.
  virtual std::string Describe(std::int32_t number) const = 0;

  // The settings text, "speed,parity,data bits,stop bits" as in "19200,N,8,1". Raises
  // kErrInvalidPropertyValue for a text without a speed and kErrSettingsRefused for one that the port cannot
  // do.
  virtual void SetSettings(const std::string& settings) = 0;
  // The port that Open() opens. Raises kErrInvalidPropertyValue unless 1 or more.
  virtual void SetPortNumber(std::int32_t number) = 0;
  virtual void SetLineOptions(const LineOptions& options) = 0;

  // Opens the port for this program alone. Raises kErrInvalidPort (no such device), kErrPortAlreadyOpen
  // (another program, or this one, has it), kErrNotAllowed (with what to do about it) or kErrSettingsRefused.
  virtual void Open() = 0;
  // Never fails; does nothing on a closed port. What was queued to send or waits to be read is dropped.
  virtual void Close() noexcept = 0;
  // Whether it is open. A device that was lost counts as open until kDeviceLost has been told; what is written
  // until then goes nowhere, without a failure.
  virtual bool IsOpen() const = 0;

  // Bytes that must wait before kDataReceived comes; 1 tells of every byte, 0 of none.
  virtual void SetReceiveThreshold(std::int32_t bytes) = 0;
  virtual void SetTransmitThreshold(std::int32_t bytes) = 0;

  // Asserts or clears RTS, which turns the line driver of a half-duplex adapter on or off. A port that has no
  // RTS line ignores it.
  virtual void SetRts(bool asserted) = 0;

  // Queues all of `bytes` to be sent and starts sending at once; does not wait.
  virtual void Write(std::span<const std::uint8_t> bytes) = 0;
  // Takes all that has arrived up to this moment, also what the event loop has not seen yet.
  virtual Bytes ReadAll() = 0;
  // Drops all that has arrived up to this moment.
  virtual void ClearInput() = 0;
  // Bytes handed to Write() that have not left for the wire yet, in this program and in the system.
  virtual std::size_t PendingOutput() const = 0;
};

}  // namespace tendril
