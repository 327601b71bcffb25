// UnitCommands: the commands that the window runs against a unit, and who gets which reply.
#pragma once

#include <cstdint>
#include <functional>

#include "config/channel_config.h"
#include "platform/message_boxes.h"
#include "platform/timer.h"
#include "serial/hw_serial.h"
#include "unitops/change_id_operation.h"
#include "unitops/command_context.h"
#include "unitops/command_progress.h"
#include "unitops/get_operation.h"
#include "unitops/running_command.h"
#include "unitops/send_operation.h"
#include "unitops/unit_target.h"

namespace tendril {

// One object for all of them, since they share the progress display, and only one runs at a time.
class UnitCommands {
 public:
  // What the commands tell the window. Either may be empty; neither raises.
  struct Events {
    // A command is about to start, and has sent nothing yet. False: it must not; the person has been told why.
    std::function<bool()> starting;
    // A get has just replaced the working configuration, and still runs.
    std::function<void()> replaced;
  };

  // Takes the link's poll replies. Everything handed in must outlive it.
  UnitCommands(HwSerial& link, TimerFactory& timers, MessageBoxes& boxes, CommandProgressView& progress_view,
               const UnitTarget& target, ChannelTable& working, Events events = {});
  ~UnitCommands();
  UnitCommands(const UnitCommands&) = delete;
  UnitCommands& operator=(const UnitCommands&) = delete;

  // "SEND(write) Configuration".
  void Send() { send_.Start(); }
  // "GET(read) Configuration".
  void Get() { get_.Start(); }
  // "UPDATE Unit_ID".
  void ChangeId() { change_id_.Start(); }

  // Stops whatever runs, and shows nothing: the window is closing.
  void Stop();

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
  GetOperation get_;
  ChangeIdOperation change_id_;
};

}  // namespace tendril
