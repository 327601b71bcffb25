// SerialDevice: the platform's serial port, chosen by number.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <span>
#include <string>

#include "platform/bytes.h"

namespace tendril {

// What a device reports to its owner.
enum class SerialEvent {
  kDataReceived,     // at least as many bytes wait as the receive threshold says
  kReceiveOverflow,  // the input buffer is full; what is beyond it is lost
  kDeviceLost        // the device went away (unplugged): it has closed itself; reported once
};

// What users call port `number`.
inline std::string CommName(std::int32_t number) { return "Comm " + std::to_string(number); }

// Received bytes that a device keeps for its owner at most.
inline constexpr std::size_t kSerialInputBufferBytes = 4050;

// One serial port, with 8 data bits, no parity, one stop bit and no handshaking; bytes of all values pass unchanged,
// zero too. Operations that need an open port raise kErrPortNotOpen (8012) on a closed one. Events are delivered
// from the event loop, never from inside one of these calls, and none after Close() or destruction. No call waits for
// the far end; a driver whose adapter has stalled may hold one for seconds all the same.
//
// A device that was lost counts as open until kDeviceLost has been delivered: what is written until then goes
// nowhere, without a failure, and what had arrived can be read.
class SerialDevice {
 public:
  virtual ~SerialDevice() = default;

  // Who gets the events; one owner.
  virtual void SetEventHandler(std::function<void(SerialEvent)> handler) = 0;

  // Whether a device stands behind port `number` (1 = the first). Opens nothing.
  virtual bool Exists(std::int32_t number) const = 0;

  // Which device stands behind port `number`, for the user: what its maker calls it, as far as that is known,
  // and its path, as in "FT232R USB UART, FTDI, /dev/ttyUSB0". Empty when there is none.
  virtual std::string Describe(std::int32_t number) const = 0;

  // Opens port `number` (1 or more) at `baud` bit/s for this program alone. Raises kErrInvalidPort (no such device),
  // kErrPortAlreadyOpen (another program, or this one, has it), kErrNotAllowed (with what to do about it) or
  // kErrSettingsRefused (the port cannot do this speed).
  virtual void Open(std::int32_t number, std::int32_t baud) = 0;
  // Never fails; does nothing on a closed port. What was queued to send or waits to be read is dropped.
  virtual void Close() noexcept = 0;

  // Bytes that must wait before kDataReceived comes: 1 reports every byte, 0 none. When enough wait already,
  // kDataReceived comes for them. Holds across opening and closing. Raises kErrInvalidPropertyValue below 0.
  virtual void SetReceiveThreshold(std::int32_t bytes) = 0;

  // Asserts or clears RTS, which turns the line driver of a half-duplex adapter on or off. A port that has no
  // RTS line ignores it. Raises kErrDeviceIo, with the system's reason, when the adapter does not obey.
  virtual void SetRts(bool asserted) = 0;

  // Queues all of `bytes` to be sent and starts sending at once; does not wait. Raises kErrDeviceIo, and queues
  // none of them, when the system refuses them (what waited is dropped too) or the device has not taken what it was
  // given for too long.
  virtual void Write(std::span<const std::uint8_t> bytes) = 0;
  // Takes all that has arrived up to this moment, also what the event loop has not seen yet; at most as much as
  // the input buffer holds, the rest stays for the next call.
  virtual Bytes ReadAll() = 0;
  // Drops all that has arrived up to this moment.
  virtual void ClearInput() = 0;
  // Bytes handed to Write() that have not left for the wire yet, in this program and in the system.
  virtual std::size_t PendingOutput() const = 0;
};

}  // namespace tendril
