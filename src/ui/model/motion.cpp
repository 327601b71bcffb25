#include "ui/model/motion.h"

#include <algorithm>

#include "platform/rounding.h"

namespace tendril {
namespace {

// Half of the distance between the ends of `range`, halves rounded to even.
int HalfWidth(const PulsePair& range) { return RoundHalfToEven((range[1] - range[0]) / 2.0); }

}  // namespace

void Motion::LimitVirtualRange() { virtual_half_width = std::min(virtual_half_width, actual_half_width); }

void Motion::LimitTrim() { trim = std::clamp(trim, -TrimRoom(), TrimRoom()); }

void Motion::LimitStops() {
  left_stop = std::max(left_stop, -virtual_half_width);
  right_stop = std::min(right_stop, virtual_half_width);
}

void Motion::LimitDefault() {
  // Not std::clamp: records can hold stops that are crossed over, and then the right one decides.
  default_position = std::min(std::max(default_position, left_stop), right_stop);
}

Motion MotionOf(const ChannelConfig& record) {
  return {.actual_half_width = HalfWidth(record.ActualRange),
          .virtual_half_width = HalfWidth(record.VirtualRange),
          .trim = record.NeutralPosition - kCentrePulseWidth,
          .left_stop = record.VirtualStops[0] - record.NeutralPosition,
          .right_stop = record.VirtualStops[1] - record.NeutralPosition,
          .default_position = record.DefaultPosition - record.NeutralPosition};
}

void StoreMotion(const Motion& motion, ChannelConfig& record) {
  const Microseconds neutral = kCentrePulseWidth + motion.trim;
  record.ActualRange = {kCentrePulseWidth - motion.actual_half_width,
                        kCentrePulseWidth + motion.actual_half_width};
  record.NeutralPosition = neutral;
  record.VirtualRange = {neutral - motion.virtual_half_width, neutral + motion.virtual_half_width};
  record.VirtualStops = {neutral + motion.left_stop, neutral + motion.right_stop};
  record.DefaultPosition = neutral + motion.default_position;
}

void CopyPulseFields(const ChannelConfig& from, ChannelConfig& to) {
  to.ActualRange = from.ActualRange;
  to.VirtualRange = from.VirtualRange;
  to.VirtualStops = from.VirtualStops;
  to.NeutralPosition = from.NeutralPosition;
  to.DefaultPosition = from.DefaultPosition;
}

}  // namespace tendril
