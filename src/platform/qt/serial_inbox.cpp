#include "platform/qt/serial_inbox.h"

#include <algorithm>
#include <utility>

#include "platform/runtime_error.h"

namespace tendril {

SerialInbox::SerialInbox(FaultHandler on_fault, std::function<void()> close)
    : close_(std::move(close)), mailbox_(std::move(on_fault)) {}

void SerialInbox::SetEventHandler(std::function<void(SerialEvent)> handler) { handler_ = std::move(handler); }

void SerialInbox::SetReceiveThreshold(std::int32_t bytes) {
  if (bytes < 0) throw RuntimeError(kErrInvalidPropertyValue, "Invalid property value");
  receive_threshold_ = bytes;
  PostIfEnough();
}

void SerialInbox::Add(std::span<const std::uint8_t> bytes) {
  const std::size_t kept = std::min(Room(), bytes.size());
  input_.insert(input_.end(), bytes.begin(), bytes.begin() + static_cast<std::ptrdiff_t>(kept));
  PostIfEnough();
  if (kept == bytes.size() || std::exchange(overflow_posted_, true)) return;
  mailbox_.Post([this] {
    overflow_posted_ = false;
    Deliver(SerialEvent::kReceiveOverflow);
  });
}

Bytes SerialInbox::Take() { return std::exchange(input_, {}); }

void SerialInbox::PostLoss() {
  if (std::exchange(loss_posted_, true)) return;
  mailbox_.Post([this] {
    close_();
    Deliver(SerialEvent::kDeviceLost);
  });
}

void SerialInbox::Reset() {
  input_.clear();
  data_posted_ = overflow_posted_ = loss_posted_ = false;
  mailbox_.Clear();
}

bool SerialInbox::HasEnough() const {
  return receive_threshold_ > 0 && input_.size() >= static_cast<std::size_t>(receive_threshold_);
}

void SerialInbox::PostIfEnough() {
  if (!HasEnough() || std::exchange(data_posted_, true)) return;
  mailbox_.Post([this] {
    data_posted_ = false;
    if (HasEnough()) Deliver(SerialEvent::kDataReceived);  // what arrived may have been read since
  });
}

void SerialInbox::Deliver(SerialEvent event) {
  const auto handler = handler_;  // which may destroy this object
  if (handler) handler(event);
}

}  // namespace tendril
