// The nine option bytes that carry the configuration of one port to a unit and back:
//
//   flags | actual low, high | virtual low, high | stop left, right | default | neutral
//
// Each pulse width is one byte: a tenth of it. The flag byte:
//
//   bit 0-1  output kind + 1
//   bit 2    something happens on lost communication ...
//   bit 4      ... move to neutral
//   bit 5      ... move to default                        (neither: hold)
//   bit 3    the servo moves at power-up ...
//   bit 6      ... to neutral
//   bit 7      ... to default
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <variant>

#include "config/channel_config.h"

namespace tendril {

inline constexpr std::size_t kOptionByteCount = 9;
using OptionBytes = std::array<std::uint8_t, kOptionByteCount>;
// The option bytes of ports 1 to 8.
using OptionTable = std::array<OptionBytes, kPortCount>;

inline constexpr std::uint8_t kFlagLostComm = 0x04;
inline constexpr std::uint8_t kFlagPowerUp = 0x08;
inline constexpr std::uint8_t kFlagLostCommNeutral = 0x10;
inline constexpr std::uint8_t kFlagLostCommDefault = 0x20;
inline constexpr std::uint8_t kFlagPowerUpNeutral = 0x40;
inline constexpr std::uint8_t kFlagPowerUpDefault = 0x80;

// The bits of the flag byte that each choice has.
inline constexpr std::uint8_t kKindFlags = 0x03;
inline constexpr std::uint8_t kPowerUpFlags = kFlagPowerUp | kFlagPowerUpNeutral | kFlagPowerUpDefault;
inline constexpr std::uint8_t kLostCommFlags = kFlagLostComm | kFlagLostCommNeutral | kFlagLostCommDefault;

// The option of a unit that holds its servo ports. A port's number and its option bytes follow, or kLivePosition.
inline constexpr std::uint8_t kOptionServoPort = 17;
// In place of a port's number: a mask of ports and the position to move them to follow.
inline constexpr std::uint8_t kLivePosition = 137;

// Why a record cannot be sent.
struct InvalidRecord {
  std::string text;   // for a message box
  std::string field;  // for a sentence: "305 to 2695", "default position 5" or "output kind -1"
};

// Checks `record` field by field and packs it. Stops at the first field out of its range. Does not check constraints
// between fields: the editor does that.
std::variant<OptionBytes, InvalidRecord> EncodeOptions(const ChannelConfig& record);

// The flags of a PowerUPOpt and of a LostCommOption; nothing for a value that EncodeOptions rejects.
std::optional<std::uint8_t> FlagsOfPowerUp(std::int32_t option);
std::optional<std::uint8_t> FlagsOfLostComm(std::int32_t option);

// The inverse of EncodeOptions, except for the last digit of each pulse width. Sets `Received`. Takes any bytes: flag
// combinations that no option has are read as no action, and without an output kind PortType is -1, which EncodeOptions
// rejects.
ChannelConfig DecodeOptions(std::span<const std::uint8_t, kOptionByteCount> options);

}  // namespace tendril
