#include "ui/simulators.h"

namespace tendril {

Simulators::Simulators(ChannelStrip& channels, EditorArea& editor, const ChannelEditor& ticks)
    : channels_(channels), editor_(editor), ticks_(ticks) {}

void Simulators::UpdateAll(Microseconds arm) {
  for (std::size_t slot = 0; slot < kPortCount; ++slot) channels_.UpdateSimulator(slot, arm);
  editor_.UpdateSimulator(arm);
}

void Simulators::UpdateSimulators(Microseconds arm) {
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    if (ticks_.Ticked(slot)) channels_.UpdateSimulator(slot, arm);
  }
  editor_.UpdateSimulator(arm);
}

void Simulators::MoveArm(Microseconds position) {
  if (const auto channel = editor_.Channel()) channels_.MoveArm(*channel, position);
  editor_.MoveArm(position);
}

}  // namespace tendril
