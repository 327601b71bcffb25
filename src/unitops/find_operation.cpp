#include "unitops/find_operation.h"

#include <utility>

namespace tendril {
namespace {

constexpr std::uint8_t kSearchPoll = '*';
constexpr char kCannotSearch[] = "Error finding units, Please retry";

}  // namespace

FindOperation::FindOperation(CommandContext& context, std::function<bool()> bytes_came,
                             std::function<void()> on_searched)
    : UnitOperation(context, "*", "Finding Units Failed"),
      bytes_came_(std::move(bytes_came)),
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
  if (replied) {
    search_.found.push_back({id, data.empty() ? id : data[0], false});
  } else if (bytes_came_ && bytes_came_()) {
    search_.found.push_back({id, id, true});
  }
  ++search_.polled;
}

void FindOperation::ShowSearch() {
  ShowStep(search_.Step());
  if (on_searched_) on_searched_();
}

}  // namespace tendril
