#include "unitops/find_operation.h"

#include <utility>

#include "serial/packets.h"
#include "trace/line_verdict.h"

namespace tendril {
namespace {

constexpr std::uint8_t kSearchPoll = '*';
constexpr char kCannotSearch[] = "Error finding units, Please retry";

}  // namespace

FindOperation::FindOperation(CommandContext& context, const LineTrace& trace,
                             std::function<void()> on_searched)
    : UnitOperation(context, "*", "Finding Units Failed"),
      trace_(trace),
      on_searched_(std::move(on_searched)),
      tmrFirstPoll_(MakeTimer(kFirstPollMs, [this] {
        tmrFirstPoll_.SetEnabled(false);
        Poll();
      })) {}

void FindOperation::SetRange(std::uint8_t first, std::uint8_t last, std::int32_t first_poll_ms) {
  tmrFirstPoll_.SetInterval(first_poll_ms);
  first_ = first;
  last_ = last;
}

std::string FindOperation::Prepare() {
  search_ = {.first = first_, .last = last_, .port = Link().CommPort()};
  again_ = false;
  return "Finding units";
}

void FindOperation::Begin() {
  if (on_searched_) on_searched_();  // what was found before is gone, even if the search cannot begin
  if (!Link().PortOpen()) Link().SetPortOpen(true);
  tmrFirstPoll_.SetEnabled(true);
  Run();
  ShowSearch();
}

void FindOperation::OnReply(bool replied, std::uint8_t /*unit*/, const Bytes& data) {
  // Units that answer at once do so again; noise, or a line that was released too late, does not.
  if (!replied && !again_ && PerhapsSeveralUnits(trace_)) {
    again_ = true;
    return Poll();
  }
  OnLastReply(replied, data);
  ShowSearch();
  if (search_.Complete()) return Succeed("SUCCESS: Search Complete");
  Poll();
}

void FindOperation::Poll() {
  // A poll would open the port again, and the line behind it may be another one.
  if (!Link().PortOpen()) {
    return Fail(
        {"The serial port was closed while units were searched for.", "Comm Error!", BoxIcon::kCritical});
  }
  if (!Link().cmdPollStation(Id(), kSearchPoll)) Fail(SendError(kCannotSearch));
}

void FindOperation::OnLastReply(bool replied, const Bytes& data) {
  if (!Link().PortOpen()) return;
  const bool polled_again = std::exchange(again_, false);
  // A unit that was asked as all units names its own ID.
  const std::uint8_t id = Id() == kAllUnits && replied && !data.empty() ? data[0] : Id();
  const PollOutcome outcome = trace_.Polls().empty() ? PollOutcome::kSilence : trace_.Polls().back().outcome;
  if (outcome == PollOutcome::kOtherUnit) {
    search_.Add(data[0], FoundUnit::What::kAnswersLate);
  } else if (outcome == PollOutcome::kOtherAnswer) {
    search_.Add(id, FoundUnit::What::kOtherAnswer);
  } else if (replied) {
    search_.Add(id, FoundUnit::What::kAnswers);
  } else if (polled_again && PerhapsSeveralUnits(trace_)) {
    search_.Add(id, FoundUnit::What::kPerhapsSeveral);
  }
  ++search_.polled;
  const bool adapter = outcome == PollOutcome::kSilence || outcome == PollOutcome::kEchoDamaged;
  if (search_.Complete() && adapter) search_.fault = JudgeLine(trace_).sentence;
}

void FindOperation::ShowSearch() {
  ShowStep(search_.Step(), search_.Part());
  if (on_searched_) on_searched_();
}

}  // namespace tendril
