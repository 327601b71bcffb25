#include "unitops/find_operation.h"

#include <utility>

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
      on_searched_(std::move(on_searched)) {}

std::string FindOperation::Prepare() {
  search_ = {};
  return "Finding units";
}

void FindOperation::Begin() {
  if (!Link().cmdPollStation(Id(), kSearchPoll)) return Refuse(SendError(kCannotSearch));
  Run();
  ShowSearch();
}

void FindOperation::OnReply(bool replied, std::uint8_t /*unit*/, const Bytes& data) {
  // A poll would open the port again, and the line behind it may be another one.
  if (!Link().PortOpen()) {
    return Fail(
        {"The serial port was closed while units were searched for.", "Comm Error!", BoxIcon::kCritical});
  }
  OnLastReply(replied, data);
  const bool over = search_.polled == UnitSearch::kIds;
  if (!over && !Link().cmdPollStation(Id(), kSearchPoll)) return Fail(SendError(kCannotSearch));
  ShowSearch();  // takes its time while the poll is out
  if (over) Succeed("Search complete");
}

void FindOperation::OnLastReply(bool replied, const Bytes& data) {
  if (!Link().PortOpen()) return;
  const std::uint8_t id = Id();
  const PollOutcome outcome = trace_.Polls().empty() ? PollOutcome::kSilence : trace_.Polls().back().outcome;
  if (outcome == PollOutcome::kOtherAnswer) {
    search_.found.push_back({id, FoundUnit::What::kOtherAnswer, id});
  } else if (replied) {
    search_.found.push_back({id, FoundUnit::What::kAnswers, data.empty() ? id : data[0]});
  } else if (PerhapsSeveralUnits(trace_)) {
    search_.found.push_back({id, FoundUnit::What::kPerhapsSeveral, id});
  }
  ++search_.polled;
  const bool adapter = outcome == PollOutcome::kSilence || outcome == PollOutcome::kEchoDamaged;
  if (search_.polled == UnitSearch::kIds && adapter) search_.fault = JudgeLine(trace_).sentence;
}

void FindOperation::ShowSearch() {
  ShowStep(search_.Step());
  if (on_searched_) on_searched_();
}

}  // namespace tendril
