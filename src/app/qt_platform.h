// QtPlatform: the Qt adapters of the programs, apart from the serial device.
#pragma once

#include <string>

#include "platform/qt/fault_handler.h"
#include "platform/qt/qt_message_boxes.h"
#include "platform/qt/qt_timer.h"
#include "platform/steady_clock.h"

namespace tendril {

struct QtPlatform {
  SteadyClock clock;
  QtMessageBoxes boxes;
  // A failure that no part of the program could handle is shown, and the program goes on.
  FaultHandler on_fault = [this](const std::string& description) {
    boxes.Show({description, kDefaultBoxTitle, BoxIcon::kCritical});
  };
  QtTimerFactory timers{on_fault};
  QtTimerFactory inexact_timers{on_fault, false};  // for the connection to the Control Panel
};

}  // namespace tendril
