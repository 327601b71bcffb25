#include "config/option_bytes.h"

#include <cstddef>
#include <string_view>

namespace tendril {
namespace {

constexpr int kKindBits = 0x03;
constexpr int kPowerUpToDefault = kFlagPowerUp | kFlagPowerUpDefault;
constexpr int kPowerUpToNeutral = kFlagPowerUp | kFlagPowerUpNeutral;
constexpr int kPowerUpBits = kPowerUpToDefault | kPowerUpToNeutral;
constexpr int kLostCommToDefault = kFlagLostComm | kFlagLostCommDefault;
constexpr int kLostCommToNeutral = kFlagLostComm | kFlagLostCommNeutral;
constexpr int kLostCommBits = kLostCommToDefault | kLostCommToNeutral;
constexpr Microseconds kByteStep = 10;

std::int32_t PowerUpOption(int flags) {
  switch (flags & kPowerUpBits) {
    case kPowerUpToDefault:
      return kPowerUpDefault;
    case kPowerUpToNeutral:
      return kPowerUpNeutral;
    default:
      return kPowerUpFirstCommand;
  }
}

std::int32_t LostCommOption(int flags) {
  switch (flags & kLostCommBits) {
    case kFlagLostComm:
      return kLostCommHold;
    case kLostCommToDefault:
      return kLostCommDefault;
    case kLostCommToNeutral:
      return kLostCommNeutral;
    default:
      return kLostCommStopPulse;
  }
}

InvalidRecord Invalid(std::string_view field, std::int32_t value) {
  return {"Internal Error - Invalid " + std::string(field) + "=" + std::to_string(value)};
}

}  // namespace

std::variant<OptionBytes, InvalidRecord> EncodeOptions(const ChannelConfig& record) {
  if (record.PortType < kPortServo || record.PortType > kPortPwm) return Invalid("PortType", record.PortType);
  int flags = record.PortType + 1;

  switch (record.PowerUPOpt) {
    case kPowerUpDefault:
      flags |= kPowerUpToDefault;
      break;
    case kPowerUpNeutral:
      flags |= kPowerUpToNeutral;
      break;
    case kPowerUpFirstCommand:
      break;
    default:
      return Invalid("PowerUPOpt", record.PowerUPOpt);
  }

  switch (record.LostCommOption) {
    case kLostCommHold:
      flags |= kFlagLostComm;
      break;
    case kLostCommDefault:
      flags |= kLostCommToDefault;
      break;
    case kLostCommNeutral:
      flags |= kLostCommToNeutral;
      break;
    case kLostCommStopPulse:
      break;
    default:
      return Invalid("LostCommOption", record.LostCommOption);
  }

  struct Width {
    std::string_view field;
    Microseconds value;
  };
  // In the order on the wire, which is also the order of the checks.
  const std::array<Width, kOptionByteCount - 1> widths{{
      {"ActualRange(0)", record.ActualRange[0]},
      {"ActualRange(1)", record.ActualRange[1]},
      {"VirtualRange(0)", record.VirtualRange[0]},
      {"VirtualRange(1)", record.VirtualRange[1]},
      {"VirtualStops(0)", record.VirtualStops[0]},
      {"VirtualStops(1)", record.VirtualStops[1]},
      {"DefaultPosition", record.DefaultPosition},
      {"NeutralPosition", record.NeutralPosition},
  }};

  OptionBytes bytes{static_cast<std::uint8_t>(flags)};
  for (std::size_t i = 0; i < widths.size(); ++i) {
    const auto& [field, value] = widths[i];
    if (value < kMinPulseWidth || value > kMaxPulseWidth) return Invalid(field, value);
    bytes[i + 1] = static_cast<std::uint8_t>(value / kByteStep);
  }
  return bytes;
}

ChannelConfig DecodeOptions(std::span<const std::uint8_t, kOptionByteCount> options) {
  const int flags = options[0];
  const auto width = [&](std::size_t i) { return options[i] * kByteStep; };
  ChannelConfig record;
  record.PortType = static_cast<std::int16_t>((flags & kKindBits) - 1);
  record.ActualRange = {width(1), width(2)};
  record.VirtualRange = {width(3), width(4)};
  record.VirtualStops = {width(5), width(6)};
  record.DefaultPosition = width(7);
  record.NeutralPosition = width(8);
  record.PowerUPOpt = PowerUpOption(flags);
  record.LostCommOption = LostCommOption(flags);
  record.Received = true;
  return record;
}

}  // namespace tendril
