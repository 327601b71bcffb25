// Bytes as text, the way the serial link's log and trace lines show them.
#pragma once

#include <cstdint>
#include <span>
#include <string>

namespace tendril {

// Two upper-case digits, as unit IDs are written: "0A".
inline std::string TwoHexDigits(std::uint8_t byte) {
  constexpr char kDigits[] = "0123456789ABCDEF";
  return {kDigits[byte / 16], kDigits[byte % 16]};
}

// Upper-case hexadecimal without leading zeros, `separator` between the bytes: "0-5-3-80".
inline std::string HexList(std::span<const std::uint8_t> bytes, char separator) {
  constexpr char kDigits[] = "0123456789ABCDEF";
  std::string text;
  for (const std::uint8_t byte : bytes) {
    if (!text.empty()) text += separator;
    if (byte >= 16) text += kDigits[byte / 16];
    text += kDigits[byte % 16];
  }
  return text;
}

}  // namespace tendril
