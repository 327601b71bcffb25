#include "ui/model/motion.h"

#include "platform/rounding.h"

namespace tendril {
namespace {

// Half the width of `range`, rounded to even.
int HalfWidth(const PulsePair& range) { return RoundHalfToEven((range[1] - range[0]) / 2.0); }

}  // namespace

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
