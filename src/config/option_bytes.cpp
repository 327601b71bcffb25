#include "config/option_bytes.h"

#include <algorithm>
#include <cstddef>
#include <functional>
#include <numeric>
#include <string_view>
#include <utility>

namespace tendril {
namespace {

// The flags of each PowerUPOpt and of each LostCommOption, from option 1. The last option is no action.
constexpr std::array<int, kPowerUpFirstCommand> kPowerUpTable = {kFlagPowerUp | kFlagPowerUpDefault,
                                                                 kFlagPowerUp | kFlagPowerUpNeutral, 0};
constexpr std::array<int, kLostCommStopPulse> kLostCommTable = {
    kFlagLostComm, kFlagLostComm | kFlagLostCommDefault, kFlagLostComm | kFlagLostCommNeutral, 0};

// The option whose flags are exactly those that `flags` and its table share; the last if no option has them.
std::int32_t OptionOf(std::span<const int> table, int flags) {
  const int mask = std::accumulate(table.begin(), table.end(), 0, std::bit_or());
  const auto found = std::find(table.begin(), table.end() - 1, flags & mask);
  return static_cast<std::int32_t>(found - table.begin()) + 1;
}

std::optional<std::uint8_t> FlagsOf(std::span<const int> table, std::int32_t option) {
  if (option < 1 || option > static_cast<std::int32_t>(table.size())) return std::nullopt;
  return static_cast<std::uint8_t>(table[static_cast<std::size_t>(option) - 1]);
}

InvalidRecord Invalid(std::string_view name, std::int32_t value, std::string field) {
  return {"Internal Error - Invalid " + std::string(name) + "=" + std::to_string(value), std::move(field)};
}

}  // namespace

std::optional<std::uint8_t> FlagsOfPowerUp(std::int32_t option) { return FlagsOf(kPowerUpTable, option); }

std::optional<std::uint8_t> FlagsOfLostComm(std::int32_t option) { return FlagsOf(kLostCommTable, option); }

std::variant<OptionBytes, InvalidRecord> EncodeOptions(const ChannelConfig& record) {
  if (record.PortType < kPortServo || record.PortType > kPortPwm)
    return Invalid("PortType", record.PortType, "output kind " + std::to_string(record.PortType));
  int flags = record.PortType + 1;

  const auto power_up = FlagsOfPowerUp(record.PowerUPOpt);
  if (!power_up) {
    return Invalid("PowerUPOpt", record.PowerUPOpt, "power-up option " + std::to_string(record.PowerUPOpt));
  }
  const auto lost_comm = FlagsOfLostComm(record.LostCommOption);
  if (!lost_comm) {
    return Invalid("LostCommOption", record.LostCommOption,
                   "lost communications option " + std::to_string(record.LostCommOption));
  }
  flags |= *power_up | *lost_comm;

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
    bytes[i + 1] = static_cast<std::uint8_t>(value / kPulseResolution);
  }
  return bytes;
}

ChannelConfig DecodeOptions(std::span<const std::uint8_t, kOptionByteCount> options) {
  const int flags = options[0];
  const auto width = [&](std::size_t i) { return options[i] * kPulseResolution; };
  ChannelConfig record;
  record.PortType = static_cast<std::int16_t>((flags & kKindFlags) - 1);
  record.ActualRange = {width(1), width(2)};
  record.VirtualRange = {width(3), width(4)};
  record.VirtualStops = {width(5), width(6)};
  record.DefaultPosition = width(7);
  record.NeutralPosition = width(8);
  record.PowerUPOpt = OptionOf(kPowerUpTable, flags);
  record.LostCommOption = OptionOf(kLostCommTable, flags);
  record.Received = true;
  return record;
}

}  // namespace tendril
