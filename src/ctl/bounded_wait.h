// Waiting with a limit.
#pragma once

#include <cstdint>
#include <functional>

#include "ctl/environment.h"

namespace tendril::ctl {

// Runs the event loop until `done` holds or `limit_ms` have passed. Returns whether it holds.
inline bool WaitUntil(Environment& environment, std::int32_t limit_ms, const std::function<bool()>& done) {
  bool over = false;
  const auto limit = environment.timers.CreateTimer([&over] { over = true; });
  limit->SetInterval(limit_ms);
  limit->SetEnabled(true);
  environment.waiting.Until([&] { return over || done(); });
  return done();
}

}  // namespace tendril::ctl
