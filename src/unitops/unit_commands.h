// UnitCommands: the commands that the window runs against a unit, and who gets which reply.
#pragma once

#include <cstdint>

#include "config/channel_config.h"
#include "platform/message_boxes.h"
#include "platform/timer.h"
#include "serial/hw_serial.h"
#include "unitops/command_progress.h"
#include "unitops/running_command.h"
#include "unitops/send_operation.h"
#include "unitops/unit_target.h"

namespace tendril {

// One object for all of them, since they share the progress display, and only one runs at a time.
class UnitCommands {
 public:
  // Takes the link's poll replies. Everything handed in must outlive it.
  UnitCommands(HwSerial& link, TimerFactory& timers, MessageBoxes& boxes, CommandProgressView& progress_view,
               const UnitTarget& target, const ChannelTable& working);
  ~UnitCommands();
  UnitCommands(const UnitCommands&) = delete;
  UnitCommands& operator=(const UnitCommands&) = delete;

  // "SEND(write) Configuration".
  void Send() { send_.Start(); }

  // Stops whatever runs, and shows nothing: the window is closing.
  void Stop() { send_.Stop(); }

  // Which of them runs.
  RunningCommand& Running() { return running_; }

  // The reply, or its absence, to a poll of `kind`. Shows every failure; raises none. The link calls it.
  void OnPollReply(bool replied, std::uint8_t unit, std::uint8_t kind, const Bytes& data);

 private:
  HwSerial& link_;
  MessageBoxes& boxes_;
  CommandProgress progress_;
  RunningCommand running_;
  CommandContext context_;
  SendOperation send_;
};

}  // namespace tendril
