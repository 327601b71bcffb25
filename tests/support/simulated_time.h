// Simulated time: a clock and timers that move only when a test advances them.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <utility>
#include <vector>

#include "platform/clock.h"
#include "platform/timer.h"

namespace tendril::test {

// The clock and the timers of one test. Nothing ticks by itself: Advance() runs what is due in order of time,
// timers of the same moment in the order in which their periods began.
class SimulatedTime final : public Clock, public TimerFactory {
 public:
  // `start_ms` is the first reading of the clock; near 2^32 it covers the wrap.
  explicit SimulatedTime(std::uint32_t start_ms = 1000) : start_ms_(start_ms) {}

  std::uint32_t NowMs() const override { return start_ms_ + static_cast<std::uint32_t>(elapsed_ms_); }
  std::uint32_t GranularityMs() const override { return 1; }
  std::uint32_t RequestFinestTimerPeriod() override;
  void ReleaseTimerPeriod(std::uint32_t period_ms) override;
  std::unique_ptr<Timer> CreateTimer(std::function<void()> on_tick) override;

  // Lets `ms` milliseconds pass. May be called from within a tick: a message box that runs the event loop.
  void Advance(std::uint64_t ms);
  // Advances by single milliseconds until `done` or until `limit_ms` have passed; returns whether `done` held.
  bool AdvanceUntil(const std::function<bool()>& done, std::uint64_t limit_ms);

  // Called after each tick, when all of it is over.
  void SetObserver(std::function<void()> observer) { observer_ = std::move(observer); }

  std::uint64_t ElapsedMs() const { return elapsed_ms_; }
  // Timers that would tick if time went on.
  int RunningTimers() const;
  // Resolution requests that were not released.
  int OpenPeriodRequests() const { return open_period_requests_; }

 private:
  class SimulatedTimer;
  SimulatedTimer* NextDue(std::uint64_t until_ms) const;

  std::uint32_t start_ms_;
  std::uint64_t elapsed_ms_ = 0;
  std::uint64_t periods_begun_ = 0;
  int open_period_requests_ = 0;
  std::vector<SimulatedTimer*> timers_;
  std::function<void()> observer_;
};

}  // namespace tendril::test
