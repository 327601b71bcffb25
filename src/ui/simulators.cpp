#include "ui/simulators.h"

namespace tendril {

void Simulators::UpdateAll(Microseconds arm) {
  for (std::size_t channel = 0; channel < kPortCount; ++channel) channels_.UpdateSimulator(channel, arm);
  chosen_.UpdateSimulator(arm);
  scale_.MoveArm(arm);
}

void Simulators::UpdateSimulators(Microseconds arm) {
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    if (ticks_.Ticked(channel)) channels_.UpdateSimulator(channel, arm);
  }
  chosen_.UpdateSimulator(arm);
  scale_.MoveArm(arm);
}

void Simulators::MoveArm(Microseconds position) {
  if (const auto channel = chosen_.Channel()) channels_.MoveArm(*channel, position);
  chosen_.MoveArm(position);
  scale_.MoveArm(position);
}

}  // namespace tendril
