// Shutdown: closing the window, and giving back a port that was requested from the Control Panel first.
#pragma once

#include <functional>
#include <memory>

#include "platform/timer.h"
#include "serial/hw_serial.h"
#include "unitops/control_panel.h"

namespace tendril {

// A port that was requested is closed and given back, and the window closes one tick later: the request to give
// it back needs a pass of the event loop to go out.
//
//   Open --close request, no port requested--> Closing (goes ahead)
//   Open --close request, a port requested--> Closing (port given back) --100 ms--> unload
//   Closing --close request--> goes ahead
class Shutdown {
 public:
  // unload: closes the window, which asks again.
  Shutdown(HwSerial& link, TimerFactory& timers, ControlPanel& control_panel, std::function<void()> unload);

  // A close request of the user or the system: whether it goes ahead now.
  bool MayClose();

 private:
  HwSerial& link_;
  ControlPanel& control_panel_;
  std::unique_ptr<Timer> tmrPostQueryUnload_;
  bool closing_ = false;
};

}  // namespace tendril
