// UnitCommands: the commands that the window runs against a unit.
#pragma once

#include <cstdint>
#include <functional>

#include "config/channel_config.h"
#include "platform/message_boxes.h"
#include "platform/timer.h"
#include "serial/hw_serial.h"
#include "trace/line_trace.h"
#include "unitops/change_id_operation.h"
#include "unitops/compare_operation.h"
#include "unitops/find_operation.h"
#include "unitops/get_operation.h"
#include "unitops/running_command.h"
#include "unitops/send_operation.h"
#include "unitops/unit_operation.h"
#include "unitops/unit_target.h"

namespace tendril {

// All commands share the link and the progress display, and only one runs at a time. Another one takes a class derived
// from UnitOperation and a member here.
struct UnitCommands {
  // Callbacks to the window. Each may be empty; none raises.
  struct Events {
    // See CommandContext.
    std::function<bool()> starting = nullptr;
    // Each reply to a poll of a command, or its absence; before the command takes it.
    std::function<void(std::uint8_t unit, bool replied)> polled = nullptr;
    // A get has just replaced the working configuration by that of `unit`, and still runs.
    std::function<void(std::uint8_t unit)> replaced = nullptr;
    // A send has just written the working configuration into `unit`, all of it, and still runs.
    std::function<void(std::uint8_t unit)> sent = nullptr;
    // A compare has just read what `unit` holds, all of it, and still runs.
    std::function<void(std::uint8_t unit, const OptionTable& held)> compared = nullptr;
    // A search for units begins, or has polled one more ID, and still runs.
    std::function<void()> searched = nullptr;
  };

  // Takes the link's poll replies. `trace` follows the link. Everything handed in must outlive it.
  UnitCommands(HwSerial& link, const LineTrace& trace, TimerFactory& timers, MessageBoxes& boxes,
               CommandProgressView& progress_view, const UnitTarget& target, ChannelTable& working,
               Events events);
  ~UnitCommands();

  // Stops the running command and shows nothing: the window is closing.
  void Stop();
  // Ends the running command, if there is one, as the user wishes: as failed, and without a box. An outstanding poll
  // ends first. False: no command runs.
  bool Cancel();

  RunningCommand running;
  CommandContext context;
  SendOperation send;           // "SEND(write) Configuration"
  GetOperation get;             // "GET(read) Configuration"
  CompareOperation compare;     // "Compare"
  ChangeIdOperation change_id;  // "UPDATE Unit_ID"
  FindOperation find;           // "Find Units"
};

}  // namespace tendril
