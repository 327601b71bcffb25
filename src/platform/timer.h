// Timer: a periodic timer like a form's timer control.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>

namespace tendril {

// Ticks every Interval() milliseconds while it is enabled, on the program's one thread. A fresh timer is
// disabled with interval 0. While a tick is being handled the same timer does not tick again, even when the
// handler runs the event loop (a message box); others do.
class Timer {
 public:
  virtual ~Timer() = default;

  // Interval in milliseconds, at least 0. 0 never ticks. Setting it on an enabled timer starts the period
  // anew.
  virtual void SetInterval(std::int32_t ms) = 0;
  // The interval that was set last.
  virtual std::int32_t Interval() const = 0;

  // Enabling starts a new period, also when the timer was enabled already.
  virtual void SetEnabled(bool enabled) = 0;
  // Whether it is enabled, ticking or not.
  virtual bool Enabled() const = 0;
};

// Makes timers. Who creates a timer owns it, and may destroy it at any time outside of its own tick.
class TimerFactory {
 public:
  virtual ~TimerFactory() = default;
  virtual std::unique_ptr<Timer> CreateTimer(std::function<void()> on_tick) = 0;
};

}  // namespace tendril
