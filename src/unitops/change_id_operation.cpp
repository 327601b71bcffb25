#include "unitops/change_id_operation.h"

#include <string>

#include "platform/hex_text.h"
#include "serial/packets.h"

namespace tendril {
namespace {

constexpr std::uint8_t kFindPoll = '*';
constexpr std::uint8_t kConfirmPoll = '+';
constexpr std::int32_t kChangeAddrMs = 200;
constexpr std::int32_t kMaxStagePolls = 15;

}  // namespace

ChangeIdOperation::ChangeIdOperation(CommandContext& context)
    : UnitOperation(context, "*+", {}), tmrChangeAddr_(MakeTimer(kChangeAddrMs, [this] { OnTick(); })) {}

std::string ChangeIdOperation::Prepare() {
  new_id_ = UnitId();
  stage_ = Stage::kFinding;
  perhaps_changed_ = false;
  return "Giving the unit the ID " + HexByte(new_id_);
}

void ChangeIdOperation::Begin() {
  StartChangeAddress(kAllUnits, new_id_);
  Run();
  ShowStep("looking for it");
}

void ChangeIdOperation::StartChangeAddress(std::uint8_t old_id, std::uint8_t new_id) {
  if (!Link().PortOpen()) Link().SetPortOpen(true);
  old_id_ = old_id;
  new_id_ = new_id;
  stage_ = Stage::kFinding;
  attempts_ = 0;
  reply_seen_ = false;
  tmrChangeAddr_.SetEnabled(true);
}

void ChangeIdOperation::OnReply(bool replied, std::uint8_t /*unit*/, const Bytes& /*data*/) {
  reply_seen_ = replied;
}

void ChangeIdOperation::OnTick() {
  switch (stage_) {
    case Stage::kFinding:
      if (reply_seen_) {
        stage_ = Stage::kConfirming;
        attempts_ = 0;
        reply_seen_ = false;
        SendUnlocked(perhaps_changed_, [&] { Link().cmdSetAddress(old_id_, new_id_, false); });
        ShowStep("asking whether it has it");
      } else if (MayPollAgain()) {
        Link().cmdPollStation(old_id_, kFindPoll);
      } else {
        Fail({"Unable to locate unit to change address. Check connections and power.", "Cannot Find Unit",
              BoxIcon::kExclamation});
      }
      return;
    case Stage::kConfirming:
      if (reply_seen_) {
        Succeed("SUCCESS: UnitID set to '" + HexByte(new_id_) + "'");
      } else if (MayPollAgain()) {
        Link().cmdPollStation(new_id_, kConfirmPoll);
      } else {
        Fail({"Unable to change Unit ID. Please retry.", "Cannot Change Unit ID", BoxIcon::kExclamation});
      }
      return;
  }
  // A stage that does not exist.
  Fail({"Unknown error has cause failure of Unit ID change.", "Unit ID Change Error", BoxIcon::kExclamation});
}

std::string ChangeIdOperation::Aftermath() const {
  if (!perhaps_changed_) return "No ID has changed.";
  const std::string id = HexByte(new_id_);
  return reply_seen_ ? "The unit answers at " + id + "." : "The unit may be at " + id + " already.";
}

bool ChangeIdOperation::MayPollAgain() { return ++attempts_ <= kMaxStagePolls; }

}  // namespace tendril
