// How a simulator gets a record.
#pragma once

#include "config/channel_config.h"
#include "simulator/servo_simulator.h"

namespace tendril {

// Arguments of ServoSimulator::DisplaySize.
inline constexpr std::int32_t kSmallSimulator = 2;
inline constexpr std::int32_t kLargeSimulator = 0;

// Shows `record` with the arm at `arm`.
void FeedSimulator(ServoSimulator& simulator, const ChannelConfig& record, Microseconds arm);

// Shows it again after a resize, which lost the ranges and the arm. Leaves the neutral position: setting it again would
// move its marker.
void RefeedResizedSimulator(ServoSimulator& simulator, const ChannelConfig& record, Microseconds arm);

}  // namespace tendril
