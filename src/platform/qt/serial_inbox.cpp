#include "platform/qt/serial_inbox.h"

#include <algorithm>
#include <utility>

#include "platform/runtime_error.h"

namespace tendril {

SerialInbox::SerialInbox(FaultHandler on_fault, std::function<void()> close)
    : on_fault_(std::move(on_fault)), close_(std::move(close)) {}

void SerialInbox::SetEventHandler(std::function<void(SerialEvent)> handler) { handler_ = std::move(handler); }

void SerialInbox::SetReceiveThreshold(std::int32_t bytes) {
  if (bytes < 0) throw RuntimeError(kErrInvalidPropertyValue, "Invalid property value", "SerialDevice");
  receive_threshold_ = bytes;
  NoteWaiting();
}

void SerialInbox::Add(std::span<const std::uint8_t> bytes) {
  const std::size_t kept = std::min(Room(), bytes.size());
  input_.insert(input_.end(), bytes.begin(), bytes.begin() + static_cast<std::ptrdiff_t>(kept));
  if (kept < bytes.size()) {
    overflow_noted_ = true;
    PostDelivery();
  }
  NoteWaiting();
}

Bytes SerialInbox::Take() { return std::exchange(input_, {}); }

void SerialInbox::NoteLoss() {
  loss_noted_ = true;
  PostDelivery();
}

void SerialInbox::Reset() {
  input_.clear();
  data_noted_ = overflow_noted_ = loss_noted_ = false;
}

bool SerialInbox::EnoughWaits() const {
  return receive_threshold_ > 0 && input_.size() >= static_cast<std::size_t>(receive_threshold_);
}

void SerialInbox::NoteWaiting() {
  if (!EnoughWaits()) return;
  data_noted_ = true;
  PostDelivery();
}

void SerialInbox::PostDelivery() {
  if (std::exchange(delivery_posted_, true)) return;
  QMetaObject::invokeMethod(
      &context_, [this] { DeliverNext(); }, Qt::QueuedConnection);
}

std::optional<SerialEvent> SerialInbox::TakeNextEvent() {
  // What arrived may have been read since.
  if (std::exchange(data_noted_, false) && EnoughWaits()) return SerialEvent::kDataReceived;
  if (std::exchange(overflow_noted_, false)) return SerialEvent::kReceiveOverflow;
  if (loss_noted_) {
    close_();
    return SerialEvent::kDeviceLost;
  }
  return std::nullopt;
}

void SerialInbox::DeliverNext() {
  delivery_posted_ = false;
  const std::optional<SerialEvent> event = TakeNextEvent();
  if (data_noted_ || overflow_noted_ || loss_noted_) PostDelivery();
  if (!event || !handler_) return;

  // The handler may destroy this object: from here on only copies are used.
  const auto handler = handler_;
  const FaultHandler on_fault = on_fault_;
  CallGuarded(on_fault, [&] { handler(*event); });
}

}  // namespace tendril
