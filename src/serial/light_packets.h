// Packets for light controllers, in the layout of packets.h:
//
//   code | body                                          | circuit
//   03   | intensity                                     | one or two bytes
//   04   | from, to, high and low byte of the rate       |
//   06   | (twinkle)                                     |
//   07   | (shimmer)                                     |
//   08   | DMX value, 1 to 255                           |
//
// The encodings below never give a zero byte, which would end the packet.
#pragma once

#include <array>
#include <cstdint>

#include "platform/bytes.h"

namespace tendril {

inline constexpr std::uint8_t kCodeSetIntensity = 0x03;
inline constexpr std::uint8_t kCodeFade = 0x04;
inline constexpr std::uint8_t kCodeTwinkle = 0x06;
inline constexpr std::uint8_t kCodeShimmer = 0x07;
inline constexpr std::uint8_t kCodeDmxIntensity = 0x08;

// Circuits from here on take two bytes, and beyond the last one are clamped to it.
inline constexpr std::int16_t kFirstTwoByteCircuit = 64;
inline constexpr std::int16_t kLastCircuit = 8191;

// The one or two bytes of a circuit number: 0x80 + circuit up to 63; from 64 the low six bits with 0xC0, then
// the higher bits with 0x80. Raises kErrOverflow for a negative number.
Bytes EncodeCircuit(std::int16_t circuit);

// The byte of an intensity in percent: 0xF0 for 0, 0x01 for 100 and above, 228 - 2 * percent in between. 255
// is passed through.
std::uint8_t EncodeIntensity(std::uint8_t percent);

// The two bytes, high first, of the rate of a fade between two *encoded* intensities over `time`. Raises
// kErrDivisionByZero for a time of 0.
std::array<std::uint8_t, 2> EncodeFadeRate(std::uint8_t encoded_from, std::uint8_t encoded_to,
                                           std::uint8_t time);

// The packet of a light command: the circuit follows the body.
Bytes LightPacket(std::uint8_t unit, std::uint8_t code, Bytes body, std::int16_t circuit);

}  // namespace tendril
