#include "unitops/shutdown.h"

#include <utility>

namespace tendril {
namespace {

constexpr std::int32_t kUnloadDelayMs = 100;

}  // namespace

Shutdown::Shutdown(HwSerial& link, TimerFactory& timers, ControlPanel& control_panel,
                   std::function<void()> unload)
    : link_(link),
      control_panel_(control_panel),
      tmrPostQueryUnload_(timers.CreateTimer([this, unload = std::move(unload)] {
        tmrPostQueryUnload_->SetEnabled(false);
        unload();
      })) {
  tmrPostQueryUnload_->SetInterval(kUnloadDelayMs);
}

bool Shutdown::MayClose() {
  if (std::exchange(closing_, true) || !control_panel_.RequestedPort()) return true;
  link_.SetCommPort(0);
  tmrPostQueryUnload_->SetEnabled(true);
  control_panel_.RelinquishPort();
  return false;
}

}  // namespace tendril
