// Simulators: all that shows the arm of a servo: the large drawn servo, the eight small ones, and the pulse scale.
#pragma once

#include "config/channel_config.h"
#include "ui/channel_strip.h"
#include "ui/chosen_servo.h"
#include "ui/model/channel_editor.h"
#include "ui/pulse_scale.h"
#include "unitops/live_test.h"

namespace tendril {

class Simulators : public ServoPictures {
 public:
  // All must outlive it.
  Simulators(ChannelStrip& channels, ChosenServo& chosen, PulseScale& scale, const ChannelEditor& ticks)
      : channels_(channels), chosen_(chosen), scale_(scale), ticks_(ticks) {}

  // Shows all records again, with the arms at `arm`: at the start, and after the records were replaced.
  void UpdateAll(Microseconds arm);
  // Shows the records of the ticked channels and the large servo again, with the arms at `arm`.
  void UpdateSimulators(Microseconds arm) override;
  void MoveArm(Microseconds position) override;

 private:
  ChannelStrip& channels_;
  ChosenServo& chosen_;
  PulseScale& scale_;
  const ChannelEditor& ticks_;
};

}  // namespace tendril
