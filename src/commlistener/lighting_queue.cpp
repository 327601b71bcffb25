#include "commlistener/lighting_queue.h"

#include <algorithm>
#include <limits>
#include <utility>

#include "commlistener/comm_frame.h"
#include "platform/runtime_error.h"

namespace tendril {
namespace {

constexpr std::size_t kRecordHeadSize = 4;
constexpr std::size_t kRecordAlignment = 4;
constexpr std::size_t kMostBatches = 200;

}  // namespace

void LightingQueue::Append(LightingRecordType type, std::span<const std::uint8_t> data) {
  if (data.size() > static_cast<std::size_t>(std::numeric_limits<std::int16_t>::max())) {
    throw RuntimeError(kErrOverflow, "Overflow");
  }
  const std::size_t unpadded = kRecordHeadSize + data.size();
  const std::size_t size = (unpadded + kRecordAlignment - 1) / kRecordAlignment * kRecordAlignment;

  if (fill_ != 0 && fill_ + size > kLargestPayload) {
    batches_.emplace_back(buffer_.begin(), buffer_.begin() + static_cast<std::ptrdiff_t>(fill_));
    fill_ = 0;
  }
  while (batches_.size() >= kMostBatches) batches_.pop_front();
  std::size_t capacity = buffer_.size();
  while (capacity < fill_ + size) capacity = 2 * capacity + 1;
  buffer_.resize(capacity);

  const auto number = static_cast<std::uint16_t>(type);
  const std::uint8_t head[kRecordHeadSize] = {
      static_cast<std::uint8_t>(number & 0xFF), static_cast<std::uint8_t>(number >> 8),
      static_cast<std::uint8_t>(data.size() & 0xFF), static_cast<std::uint8_t>(data.size() >> 8)};
  const auto record =
      std::copy(std::begin(head), std::end(head), buffer_.begin() + static_cast<std::ptrdiff_t>(fill_));
  const auto padding = std::copy(data.begin(), data.end(), record);
  std::fill_n(padding, size - unpadded, std::uint8_t{0});
  fill_ += size;
}

std::optional<Bytes> LightingQueue::TakeBatch() {
  if (batches_.empty()) return std::nullopt;
  std::optional<Bytes> oldest = std::move(batches_.front());
  batches_.pop_front();
  return oldest;
}

}  // namespace tendril
