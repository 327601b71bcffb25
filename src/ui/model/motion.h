// The motion parameters of a channel, their constraints, and the record fields that hold them.
//
//   actual half width a     ActualRange = 1500 -/+ a: always centred
//   virtual half width v    at most a
//   trim t                  NeutralPosition = 1500 + t; between -m and +m, where m = a - v
//   stops L, R              relative to the neutral position, at least -v and at most +v
//   default D               relative to the neutral position, between the stops
//
// The trim moves virtual range, stops and default position together.
#pragma once

#include "config/channel_config.h"

namespace tendril {

// The largest half width that can be entered, in microseconds.
inline constexpr int kMaxHalfWidth = 1000;

// All in microseconds.
struct Motion {
  int actual_half_width = 0;
  int virtual_half_width = 0;
  int trim = 0;
  int left_stop = 0;
  int right_stop = 0;
  int default_position = 0;
};

// The parameters of `record`, within the constraints or not. Stored again, they centre the actual range on 1500 and the
// virtual range on the neutral position, with half of each width rounded to even: 600 to 2410 becomes 595 to 2405, which
// a unit holds as 590 to 2400. Stops and default position are relative to the record's own neutral position, and stay.
Motion MotionOf(const ChannelConfig& record);
// Sets the eight pulse fields of `record`, and no other field.
void StoreMotion(const Motion& motion, ChannelConfig& record);
// Copies the eight pulse fields, and no other field.
void CopyPulseFields(const ChannelConfig& from, ChannelConfig& to);

}  // namespace tendril
