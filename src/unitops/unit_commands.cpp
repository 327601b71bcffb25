#include "unitops/unit_commands.h"

#include <string>
#include <utility>

#include "platform/runtime_error.h"

namespace tendril {

UnitCommands::UnitCommands(HwSerial& link, TimerFactory& timers, MessageBoxes& boxes,
                           CommandProgressView& progress_view, const UnitTarget& target,
                           ChannelTable& working, Events events)
    : link_(link),
      boxes_(boxes),
      progress_(timers, progress_view),
      context_{link, boxes, progress_, running_, target, std::move(events.starting)},
      send_(context_, timers, working),
      get_(context_, working, std::move(events.replaced)),
      change_id_(context_, timers) {
  link_.SetPollReplyHandler([this](bool replied, std::uint8_t unit, std::uint8_t kind, Bytes& data) {
    OnPollReply(replied, unit, kind, data);
  });
}

UnitCommands::~UnitCommands() { link_.SetPollReplyHandler(nullptr); }

void UnitCommands::Stop() {
  send_.Stop();
  change_id_.Stop();
}

void UnitCommands::OnPollReply(bool replied, std::uint8_t unit, std::uint8_t kind, const Bytes& data) {
  // A reply that is not of the running command belongs to one that has ended.
  try {
    switch (running_.Which()) {
      case UnitCommand::kNone:
        break;
      case UnitCommand::kSend:
        if (kind == SendOperation::kAcknowledgePoll) send_.OnPollReply(replied, unit, data);
        break;
      case UnitCommand::kGet:
        if (kind == GetOperation::kConfigurationPoll) get_.OnPollReply(replied, data);
        break;
      case UnitCommand::kChangeId:
        if (kind == ChangeIdOperation::kFindPoll || kind == ChangeIdOperation::kConfirmPoll)
          change_id_.OnPollReply(replied);
        break;
    }
  } catch (...) {
    const std::string fault = DescribeCurrentFault();
    Stop();
    EndAsFailed(context_);
    boxes_.Show({"Serial Event Error (Poll Type " + std::to_string(kind) + ")\r\n\r\n" + fault,
                 "Serial Event Error", BoxIcon::kNone});
  }
}

}  // namespace tendril
