// SerialInbox: what has arrived on a serial port, and the events that the port's owner has not had yet.
#pragma once

#include <QObject>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <span>

#include "platform/bytes.h"
#include "platform/qt/fault_handler.h"
#include "platform/serial_device.h"

namespace tendril {

// The part of a serial device that is the same on every system. An adapter notes what happens to its port, from inside
// the signals of the event loop; the event loop delivers it later, one event at a time. So reception goes on while the
// owner shows a box, and the owner may do to the device what it likes inside an event, destroy it too.
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
  // Adds bytes that have arrived; what the buffer has no room for is lost, and reported.
  void Add(std::span<const std::uint8_t> bytes);
  // Takes all that is in the buffer.
  Bytes Take();

  // Notes that the device has gone.
  void NoteLoss();
  bool LossNoted() const { return loss_noted_; }

  // The port was closed: forgets the input and all events.
  void Reset();

 private:
  bool EnoughWaits() const;
  // Notes kDataReceived when as much waits as the threshold asks for.
  void NoteWaiting();
  void PostDelivery();
  // The next event that was noted, data before an overflow before a loss.
  std::optional<SerialEvent> TakeNextEvent();
  // Delivers one event and posts the delivery of the others.
  void DeliverNext();

  FaultHandler on_fault_;
  std::function<void()> close_;
  std::function<void(SerialEvent)> handler_;
  std::int32_t receive_threshold_ = 0;
  Bytes input_;  // at most kSerialInputBufferBytes

  // Noted and not delivered yet.
  bool data_noted_ = false;
  bool overflow_noted_ = false;
  bool loss_noted_ = false;
  bool delivery_posted_ = false;

  QObject context_;  // what is posted ends with this object
};

}  // namespace tendril
