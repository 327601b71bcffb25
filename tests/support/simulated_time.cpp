#include "support/simulated_time.h"

#include <algorithm>
#include <memory>
#include <utility>

namespace tendril::test {

class SimulatedTime::SimulatedTimer final : public Timer {
 public:
  SimulatedTimer(SimulatedTime& time, std::function<void()> on_tick)
      : time_(time), on_tick_(std::move(on_tick)) {
    time_.timers_.push_back(this);
  }
  ~SimulatedTimer() override { std::erase(time_.timers_, this); }

  void SetInterval(std::int32_t ms) override {
    interval_ms_ = ms;
    BeginPeriod();
  }
  std::int32_t Interval() const override { return interval_ms_; }
  void SetEnabled(bool enabled) override {
    enabled_ = enabled;
    BeginPeriod();
  }
  bool Enabled() const override { return enabled_; }

  bool Running() const { return enabled_ && interval_ms_ > 0; }
  bool CanTick() const { return Running() && !ticking_; }
  std::uint64_t due_ms() const { return due_ms_; }
  std::uint64_t period() const { return period_; }

  void Tick() {
    BeginPeriod();
    ticking_ = true;
    on_tick_();  // a test fails when this throws: no adapter lets a failure into the event loop
    ticking_ = false;
    due_ms_ = std::max(due_ms_, time_.elapsed_ms_);
  }

 private:
  void BeginPeriod() {
    due_ms_ = time_.elapsed_ms_ + static_cast<std::uint64_t>(std::max(interval_ms_, 0));
    period_ = ++time_.periods_begun_;
  }

  SimulatedTime& time_;
  std::function<void()> on_tick_;
  std::int32_t interval_ms_ = 0;
  bool enabled_ = false;
  bool ticking_ = false;
  std::uint64_t due_ms_ = 0;
  std::uint64_t period_ = 0;
};

std::uint32_t SimulatedTime::RequestFinestTimerPeriod() {
  ++open_period_requests_;
  return 1;
}

void SimulatedTime::ReleaseTimerPeriod(std::uint32_t /*period_ms*/) { --open_period_requests_; }

std::unique_ptr<Timer> SimulatedTime::CreateTimer(std::function<void()> on_tick) {
  return std::make_unique<SimulatedTimer>(*this, std::move(on_tick));
}

SimulatedTime::SimulatedTimer* SimulatedTime::NextDue(std::uint64_t until_ms) const {
  SimulatedTimer* next = nullptr;
  for (SimulatedTimer* timer : timers_) {
    if (!timer->CanTick() || timer->due_ms() > until_ms) continue;
    if (next == nullptr ||
        std::pair(timer->due_ms(), timer->period()) < std::pair(next->due_ms(), next->period())) {
      next = timer;
    }
  }
  return next;
}

void SimulatedTime::Advance(std::uint64_t ms) {
  const std::uint64_t until_ms = elapsed_ms_ + ms;
  while (SimulatedTimer* timer = NextDue(until_ms)) {
    elapsed_ms_ = std::max(elapsed_ms_, timer->due_ms());
    timer->Tick();
    if (observer_) observer_();
  }
  elapsed_ms_ = std::max(elapsed_ms_, until_ms);
}

bool SimulatedTime::AdvanceUntil(const std::function<bool()>& done, std::uint64_t limit_ms) {
  for (std::uint64_t passed = 0; passed < limit_ms && !done(); ++passed) Advance(1);
  return done();
}

int SimulatedTime::RunningTimers() const {
  return static_cast<int>(
      std::count_if(timers_.begin(), timers_.end(), [](auto* t) { return t->Running(); }));
}

}  // namespace tendril::test
