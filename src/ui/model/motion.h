// Constraints between the motion parameters of a channel, and how a record holds them.
//
//   actual half width a     ActualRange = 1500 -/+ a: always about the centre
//   virtual half width v    at most a
//   trim t                  NeutralPosition = 1500 + t; between -m and +m, the room m = a - v
//   stops L, R              relative to the neutral position, at least -v and at most +v
//   default D               relative to the neutral position, between the stops
//
// The trim moves virtual range, stops and default together.
#pragma once

#include "config/channel_config.h"

namespace tendril {

// The widest half width that can be entered, in microseconds.
inline constexpr int kMaxHalfWidth = 1000;

// All in microseconds.
struct Motion {
  int actual_half_width = 0;
  int virtual_half_width = 0;
  int trim = 0;
  int left_stop = 0;
  int right_stop = 0;
  int default_position = 0;

  // The room that the trim has, to each side.
  int TrimRoom() const { return actual_half_width - virtual_half_width; }

  // Each brings its parameter into the bounds that the ones before it set. In this order.
  void LimitVirtualRange();
  void LimitTrim();
  void LimitStops();
  void LimitDefault();
};

// The parameters as `record` gives them, whether they keep the bounds or not. Stored again, they put the actual range
// about 1500 and the virtual range about the neutral position, each as wide as it was, with half the width rounded to
// even: 600 to 2410 becomes 595 to 2405 (which a unit holds as 590 to 2400). Stops and default are measured from the
// record's own neutral position, and stay where they are.
Motion MotionOf(const ChannelConfig& record);
// Sets the eight pulse fields of `record`, and no other.
void StoreMotion(const Motion& motion, ChannelConfig& record);
// Copies the eight pulse fields, and no other.
void CopyPulseFields(const ChannelConfig& from, ChannelConfig& to);

}  // namespace tendril
