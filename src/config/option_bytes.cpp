#include "config/option_bytes.h"

#include <cstddef>
#include <string_view>

namespace tendril {
namespace {

InvalidRecord Invalid(std::string_view field, std::int32_t value) {
  return {"Internal Error - Invalid " + std::string(field) + "=" + std::to_string(value)};
}

}  // namespace

std::variant<OptionBytes, InvalidRecord> EncodeOptions(const ChannelConfig& record) {
  if (record.PortType < kPortServo || record.PortType > kPortPwm) return Invalid("PortType", record.PortType);
  int flags = record.PortType + 1;

  switch (record.PowerUPOpt) {
    case kPowerUpDefault:
      flags |= kFlagPowerUp | kFlagPowerUpDefault;
      break;
    case kPowerUpNeutral:
      flags |= kFlagPowerUp | kFlagPowerUpNeutral;
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
      flags |= kFlagLostComm | kFlagLostCommDefault;
      break;
    case kLostCommNeutral:
      flags |= kFlagLostComm | kFlagLostCommNeutral;
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
    bytes[i + 1] = static_cast<std::uint8_t>(value / 10);
  }
  return bytes;
}

}  // namespace tendril
