#include "config/option_bytes.h"

#include <cstddef>
#include <string_view>
#include <utility>

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

InvalidRecord Invalid(std::string_view name, std::int32_t value, std::string field) {
  return {"Internal Error - Invalid " + std::string(name) + "=" + std::to_string(value), std::move(field)};
}

}  // namespace

std::variant<OptionBytes, InvalidRecord> EncodeOptions(const ChannelConfig& record) {
  if (record.PortType < kPortServo || record.PortType > kPortPwm)
    return Invalid("PortType", record.PortType, "output kind " + std::to_string(record.PortType));
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
      return Invalid("PowerUPOpt", record.PowerUPOpt, "power-up option " + std::to_string(record.PowerUPOpt));
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
      return Invalid("LostCommOption", record.LostCommOption,
                     "lost communications option " + std::to_string(record.LostCommOption));
  }

  struct Width {
    std::string_view name;
    Microseconds value;
    std::size_t field;  // in PulseFieldTexts()
  };
  // In the order on the wire, which is also the order of the checks.
  const std::array<Width, kOptionByteCount - 1> widths{{
      {"ActualRange(0)", record.ActualRange[0], 0},
      {"ActualRange(1)", record.ActualRange[1], 0},
      {"VirtualRange(0)", record.VirtualRange[0], 1},
      {"VirtualRange(1)", record.VirtualRange[1], 1},
      {"VirtualStops(0)", record.VirtualStops[0], 2},
      {"VirtualStops(1)", record.VirtualStops[1], 2},
      {"DefaultPosition", record.DefaultPosition, 3},
      {"NeutralPosition", record.NeutralPosition, 4},
  }};

  OptionBytes bytes{static_cast<std::uint8_t>(flags)};
  for (std::size_t i = 0; i < widths.size(); ++i) {
    const auto& [name, value, field] = widths[i];
    if (value < kMinPulseWidth || value > kMaxPulseWidth)
      return Invalid(name, value, PulseFieldTexts(record)[field].InWords());
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
