// Bytes in hexadecimal: in the serial link's log and trace lines, and in what a person is told.
#pragma once

#include <cstdint>
#include <span>
#include <string>

namespace tendril {

inline constexpr char kHexDigits[] = "0123456789ABCDEF";

// Two upper-case digits, as unit IDs are written: "0A".
inline std::string TwoHexDigits(std::uint8_t byte) { return {kHexDigits[byte / 16], kHexDigits[byte % 16]}; }

// Upper-case hexadecimal without leading zeros, `separator` between the bytes: "0-5-3-80".
inline std::string HexList(std::span<const std::uint8_t> bytes, char separator) {
  std::string text;
  for (const std::uint8_t byte : bytes) {
    if (!text.empty()) text += separator;
    if (byte >= 16) text += kHexDigits[byte / 16];
    text += kHexDigits[byte % 16];
  }
  return text;
}

}  // namespace tendril
