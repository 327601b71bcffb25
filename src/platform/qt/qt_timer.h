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
  explicit QtTimerFactory(FaultHandler on_fault) : on_fault_(std::move(on_fault)) {}

  // The timer may be destroyed inside its own tick.
  std::unique_ptr<Timer> CreateTimer(std::function<void()> on_tick) override;

 private:
  FaultHandler on_fault_;
};

}  // namespace tendril
