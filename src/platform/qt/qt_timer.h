// QtTimerFactory: timers that tick from Qt's event loop.
#pragma once

#include <functional>
#include <memory>

#include "platform/qt/fault_handler.h"
#include "platform/timer.h"

namespace tendril {

// Its timers never tick early. A tick that fails disables its timer, because it would probably fail again before the
// user has read the message, and is reported to `on_fault`.
class QtTimerFactory final : public TimerFactory {
 public:
  // On Windows, a timer that is exact takes a thread, and keeps the system's clock at 1 ms. The others are up to 16 ms late
  // there.
  explicit QtTimerFactory(FaultHandler on_fault, bool exact = true)
      : on_fault_(std::move(on_fault)), exact_(exact) {}

  // The timer may be destroyed inside its own tick.
  std::unique_ptr<Timer> CreateTimer(std::function<void()> on_tick) override;

 private:
  FaultHandler on_fault_;
  bool exact_;
};

}  // namespace tendril
