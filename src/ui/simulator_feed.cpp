#include "ui/simulator_feed.h"

namespace tendril {
namespace {

void SetRanges(ServoSimulator& simulator, const ChannelConfig& record) {
  simulator.SetRangeUS(record.ActualRange[0], record.ActualRange[1]);
  simulator.SetLimitUS(record.VirtualRange[0], record.VirtualRange[1]);
  simulator.SetStopsUS(record.VirtualStops[0], record.VirtualStops[1]);
}

}  // namespace

void FeedSimulator(ServoSimulator& simulator, const ChannelConfig& record, Microseconds arm) {
  // The servo measures from its neutral position so far. With a new one, only the second pass shows the record as it
  // will look from then on.
  const int times = simulator.dial().neutral_pulse() == record.NeutralPosition ? 1 : 2;
  for (int time = 0; time < times; ++time) {
    SetRanges(simulator, record);
    simulator.SetNeutralPositionUS(record.NeutralPosition);  // before the default, which is measured from it
    simulator.SetDefaultPositionUS(record.DefaultPosition);
  }
  simulator.SetMovingArmPositionUS(arm);
  simulator.DrawServo();
}

void RefeedResizedSimulator(ServoSimulator& simulator, const ChannelConfig& record, Microseconds arm) {
  SetRanges(simulator, record);
  simulator.SetMovingArmPositionUS(arm);
}

}  // namespace tendril
