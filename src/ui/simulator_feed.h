// How a record is put into a simulator.
#pragma once

#include "config/channel_config.h"
#include "simulator/servo_simulator.h"

namespace tendril {

// What ServoSimulator::DisplaySize takes.
inline constexpr std::int32_t kSmallSimulator = 2;
inline constexpr std::int32_t kLargeSimulator = 0;

// Shows `record` with the arm at `arm`.
void FeedSimulator(ServoSimulator& simulator, const ChannelConfig& record, std::int32_t size,
                   Microseconds arm);

// Shows it again after a resize, which lost the ranges and the arm. The neutral position stays: setting it
// once more would move its marker.
void RefeedResizedSimulator(ServoSimulator& simulator, const ChannelConfig& record, Microseconds arm);

}  // namespace tendril
