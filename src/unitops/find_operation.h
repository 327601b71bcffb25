// FindOperation: finds the units on the line.
#pragma once

#include <cstdint>
#include <functional>
#include <string>

#include "unitops/unit_operation.h"
#include "unitops/unit_search.h"

namespace tendril {

// Polls each ID once, in order. The next poll follows the reply or the time-out at once. The chosen unit ID plays no
// part.
//
//   Idle --Start: poll of the first ID out--> Polling
//   Polling --a reply, or a time-out: poll of the next ID--> Polling
//   Polling --the last ID was polled--> Idle (success)
//   Polling --the port is closed, or a fault--> Idle (failed; what was found stays)
class FindOperation final : public UnitOperation {
 public:
  // `bytes_came` returns whether bytes came after the last poll that make no reply. `on_searched` is called when a search
  // begins and after each poll. Both may be empty, and raise nothing. The context must outlive the operation.
  FindOperation(CommandContext& context, std::function<bool()> bytes_came, std::function<void()> on_searched);

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
  std::uint8_t Id() const { return static_cast<std::uint8_t>(kFirstUnitId + search_.polled); }
  void ShowSearch();

  std::function<bool()> bytes_came_;
  std::function<void()> on_searched_;
  UnitSearch search_;
};

}  // namespace tendril
