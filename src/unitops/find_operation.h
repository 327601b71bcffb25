// FindOperation: finds the units on the line.
#pragma once

#include <cstdint>
#include <functional>
#include <string>

#include "trace/line_trace.h"
#include "unitops/unit_operation.h"
#include "unitops/unit_search.h"

namespace tendril {

// Polls the IDs of a range in order, 01 to FD unless another is set. The next poll follows the reply or the time-out at
// once. The chosen unit ID plays no part.
//
//   Idle --Start: the window disables its controls meanwhile--> Waiting
//   Waiting --tick: poll of the first ID out--> Polling
//   Polling --bytes that make no reply, for the first time: the same ID again--> Polling
//   Polling --otherwise, a reply or a time-out: poll of the next ID--> Polling
//   Polling --the last ID was polled--> Idle (success)
//   Waiting, Polling --the port is closed, or a fault--> Idle (failed; what was found stays)
class FindOperation final : public UnitOperation {
 public:
  // A unit's reply is lost while the program is too busy to release the line for it. This is time enough to paint the
  // window with its controls disabled, and the list.
  static constexpr std::int32_t kFirstPollMs = 100;

  // `trace` follows the link, and judges the polls that have no reply. `on_searched` (may be empty; raises nothing) is
  // called when a search begins and after each poll. Context and trace must outlive the operation.
  FindOperation(CommandContext& context, const LineTrace& trace, std::function<void()> on_searched);

  // The next searches poll the IDs from `first` to `last`, at least one. FF alone finds the only unit on the line,
  // whatever its ID is.
  // The first poll goes out `first_poll_ms` after the start, 1 or more.
  void SetRange(std::uint8_t first, std::uint8_t last, std::int32_t first_poll_ms = kFirstPollMs);
  // The search that runs, or the last one.
  const UnitSearch& Search() const { return search_; }

 protected:
  std::string Prepare() override;
  void Begin() override;
  void OnReply(bool replied, std::uint8_t unit, const Bytes& data) override;
  void OnLastReply(bool replied, const Bytes& data) override;
  std::string Aftermath() const override { return search_.Sentence(); }

 private:
  // The ID that is polled next, or whose poll is outstanding.
  std::uint8_t Id() const { return static_cast<std::uint8_t>(search_.first + search_.polled); }
  void Poll();
  void ShowSearch();

  const LineTrace& trace_;
  std::function<void()> on_searched_;
  Timer& tmrFirstPoll_;
  UnitSearch search_;
  std::uint8_t first_ = kFirstUnitId;  // of the next search
  std::uint8_t last_ = kLastUnitId;
  bool again_ = false;  // the outstanding poll is the second one of its ID
};

}  // namespace tendril
