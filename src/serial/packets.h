// Packets of the Nyx serial network, as a program sends them:
//
//   00 | unit ID | command code | body ... | 00
//
// Configuration commands carry a checksum as the last byte of the body: body and checksum add up to 0x56
// modulo 256 (0xAA, body and checksum to 0). A body that needs no checksum carries 80 80 instead, since a
// checksum of 0 would end the packet.
//
// Nothing is escaped. The encodings below never give a zero byte; an option byte of zero goes out as it is.
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>

#include "platform/bytes.h"

namespace tendril {

inline constexpr std::uint8_t kFrameByte = 0x00;
inline constexpr std::uint8_t kAllUnits = 0xFF;
// The address that replies to the program carry.
inline constexpr std::uint8_t kProgramAddress = 0xFE;

inline constexpr std::uint8_t kCodeSetIntensity = 0x03;
inline constexpr std::uint8_t kCodeFade = 0x04;
inline constexpr std::uint8_t kCodeTwinkle = 0x06;
inline constexpr std::uint8_t kCodeShimmer = 0x07;
inline constexpr std::uint8_t kCodeDmxIntensity = 0x08;
inline constexpr std::uint8_t kCodeSetOption = 0x0A;
inline constexpr std::uint8_t kCodeSetAddress = 0x0F;
inline constexpr std::uint8_t kCodeHeartbeat = 0x81;
inline constexpr std::uint8_t kCodePoll = 0x88;
inline constexpr std::uint8_t kCodeUnlock = 0x8A;

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
struct FadeRate {
  std::uint8_t high;
  std::uint8_t low;
};
FadeRate EncodeFadeRate(std::uint8_t encoded_from, std::uint8_t encoded_to, std::uint8_t time);

// A packet without a checksum.
Bytes BuildPacket(std::uint8_t unit, std::uint8_t code, std::span<const std::uint8_t> body);
// A configuration command: the body, then its checksum.
Bytes BuildChecksummedPacket(std::uint8_t unit, std::uint8_t code, std::span<const std::uint8_t> body);

// Lights. Intensities in percent.
Bytes SetIntensityPacket(std::uint8_t unit, std::int16_t circuit, std::uint8_t percent);
// `value` goes out as it is and must not be 0, which would end the packet.
Bytes DmxIntensityPacket(std::uint8_t unit, std::int16_t circuit, std::uint8_t value);
Bytes FadePacket(std::uint8_t unit, std::int16_t circuit, std::uint8_t time, std::uint8_t from_percent,
                 std::uint8_t to_percent);
// A command whose body is the circuit alone: kCodeTwinkle, kCodeShimmer.
Bytes EffectPacket(std::uint8_t unit, std::int16_t circuit, std::uint8_t code);

// Configuration.
Bytes UnlockPacket(std::uint8_t unit);
Bytes SetAddressPacket(std::uint8_t unit, std::uint8_t new_id);
Bytes HeartbeatPacket();

// A poll: a question of kind `kind` that the unit answers. `pads` is the pad count.
Bytes PollPacket(std::uint8_t unit, std::uint8_t kind, std::uint8_t pads);

}  // namespace tendril
