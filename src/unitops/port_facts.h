// PortFacts: what is known of the comm port that the user has chosen.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "commlistener/comm_listener_interface.h"
#include "platform/serial_device.h"

namespace tendril {

// Why the chosen port is not open.
enum class PortFault {
  kNone,  // it is open, or was closed by the program
  kInUse,
  kControlPanelHasIt,
  kNotAllowed,
  kGone,   // its device was unplugged
  kOther,  // see PortFacts::reason
};

// Plain facts; PortSelection keeps them.
struct PortFacts {
  bool any_listed = true;   // the list has a port
  std::int16_t chosen = 0;  // the line that is selected; 0: "Select"
  std::int16_t open = 0;    // the port that is open; 0: none
  std::string device = {};  // of the open port, for the user
  PortFault fault = PortFault::kNone;
  std::string reason = {};     // in the system's words
  PortHolder holder = {};      // kInUse, kControlPanelHasIt: which program has it open
  bool back = false;           // kGone: the device is there again
  std::int16_t requested = 0;  // the port that was asked of the Control Panel; 0: none
  PortControl request = PortControl::kNone;
};

}  // namespace tendril
