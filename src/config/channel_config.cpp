#include "config/channel_config.h"

#include "platform/runtime_error.h"

namespace tendril {

const ChannelConfig& ChannelTable::At(std::size_t slot) const {
  if (slot >= kSlots) throw RuntimeError(kErrOutOfRange, "Subscript out of range");
  return records_[slot];
}

ChannelConfig& ChannelTable::At(std::size_t slot) {
  return const_cast<ChannelConfig&>(static_cast<const ChannelTable&>(*this).At(slot));
}

std::array<PulseFieldText, 5> PulseFieldTexts(const ChannelConfig& record) {
  const auto range = [](const PulsePair& pair) {
    return std::to_string(pair[0]) + " to " + std::to_string(pair[1]);
  };
  return {{{"", range(record.ActualRange)},
           {"virtual range ", range(record.VirtualRange)},
           {"stop range ", range(record.VirtualStops)},
           {"default position ", std::to_string(record.DefaultPosition)},
           {"neutral position ", std::to_string(record.NeutralPosition)}}};
}

void SetFromPreset(const Preset& preset, ChannelConfig& record) {
  record.ActualRange = preset.actual_range;
  record.VirtualRange = preset.virtual_range;
  record.VirtualStops = preset.virtual_range;
  record.NeutralPosition = kCentrePulseWidth;
  record.DefaultPosition = kCentrePulseWidth;
  record.LostCommOption = kLostCommStopPulse;
  record.PowerUPOpt = kPowerUpFirstCommand;
}

}  // namespace tendril
