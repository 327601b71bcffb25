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

  RunningCommand& Running() { return running_; }

 private:
  void OnPollReply(bool replied, std::uint8_t unit, std::uint8_t kind, const Bytes& data);

  HwSerial& link_;
  MessageBoxes& boxes_;
  CommandProgress progress_;
  RunningCommand running_;
  CommandContext context_;
  SendOperation send_;
};

}  // namespace tendril
