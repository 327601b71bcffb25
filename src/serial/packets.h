// Packets of the Nyx serial network, as a program sends them:
//
//   00 | unit ID | command code | body ... | 00
//
// Configuration commands carry a checksum as the last byte of the body: body and checksum add up to 0x56
// modulo 256 (0xAA, body and checksum to 0). A body that needs no checksum carries 80 80 instead, since a
// checksum of 0 would end the packet.
//
// Nothing is escaped: an option byte of zero goes out as it is.
#pragma once

#include <cstdint>
#include <span>

#include "platform/bytes.h"

namespace tendril {

inline constexpr std::uint8_t kFrameByte = 0x00;
inline constexpr std::uint8_t kAllUnits = 0xFF;
// The address that replies to the program carry.
inline constexpr std::uint8_t kProgramAddress = 0xFE;

inline constexpr std::uint8_t kCodeSetOption = 0x0A;
inline constexpr std::uint8_t kCodeSetAddress = 0x0F;
inline constexpr std::uint8_t kCodeHeartbeat = 0x81;
inline constexpr std::uint8_t kCodePoll = 0x88;
inline constexpr std::uint8_t kCodeUnlock = 0x8A;

// The second data byte of a reply to a poll of kind '0': the unit has accepted a configuration command.
inline constexpr std::uint8_t kReplyAccepted = 10;

// A packet without a checksum.
Bytes BuildPacket(std::uint8_t unit, std::uint8_t code, std::span<const std::uint8_t> body);
// A configuration command: the body, then its checksum.
Bytes BuildChecksummedPacket(std::uint8_t unit, std::uint8_t code, std::span<const std::uint8_t> body);

Bytes UnlockPacket(std::uint8_t unit);
Bytes SetAddressPacket(std::uint8_t unit, std::uint8_t new_id);
Bytes HeartbeatPacket();

// A poll: a question of kind `kind` that the unit answers. `pads` is the pad count.
Bytes PollPacket(std::uint8_t unit, std::uint8_t kind, std::uint8_t pads);

}  // namespace tendril
