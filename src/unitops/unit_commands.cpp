#include "unitops/unit_commands.h"

#include <string>

#include "platform/runtime_error.h"

namespace tendril {

UnitCommands::UnitCommands(HwSerial& link, TimerFactory& timers, MessageBoxes& boxes,
                           CommandProgressView& progress_view, const UnitTarget& target,
                           const ChannelTable& working)
    : link_(link),
      boxes_(boxes),
      progress_(timers, progress_view),
      context_{link, boxes, progress_, running_, target},
      send_(context_, timers, working) {
  link_.SetPollReplyHandler([this](bool replied, std::uint8_t unit, std::uint8_t kind, Bytes& data) {
    OnPollReply(replied, unit, kind, data);
  });
}

UnitCommands::~UnitCommands() { link_.SetPollReplyHandler(nullptr); }

void UnitCommands::OnPollReply(bool replied, std::uint8_t unit, std::uint8_t kind, const Bytes& data) {
  // Without a command under way the reply belongs to one that has ended.
  if (!running_.Active() || kind != SendOperation::kAcknowledgePoll) return;
  try {
    send_.OnPollReply(replied, unit, data);
  } catch (...) {
    const std::string fault = DescribeCurrentFault();
    send_.Abort();
    boxes_.Show({"Serial Event Error (Poll Type " + std::to_string(kind) + ")\r\n\r\n" + fault,
                 "Serial Event Error", BoxIcon::kNone});
  }
}

}  // namespace tendril
