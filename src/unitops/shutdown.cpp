#include "unitops/shutdown.h"

#include <utility>

namespace tendril {
namespace {

constexpr std::int32_t kUnloadDelayMs = 100;

}  // namespace

Shutdown::Shutdown(HwSerial& link, TimerFactory& timers, std::function<void(std::int16_t port)> give_back,
                   std::function<void()> unload)
    : link_(link),
      give_back_(std::move(give_back)),
      tmrPostQueryUnload_(timers.CreateTimer([this, unload = std::move(unload)] {
        tmrPostQueryUnload_->SetEnabled(false);
        unload();
      })) {
  tmrPostQueryUnload_->SetInterval(kUnloadDelayMs);
}

bool Shutdown::MayClose() {
  if (std::exchange(closing_, true) || !taken_port_) return true;
  link_.SetCommPort(0);
  tmrPostQueryUnload_->SetEnabled(true);
  give_back_(*taken_port_);
  return false;
}

}  // namespace tendril
