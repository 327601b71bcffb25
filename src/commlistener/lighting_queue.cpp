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
constexpr std::size_t kMaxBatches = 200;

void AppendWord(std::size_t value, Bytes& bytes) {
  bytes.push_back(static_cast<std::uint8_t>(value & 0xFF));
  bytes.push_back(static_cast<std::uint8_t>(value >> 8));
}

}  // namespace

void LightingQueue::Append(LightingRecordType type, std::span<const std::uint8_t> data) {
  if (data.size() > static_cast<std::size_t>(std::numeric_limits<std::int16_t>::max())) {
    throw RuntimeError(kErrOverflow, "Overflow");
  }
  const std::size_t unpadded = kRecordHeadSize + data.size();
  const std::size_t size = (unpadded + kRecordAlignment - 1) / kRecordAlignment * kRecordAlignment;
  if (!buffer_.empty() && buffer_.size() + size > kMaxPayload) {
    batches_.push_back(std::exchange(buffer_, {}));
  }
  while (batches_.size() >= kMaxBatches) batches_.pop_front();

  AppendWord(static_cast<std::size_t>(type), buffer_);
  AppendWord(data.size(), buffer_);
  buffer_.insert(buffer_.end(), data.begin(), data.end());
  buffer_.resize(buffer_.size() + size - unpadded);
}

std::optional<Bytes> LightingQueue::TakeBatch() {
  if (batches_.empty()) return std::nullopt;
  std::optional<Bytes> oldest = std::move(batches_.front());
  batches_.pop_front();
  return oldest;
}

}  // namespace tendril
