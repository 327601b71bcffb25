// ChangeIdOperation: gives the unit on the line a new ID.
#pragma once

#include <cstdint>
#include <string>

#include "unitops/unit_operation.h"

namespace tendril {

// Finds the unit at its old ID, sends the new one, and confirms that the unit answers there. Each stage polls once a
// tick, at most 15 times.
//
//   Idle --Start--> Finding
//   Finding --tick: a reply was seen; new ID sent--> Confirming
//   Confirming --tick: a reply was seen--> Idle (success)
//   Finding, Confirming --tick: no reply; next poll, up to 15--> as before
//   Finding, Confirming --16th tick without a reply, or a fault--> Idle (failed)
class ChangeIdOperation final : public UnitOperation {
 public:
  // The context must outlive the operation.
  explicit ChangeIdOperation(CommandContext& context);

  // Begins to give `new_id` to the unit at `old_id`: opens the port if needed and enables the timer. Raises what the
  // opening raises.
  void StartChangeAddress(std::uint8_t old_id, std::uint8_t new_id);
  // Whether the unit may have got the new ID of the last change.
  bool PerhapsChanged() const { return perhaps_changed_; }

 protected:
  std::string Prepare() override;
  void Begin() override;
  void OnReply(bool replied, std::uint8_t unit, const Bytes& data) override;
  void OnLastReply(bool replied, const Bytes& data) override { OnReply(replied, new_id_, data); }
  std::string Aftermath() const override;

 private:
  enum class Stage { kFinding, kConfirming };

  void OnTick();
  // Counts a poll of the current stage; false when there have been enough.
  bool MayPollAgain();

  Timer& tmrChangeAddr_;
  std::uint8_t old_id_ = 0;
  std::uint8_t new_id_ = 0;
  Stage stage_ = Stage::kFinding;
  bool perhaps_changed_ = false;
  std::int32_t attempts_ = 0;  // polls made in the current stage
  bool reply_seen_ = false;    // whether the last poll was answered; a new poll does not clear it
};

}  // namespace tendril
