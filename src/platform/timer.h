// Timer: a periodic timer like a form's timer control.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>

namespace tendril {

// Ticks every Interval() milliseconds while it is enabled, on the program's one thread. A new timer is disabled and has
// interval 0. While a tick is handled, the same timer does not tick again, even when the handler runs the event loop (a
// message box); others do.
class Timer {
 public:
  virtual ~Timer() = default;

  // Milliseconds, at least 0. 0 never ticks. Setting it on an enabled timer starts a new period.
  virtual void SetInterval(std::int32_t ms) = 0;
  // The last interval that was set.
  virtual std::int32_t Interval() const = 0;

  // Enabling starts a new period, also when the timer was enabled already.
  virtual void SetEnabled(bool enabled) = 0;
  // Whether it is enabled, ticking or not.
  virtual bool Enabled() const = 0;
};

// Makes timers. The caller owns them, and must not destroy one inside its own tick.
class TimerFactory {
 public:
  virtual ~TimerFactory() = default;
  virtual std::unique_ptr<Timer> CreateTimer(std::function<void()> on_tick) = 0;
};

}  // namespace tendril
