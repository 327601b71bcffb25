// LightingQueue: lighting data that waits to be sent, as records laid end to end:
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

// Collects records in a buffer as large as a message's payload can be. A full buffer becomes a batch. When too many
// batches wait, the oldest are dropped: new lighting data is worth more than old.
class LightingQueue {
 public:
  // Appends a record. Raises RuntimeError(kErrOverflow) for data beyond 32767 bytes.
  void Append(LightingRecordType type, std::span<const std::uint8_t> data);

  // Takes the oldest batch; nothing when there is none.
  std::optional<Bytes> TakeBatch();

  std::size_t batches() const { return batches_.size(); }
  // The records that are in no batch yet.
  const Bytes& buffer() const { return buffer_; }
  void ClearBuffer() { buffer_.clear(); }

 private:
  Bytes buffer_;  // at most kMaxPayload
  std::deque<Bytes> batches_;
};

}  // namespace tendril
