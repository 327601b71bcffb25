// ChannelConfig: what one output port of a Tendril unit is set to, and the presets it can start from.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace tendril {

// Pulse widths are whole microseconds. The unit keeps each as one byte that holds a tenth of it, which gives
// the limits, and loses the last digit.
using Microseconds = std::int32_t;
inline constexpr Microseconds kMinPulseWidth = 10;
inline constexpr Microseconds kMaxPulseWidth = 2550;
inline constexpr Microseconds kCentrePulseWidth = 1500;

// A low and a high pulse width.
using PulsePair = std::array<Microseconds, 2>;

// Values of ChannelConfig::PortType.
inline constexpr std::int16_t kPortServo = 0;
inline constexpr std::int16_t kPortDigital = 1;
inline constexpr std::int16_t kPortPwm = 2;

// Values of ChannelConfig::PowerUPOpt.
inline constexpr std::int32_t kPowerUpDefault = 1;
inline constexpr std::int32_t kPowerUpNeutral = 2;
inline constexpr std::int32_t kPowerUpFirstCommand = 3;

// Values of ChannelConfig::LostCommOption.
inline constexpr std::int32_t kLostCommHold = 1;
inline constexpr std::int32_t kLostCommDefault = 2;
inline constexpr std::int32_t kLostCommNeutral = 3;
inline constexpr std::int32_t kLostCommStopPulse = 4;

// One port's configuration. A record may hold anything: what goes to a unit is checked when it is encoded.
struct ChannelConfig {
  std::int16_t PortType = kPortServo;
  PulsePair ActualRange{};   // the physical limits: the servo is never driven outside them
  PulsePair VirtualRange{};  // where intensity 0 and full intensity lie
  PulsePair VirtualStops{};  // where the pulse width is clamped to inside the virtual range
  Microseconds DefaultPosition = 0;
  Microseconds NeutralPosition = 0;  // the centre, with its trim
  std::int32_t PowerUPOpt = 0;
  std::int32_t LostCommOption = 0;
  bool Received = false;  // read-back table only: this record was filled from a unit's reply

  friend bool operator==(const ChannelConfig&, const ChannelConfig&) = default;
};

// Output ports of a unit. Slot s of a table is port s + 1.
inline constexpr std::size_t kPortCount = 8;

// A pulse field in words: "virtual range " and "1000 to 2000", "default position " and "1500". The actual range needs
// no name.
struct PulseFieldText {
  std::string InWords() const { return std::string(name) + value; }

  std::string_view name;
  std::string value;
};
// The pulse fields of `record`: actual range, virtual range, stops, default position, neutral position.
std::array<PulseFieldText, 5> PulseFieldTexts(const ChannelConfig& record);

// A table of records with one slot more than there are ports; the last is never sent, received or shown.
class ChannelTable {
 public:
  static constexpr std::size_t kSlots = kPortCount + 1;

  // The record of `slot`, 0 to 8; raises kErrOutOfRange for any other.
  ChannelConfig& At(std::size_t slot);
  const ChannelConfig& At(std::size_t slot) const;

  friend bool operator==(const ChannelTable&, const ChannelTable&) = default;

 private:
  std::array<ChannelConfig, kSlots> records_{};
};

// A named set of values to start from.
struct Preset {
  std::string_view name;
  PulsePair actual_range;
  PulsePair virtual_range;
  PulsePair virtual_stops;
  Microseconds neutral_position;
  Microseconds default_position;
  std::int32_t lost_comm_option;
  std::int32_t power_up_opt;
};

// "Standard Preset Values", in the order in which they are listed.
inline constexpr std::array<Preset, 3> kPresets{{
    {"Narrow Range",
     {800, 2200},
     {1250, 1750},
     {1250, 1750},
     1500,
     1500,
     kLostCommStopPulse,
     kPowerUpFirstCommand},
    {"Medium Range (default)",
     {600, 2400},
     {1000, 2000},
     {1000, 2000},
     1500,
     1500,
     kLostCommStopPulse,
     kPowerUpFirstCommand},
    {"Wide Range",
     {500, 2500},
     {700, 2300},
     {700, 2300},
     1500,
     1500,
     kLostCommStopPulse,
     kPowerUpFirstCommand},
}};
inline constexpr std::size_t kStartPreset = 1;

// Sets the preset's ten values in `record`; its output kind and its Received flag stay.
void SetFromPreset(const Preset& preset, ChannelConfig& record);

}  // namespace tendril
