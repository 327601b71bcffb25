// SerialDevice: the platform's serial port, chosen by number.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <span>
#include <string>

#include "platform/bytes.h"

namespace tendril {

// Events for the owner of a device.
enum class SerialEvent {
  kDataReceived,     // at least as many bytes wait as the receive threshold asks for
  kReceiveOverflow,  // the input buffer is full; further bytes are lost
  kDeviceLost        // the device was unplugged; the port is closed; reported once
};

// A program that may have a port open, as far as the system shows it to this user.
struct PortHolder {
  std::string program;       // empty: not known
  std::int64_t process = 0;  // its number; 0: the program runs, and perhaps has the port open

  friend bool operator==(const PortHolder&, const PortHolder&) = default;
};

// The device of a port, as far as the system knows it.
struct DeviceDescription {
  std::string adapter = {};  // the product's name
  std::string maker = {};
  std::string path = {};  // "/dev/ttyUSB0"

  // For the user: "FT232R USB UART (FTDI), /dev/ttyUSB0". Empty when nothing is known.
  std::string Text() const;
};

// What users call port `number`.
inline std::string CommName(std::int32_t number) { return "Comm " + std::to_string(number); }

// The size of a device's input buffer.
inline constexpr std::size_t kSerialInputBufferBytes = 4050;

// One serial port, with 8 data bits, no parity, one stop bit and no handshaking; bytes of all values pass unchanged,
// zero too. Operations that need an open port raise kErrPortNotOpen (8012) on a closed one. Events are delivered
// from the event loop, never from inside one of these calls, and none after Close() or destruction. No call waits for
// the far end; but the driver of a stalled adapter may delay one for seconds.
//
// A lost device counts as open until kDeviceLost is delivered. Until then writes are ignored without a failure, and what
// had arrived can be read.
class SerialDevice {
 public:
  virtual ~SerialDevice() = default;

  // Sets the one receiver of the events.
  virtual void SetEventHandler(std::function<void(SerialEvent)> handler) = 0;

  // Whether port `number` (1 = the first) has a device.
  virtual bool Exists(std::int32_t number) const = 0;

  // The device of port `number`; all is empty when there is none.
  virtual DeviceDescription Describe(std::int32_t number) const = 0;

  // Which other program has port `number` open, where the system reports it.
  virtual PortHolder Holder(std::int32_t /*number*/) const { return {}; }

  // From now on `handler` is called from the event loop when ports may have come or gone: at most once a second, and
  // only where the system reports it. nullptr ends that.
  virtual void WatchPorts(const std::function<void()>& /*handler*/) {}

  // Opens port `number` (1 or more) at `baud` bit/s for this program alone. Raises kErrInvalidPort (no such device),
  // kErrPortAlreadyOpen (another program, or this one, has it), kErrNotAllowed (with the remedy) or
  // kErrSettingsRefused (the port cannot do this speed).
  virtual void Open(std::int32_t number, std::int32_t baud) = 0;
  // Drops what is queued or waits to be read. Does nothing on a closed port.
  virtual void Close() noexcept = 0;

  // How many bytes must wait before kDataReceived is delivered: 1 reports every byte, 0 none. Also counts bytes that
  // wait already. Holds across opening and closing. Raises kErrInvalidPropertyValue below 0.
  virtual void SetReceiveThreshold(std::int32_t bytes) = 0;

  // Asserts or clears RTS, which turns the line driver of a half-duplex adapter on or off. A port without RTS ignores
  // it. Raises kErrDeviceIo, with the system's reason, when the adapter does not obey.
  virtual void SetRts(bool asserted) = 0;

  // Queues `bytes` and starts sending at once. Raises kErrDeviceIo, with nothing queued, when the system refuses them
  // (earlier output is dropped too), or when too much earlier output still waits.
  virtual void Write(std::span<const std::uint8_t> bytes) = 0;
  // Takes what has arrived up to now, also what the event loop has not seen yet; at most as much as the input buffer
  // holds.
  virtual Bytes ReadAll() = 0;
  // Drops what has arrived up to now.
  virtual void ClearInput() = 0;
  // Bytes passed to Write() that are not on the wire yet, in this program and in the system.
  virtual std::size_t PendingOutput() const = 0;
};

}  // namespace tendril
