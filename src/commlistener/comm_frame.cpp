#include "commlistener/comm_frame.h"

#include <algorithm>
#include <string>

#include "platform/runtime_error.h"

namespace tendril {
namespace {

constexpr std::size_t kLengthOffset = 2;

void WriteLength(std::size_t length, Bytes& frame) {
  if (length > kMaxPayload) {
    throw RuntimeError(kErrInternal, "Invalid length for length field: " + std::to_string(length));
  }
  for (std::size_t offset = kFrameHeaderSize; offset-- > kLengthOffset; length /= 10) {
    frame[offset] = static_cast<std::uint8_t>('0' + length % 10);
  }
}

// Reads from the last digit to the first: of several wrong bytes, the last is named.
std::size_t ReadLength(std::span<const std::uint8_t> header) {
  std::size_t length = 0;
  std::size_t weight = 1;
  for (std::size_t offset = kFrameHeaderSize; offset-- > kLengthOffset; weight *= 10) {
    const std::uint8_t digit = header[offset];
    if (digit < '0' || digit > '9') {
      throw RuntimeError(kErrInternal, "Invalid digit byte: " + std::to_string(digit));
    }
    length += static_cast<std::size_t>(digit - '0') * weight;
  }
  return length;
}

}  // namespace

Bytes BuildFrame(std::uint8_t identifier, std::uint8_t sequence, std::span<const std::uint8_t> payload) {
  Bytes frame(kFrameHeaderSize + payload.size());
  frame[0] = identifier;
  frame[1] = sequence;
  WriteLength(payload.size(), frame);
  std::copy(payload.begin(), payload.end(), frame.begin() + kFrameHeaderSize);
  return frame;
}

std::optional<FrameHeader> ParseFrameHeader(std::span<const std::uint8_t> bytes) {
  if (bytes.size() < kFrameHeaderSize) return std::nullopt;
  return FrameHeader{bytes[0], bytes[1], ReadLength(bytes)};
}

}  // namespace tendril
