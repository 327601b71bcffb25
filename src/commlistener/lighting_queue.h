// LightingQueue: lighting data that waits to be sent, as a run of records laid end to end:
//
//   offset 0  2 bytes  record type
//          2  2 bytes  n, length of the data, signed
//          4  n bytes  data
//        4+n  0 to 3   zero bytes, up to the next multiple of 4 of the whole record
//
// All numbers are little-endian.
#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <optional>
#include <span>

#include "platform/bytes.h"

namespace tendril {

enum class LightingRecordType : std::uint16_t {
  kDMXEffectForAddress = 0,
  kAllOff = 1,
  kNyxEffectForCircuit = 2,
  kDMXIntensities = 3,
  kNyxIntensities = 4
};

// Collects records in a buffer as large as one message can be. When that is full it becomes a batch; when
// nobody takes the batches, the oldest are dropped, since new lighting data is worth more than old.
class LightingQueue {
 public:
  // Appends a record. Raises RuntimeError(kErrOverflow) for data beyond 32767 bytes.
  void Append(LightingRecordType type, std::span<const std::uint8_t> data);

  // Takes the oldest batch; nothing when there is none.
  std::optional<Bytes> TakeBatch();

  std::size_t batches() const { return batches_.size(); }
  // The buffer, of which the first fill() bytes are records.
  std::span<const std::uint8_t> buffer() const { return buffer_; }
  std::size_t fill() const { return fill_; }
  void ClearBuffer() { fill_ = 0; }

 private:
  Bytes buffer_;          // its size is the capacity
  std::size_t fill_ = 0;  // at most buffer_.size()
  std::deque<Bytes> batches_;
};

}  // namespace tendril
