// The names and words of the configuration's text, for the writer and the reader.
#pragma once

#include <array>

#include "config/channel_config.h"

namespace tendril::exchange {

inline constexpr char kFormat[] = "tendril-configuration";
inline constexpr int kVersion = 1;

// Pairs and single pulse widths of a record, in the order of the text.
struct PairField {
  const char* name;
  PulsePair ChannelConfig::*value;
};
inline constexpr std::array<PairField, 3> kPairFields{{{"actualRange", &ChannelConfig::ActualRange},
                                                       {"virtualRange", &ChannelConfig::VirtualRange},
                                                       {"virtualStops", &ChannelConfig::VirtualStops}}};
struct WidthField {
  const char* name;
  Microseconds ChannelConfig::*value;
};
inline constexpr std::array<WidthField, 2> kWidthFields{
    {{"defaultPosition", &ChannelConfig::DefaultPosition},
     {"neutralPosition", &ChannelConfig::NeutralPosition}}};

// The words of PortType, from 0, and of PowerUPOpt and LostCommOption, from 1.
inline constexpr std::array<const char*, 3> kKinds{"servo", "digital", "pwm"};
inline constexpr std::array<const char*, 3> kPowerUps{"default", "neutral", "first command"};
inline constexpr std::array<const char*, 4> kLostCommunications{"hold", "default", "neutral", "stop pulse"};

}  // namespace tendril::exchange
