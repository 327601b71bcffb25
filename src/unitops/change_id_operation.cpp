#include "unitops/change_id_operation.h"

#include "platform/hex_text.h"
#include "platform/runtime_error.h"

namespace tendril {
namespace {

constexpr std::int32_t kStepMs = 200;
constexpr std::int32_t kMaxPolls = 15;

}  // namespace

ChangeIdOperation::ChangeIdOperation(CommandContext& context, TimerFactory& timers)
    : context_(context), tmrChangeAddr_(timers.CreateTimer([this] { OnTick(); })) {
  tmrChangeAddr_->SetInterval(kStepMs);
}

void ChangeIdOperation::Start() {
  if (!MayStartCommand(context_)) return;
  try {
    const std::uint8_t new_id = context_.target.UnitId();
    StartChangeAddress(kAnyUnit, new_id);
    context_.running.Begin(UnitCommand::kChangeId, "Giving the unit the ID " + HexByte(new_id));
    context_.progress.StartCommandProgress();
  } catch (...) {
    ShowCommError(context_.boxes, {}, DescribeCurrentFault());
  }
}

void ChangeIdOperation::StartChangeAddress(std::uint8_t old_id, std::uint8_t new_id) {
  if (!context_.link.PortOpen()) context_.link.SetPortOpen(true);
  old_id_ = old_id;
  new_id_ = new_id;
  stage_ = Stage::kFinding;
  attempts_ = 0;
  reply_seen_ = false;
  tmrChangeAddr_->SetEnabled(true);
}

void ChangeIdOperation::OnTick() {
  try {
    Step();
  } catch (...) {
    const std::string fault = DescribeCurrentFault();
    Abort();
    ShowCommError(context_.boxes, {}, fault);
  }
}

void ChangeIdOperation::Step() {
  switch (stage_) {
    case Stage::kFinding:
      if (reply_seen_) {
        stage_ = Stage::kConfirming;
        attempts_ = 0;
        reply_seen_ = false;
        context_.link.cmdSetAddress(old_id_, new_id_, false);
      } else if (MayPollAgain()) {
        context_.link.cmdPollStation(old_id_, kFindPoll);
      } else {
        Fail("Unable to locate unit to change address. Check connections and power.", "Cannot Find Unit");
      }
      return;
    case Stage::kConfirming:
      if (reply_seen_) {
        Stop();
        context_.progress.EndCommandProgress(Outcome::kSuccess,
                                             "SUCCESS: UnitID set to '" + HexByte(new_id_) + "'");
      } else if (MayPollAgain()) {
        context_.link.cmdPollStation(new_id_, kConfirmPoll);
      } else {
        Fail("Unable to change Unit ID. Please retry.", "Cannot Change Unit ID");
      }
      return;
  }
  Fail("Unknown error has cause failure of Unit ID change.", "Unit ID Change Error");  // a stage that is none
}

bool ChangeIdOperation::MayPollAgain() { return ++attempts_ <= kMaxPolls; }

void ChangeIdOperation::Abort() {
  tmrChangeAddr_->SetEnabled(false);
  EndAsFailed(context_);
}

void ChangeIdOperation::Stop() {
  tmrChangeAddr_->SetEnabled(false);
  context_.running.End();
}

void ChangeIdOperation::Fail(const std::string& text, const std::string& title) {
  Abort();
  context_.boxes.Show({text, title, BoxIcon::kExclamation});
}

}  // namespace tendril
