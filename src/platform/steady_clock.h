// SteadyClock: the Clock of this computer.
#pragma once

#include "platform/clock.h"

namespace tendril {

class SteadyClock final : public Clock {
 public:
  std::uint32_t NowMs() const override;
  std::uint32_t GranularityMs() const override;
  std::uint32_t RequestFinestTimerPeriod() override;
  void ReleaseTimerPeriod(std::uint32_t period_ms) override;
};

}  // namespace tendril
