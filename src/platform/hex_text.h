// Bytes as upper-case hexadecimal text.
#pragma once

#include <cstdint>
#include <span>
#include <string>

namespace tendril {

// One digit, 0 to 15.
inline char HexDigit(int value) { return "0123456789ABCDEF"[value]; }

// Two digits, as unit IDs are written: "0A".
inline std::string HexByte(std::uint8_t byte) { return {HexDigit(byte / 16), HexDigit(byte % 16)}; }

// Two digits a byte, with spaces between them: "00 05 88".
inline std::string HexBytes(std::span<const std::uint8_t> bytes) {
  std::string text;
  for (const std::uint8_t byte : bytes) text += (text.empty() ? "" : " ") + HexByte(byte);
  return text;
}

// Without leading zeros, with `separator` between the bytes: "0-5-3-80".
inline std::string HexList(std::span<const std::uint8_t> bytes, char separator) {
  std::string text;
  for (const std::uint8_t byte : bytes) {
    if (!text.empty()) text += separator;
    if (byte >= 16) text += HexDigit(byte / 16);
    text += HexDigit(byte % 16);
  }
  return text;
}

}  // namespace tendril
