// The frame that requests to the Control Panel's comm listener and its replies share:
//
//   offset 0  1 byte   message identifier: a letter in a request; "1" acknowledged or "0" refused in a reply
//          1  1 byte   sequence character, "0" to "9"; a reply carries that of its request
//          2  5 bytes  length of the payload, decimal, most significant digit first: "00000" to "99999"
//          7  length   payload
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>

#include "platform/bytes.h"

namespace tendril {

inline constexpr std::size_t kFrameHeaderSize = 7;
inline constexpr std::size_t kMaxPayload = 99999;  // five digits
inline constexpr std::size_t kMaxFrame = kFrameHeaderSize + kMaxPayload;

// The first seven bytes of a frame.
struct FrameHeader {
  std::uint8_t identifier;
  std::uint8_t sequence;
  std::size_t length;  // of the payload
};

// A whole frame. Raises RuntimeError(kErrInternal) for a payload over kMaxPayload.
Bytes BuildFrame(std::uint8_t identifier, std::uint8_t sequence, std::span<const std::uint8_t> payload);

// The header of a frame that begins with `bytes`; nothing when they are fewer than a header has. Raises
// RuntimeError(kErrInternal) when a byte of the length is no digit.
std::optional<FrameHeader> ParseFrameHeader(std::span<const std::uint8_t> bytes);

}  // namespace tendril
