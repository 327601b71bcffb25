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

void SetFromPreset(const Preset& preset, ChannelConfig& record) {
  record.ActualRange = preset.actual_range;
  record.VirtualRange = preset.virtual_range;
  record.VirtualStops = preset.virtual_stops;
  record.NeutralPosition = preset.neutral_position;
  record.DefaultPosition = preset.default_position;
  record.LostCommOption = preset.lost_comm_option;
  record.PowerUPOpt = preset.power_up_opt;
}

}  // namespace tendril
