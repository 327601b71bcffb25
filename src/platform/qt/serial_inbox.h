// SerialInbox: what has arrived on a serial port, and the events that its owner has not had yet.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <span>

#include "platform/bytes.h"
#include "platform/qt/mailbox.h"
#include "platform/serial_device.h"

namespace tendril {

// The part of a serial device that is the same on every system.
class SerialInbox {
 public:
  // `close` closes the adapter's port; it is called right before kDeviceLost is delivered. `on_fault` gets failures of
  // the event handler.
  SerialInbox(FaultHandler on_fault, std::function<void()> close);

  // As in SerialDevice.
  void SetEventHandler(std::function<void(SerialEvent)> handler);
  void SetReceiveThreshold(std::int32_t bytes);

  // Free room in the input buffer, in bytes.
  std::size_t Room() const { return kSerialInputBufferBytes - input_.size(); }
  // Adds bytes that have arrived. What the buffer has no room for is lost, and reported.
  void Add(std::span<const std::uint8_t> bytes);
  // Takes all that is in the buffer.
  Bytes Take();

  // Reports that the device has gone.
  void PostLoss();
  bool LossPosted() const { return loss_posted_; }

  // The port was closed: drops the input and all events.
  void Reset();

 private:
  bool HasEnough() const;
  // Posts kDataReceived when as much waits as the threshold asks for.
  void PostIfEnough();
  void Deliver(SerialEvent event);

  std::function<void()> close_;
  std::function<void(SerialEvent)> handler_;
  std::int32_t receive_threshold_ = 0;
  Bytes input_;  // at most kSerialInputBufferBytes

  // Posted and not delivered yet.
  bool data_posted_ = false;
  bool overflow_posted_ = false;
  bool loss_posted_ = false;
  Mailbox mailbox_;
};

}  // namespace tendril
