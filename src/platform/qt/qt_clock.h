// QtClock: the system's steady clock, in milliseconds.
#pragma once

#include "platform/clock.h"

namespace tendril {

class QtClock final : public Clock {
 public:
  std::uint32_t NowMs() const override;
  std::uint32_t GranularityMs() const override;
  std::uint32_t RequestFinestTimerPeriod() override;
  void ReleaseTimerPeriod(std::uint32_t period_ms) override;
};

}  // namespace tendril
