#include "platform/steady_clock.h"

#include <chrono>
#ifdef _WIN32
#include <windows.h>
// After windows.h, which it needs.
#include <timeapi.h>
#endif

namespace tendril {

std::uint32_t SteadyClock::NowMs() const {
  const auto since_start = std::chrono::steady_clock::now().time_since_epoch();
  return static_cast<std::uint32_t>(
      std::chrono::duration_cast<std::chrono::milliseconds>(since_start).count());
}

// The steady clock is finer than a millisecond on every system.
std::uint32_t SteadyClock::GranularityMs() const { return 1; }

#ifdef _WIN32

std::uint32_t SteadyClock::RequestFinestTimerPeriod() {
  TIMECAPS capabilities = {};
  const bool known = timeGetDevCaps(&capabilities, sizeof capabilities) == TIMERR_NOERROR;
  const UINT period = known && capabilities.wPeriodMin > 0 ? capabilities.wPeriodMin : 1;
  timeBeginPeriod(period);
  return period;
}

void SteadyClock::ReleaseTimerPeriod(std::uint32_t period_ms) { timeEndPeriod(period_ms); }

#else

// Timers have the clock's resolution here.
std::uint32_t SteadyClock::RequestFinestTimerPeriod() { return 1; }

void SteadyClock::ReleaseTimerPeriod(std::uint32_t /*period_ms*/) {}

#endif

}  // namespace tendril
