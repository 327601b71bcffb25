// ChannelConfig: the configuration of one output port of a Tendril unit, and the presets.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace tendril {

// Pulse widths are whole microseconds. A unit stores each in one byte, as a multiple of the resolution: this gives the
// limits, and the last digit is lost.
using Microseconds = std::int32_t;
inline constexpr Microseconds kPulseResolution = 10;
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

// One port's configuration. A record may hold any values: EncodeOptions checks them before they go to a unit.
struct ChannelConfig {
  std::int16_t PortType = kPortServo;
  PulsePair ActualRange{};   // the physical limits: the servo is never driven outside them
  PulsePair VirtualRange{};  // the pulse widths of intensity 0 and of full intensity
  PulsePair VirtualStops{};  // the pulse width is clamped to these, inside the virtual range
  Microseconds DefaultPosition = 0;
  Microseconds NeutralPosition = 0;  // the centre plus the trim
  std::int32_t PowerUPOpt = 0;
  std::int32_t LostCommOption = 0;
  bool Received = false;  // read-back table only: a unit's reply has filled this record

  friend bool operator==(const ChannelConfig&, const ChannelConfig&) = default;
};

// Output ports of a unit. Slot s of a table is port s + 1.
inline constexpr std::size_t kPortCount = 8;

// A pulse field in words: "virtual range " and "1000 to 2000", "default position " and "1500". The actual range has no
// name.
struct PulseFieldText {
  std::string InWords() const { return std::string(name) + value; }

  std::string_view name;
  std::string value;
};
// The pulse fields of `record`: actual range, virtual range, stops, default position, neutral position.
std::array<PulseFieldText, 5> PulseFieldTexts(const ChannelConfig& record);

// A table of records with one slot more than there are ports. The last slot is never sent, received or shown.
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

// A named set of values to start from. In all of them the stops are the ends of the virtual range, neutral and default
// position are the centre, the pulse stops on lost communications and starts on the first command.
struct Preset {
  std::string_view name;
  PulsePair actual_range;
  PulsePair virtual_range;
};

// "Standard Preset Values", in the order of the list.
inline constexpr std::array<Preset, 3> kPresets{{{"Narrow Range", {800, 2200}, {1250, 1750}},
                                                 {"Medium Range (default)", {600, 2400}, {1000, 2000}},
                                                 {"Wide Range", {500, 2500}, {700, 2300}}}};
inline constexpr std::size_t kStartPreset = 1;

// Sets the preset's ten values in `record`; PortType and Received stay.
void SetFromPreset(const Preset& preset, ChannelConfig& record);

}  // namespace tendril
