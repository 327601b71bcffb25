#include "unitops/unit_commands.h"

#include <utility>

namespace tendril {

UnitCommands::UnitCommands(HwSerial& link, const LineTrace& trace, TimerFactory& timers, MessageBoxes& boxes,
                           CommandProgressView& progress_view, const UnitTarget& target,
                           ChannelTable& working, Events events)
    : running(timers, progress_view),
      context{link, timers, boxes, running, target, std::move(events.starting)},
      send(context, working, std::move(events.sent)),
      get(context, working, std::move(events.replaced)),
      compare(context, std::move(events.compared)),
      change_id(context),
      find(context, trace, std::move(events.searched)) {
  link.SetPollReplyHandler([this, polled = std::move(events.polled)](bool replied, std::uint8_t unit,
                                                                     std::uint8_t kind, Bytes& data) {
    if (polled) polled(unit, replied);
    if (running.Active()) running.Operation()->OnPollReply(replied, unit, kind, data);
  });
}

UnitCommands::~UnitCommands() { context.link.SetPollReplyHandler(nullptr); }

void UnitCommands::Stop() {
  if (running.Active()) running.Operation()->Stop();
}

bool UnitCommands::Cancel() {
  if (!running.Active()) return false;
  running.Operation()->Cancel();
  return true;
}

}  // namespace tendril
