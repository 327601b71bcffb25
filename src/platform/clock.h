// Clock: the millisecond count of every time-out.
#pragma once

#include <cstdint>

namespace tendril {

// A millisecond count and its resolution.
class Clock {
 public:
  virtual ~Clock() = default;

  // Milliseconds since an arbitrary moment. The count wraps about every 49.7 days: subtract unsigned, never compare two
  // readings.
  virtual std::uint32_t NowMs() const = 0;

  // The step, in milliseconds, by which NowMs() grows. At least 1.
  virtual std::uint32_t GranularityMs() const = 0;

  // Requests the system's finest timer resolution and returns the granted period, in milliseconds (at least 1). Call
  // ReleaseTimerPeriod() with it afterwards.
  virtual std::uint32_t RequestFinestTimerPeriod() = 0;
  virtual void ReleaseTimerPeriod(std::uint32_t period_ms) = 0;
};

}  // namespace tendril
