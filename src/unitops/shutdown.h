// Shutdown: closing the window, and giving back a port that was taken from the Control Panel first.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>

#include "platform/timer.h"
#include "serial/hw_serial.h"

namespace tendril {

// A port that was taken is closed and given back, and the window closes one tick later: the request to give
// it back needs a pass of the event loop to go out.
//
//   Open --close request, no port taken--> Closing (goes ahead)
//   Open --close request, a port taken--> Closing (port given back) --100 ms--> unload
//   Closing --close request--> goes ahead
class Shutdown {
 public:
  // give_back: hands a port back to the Control Panel. unload: closes the window, which asks again.
  Shutdown(HwSerial& link, TimerFactory& timers, std::function<void(std::int16_t port)> give_back,
           std::function<void()> unload);

  // The port whose control was asked of the Control Panel; nothing when none is held.
  void SetTakenPort(std::optional<std::int16_t> port) { taken_port_ = port; }

  // A close request of the person or the system: whether it goes ahead now.
  bool MayClose();

 private:
  HwSerial& link_;
  std::function<void(std::int16_t)> give_back_;
  std::unique_ptr<Timer> tmrPostQueryUnload_;
  std::optional<std::int16_t> taken_port_;
  bool closing_ = false;
};

}  // namespace tendril
