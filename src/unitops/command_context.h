// What the unit commands have in common.
#pragma once

#include <functional>
#include <string>

#include "platform/message_boxes.h"
#include "serial/hw_serial.h"
#include "unitops/command_progress.h"
#include "unitops/running_command.h"
#include "unitops/unit_target.h"

namespace tendril {

// What each command works with. Everything outlives the commands.
struct CommandContext {
  HwSerial& link;
  MessageBoxes& boxes;
  CommandProgress& progress;
  RunningCommand& running;
  const UnitTarget& target;
  // Asked when a command is about to start, before it sends anything: false forbids it. May be empty; raises nothing.
  std::function<bool()> make_way = {};
};

// Whether a unit command may start now: none runs, and a comm port is chosen. Tells the person when none is;
// otherwise whoever moves a servo makes way, or tells why not.
bool MayStartCommand(const CommandContext& context);

// Ends the running command as failed; the caller has stopped its timers, and shows a box afterwards.
void EndAsFailed(CommandContext& context);

// Shows a fault of a unit command. `failure` is the command's own text, empty when it has none.
void ShowCommError(MessageBoxes& boxes, const std::string& failure, const std::string& description);

}  // namespace tendril
