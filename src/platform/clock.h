// Clock: the millisecond count that every time-out is measured with.
#pragma once

#include <cstdint>

namespace tendril {

// The time, and how finely it is told.
class Clock {
 public:
  virtual ~Clock() = default;

  // Milliseconds since some moment, as a 32-bit count that wraps about every 49.7 days: subtract unsigned,
  // never compare two readings.
  virtual std::uint32_t NowMs() const = 0;

  // The step, in milliseconds, by which NowMs() grows. At least 1.
  virtual std::uint32_t GranularityMs() const = 0;

  // Asks the system for its finest timer resolution and returns the period granted, in milliseconds (at least
  // 1). Each request is paired with a ReleaseTimerPeriod() of what was granted.
  virtual std::uint32_t RequestFinestTimerPeriod() = 0;
  virtual void ReleaseTimerPeriod(std::uint32_t period_ms) = 0;
};

}  // namespace tendril
