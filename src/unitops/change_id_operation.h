// ChangeIdOperation: gives the unit on the line a new ID.
#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "platform/timer.h"
#include "unitops/command_context.h"

namespace tendril {

// Finds the unit at its old ID, sends the new one, and confirms that it answers there. Each stage polls once
// a tick, at most 15 times.
//
//   Idle --Start--> Finding
//   Finding --tick: a reply was seen; new ID sent--> Confirming
//   Confirming --tick: a reply was seen--> Idle (success)
//   Finding, Confirming --tick: no reply; next poll, up to 15--> as before
//   Finding, Confirming --16th tick without a reply, or a fault--> Idle (failed)
class ChangeIdOperation {
 public:
  // The poll kinds that find a unit and confirm its new ID.
  static constexpr std::uint8_t kFindPoll = '*';
  static constexpr std::uint8_t kConfirmPoll = '+';
  // Where the unit is looked for: all units answer there.
  static constexpr std::uint8_t kAnyUnit = 0xFF;

  // The context must outlive the operation.
  ChangeIdOperation(CommandContext& context, TimerFactory& timers);

  // "UPDATE Unit_ID": the unit on the line gets the ID that is chosen. Shows every failure; raises none.
  void Start();
  // Opens the port if needed and lets the ticks begin. Raises what the opening raises.
  void StartChangeAddress(std::uint8_t old_id, std::uint8_t new_id);
  // The reply, or its absence, to a poll of either kind.
  void OnPollReply(bool replied) { reply_seen_ = replied; }
  // Stops where it is and shows nothing: the window is closing.
  void Stop();

 private:
  enum class Stage { kFinding, kConfirming };

  void OnTick();
  void Step();
  // Counts a poll of the current stage; false when there have been enough.
  bool MayPollAgain();
  void Abort();
  void Fail(const std::string& text, const std::string& title);

  CommandContext& context_;
  std::unique_ptr<Timer> tmrChangeAddr_;
  std::uint8_t old_id_ = kAnyUnit;
  std::uint8_t new_id_ = 0;
  Stage stage_ = Stage::kFinding;
  std::int32_t attempts_ = 0;  // polls made in the current stage
  bool reply_seen_ = false;    // whether the last poll was answered; a new poll does not clear it
};

}  // namespace tendril
