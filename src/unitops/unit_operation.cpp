#include "unitops/unit_operation.h"

#include "platform/runtime_error.h"
#include "serial/packets.h"

namespace tendril {
namespace {

constexpr char kStopped[] = "Stopped";

}  // namespace

void ShowCommError(MessageBoxes& boxes, const std::string& failure, const std::string& description) {
  boxes.Show(
      {failure.empty() ? description : failure + "\r\n" + description, "Comm Error!", BoxIcon::kCritical});
}

UnitOperation::UnitOperation(CommandContext& context, std::string_view poll_kinds, std::string fault_text)
    : context_(context), poll_kinds_(poll_kinds), fault_text_(std::move(fault_text)) {}

void UnitOperation::Start() {
  if (!MayStart()) return;
  what_ = Prepare();
  try {
    Begin();
  } catch (...) {
    const std::string fault = DescribeCurrentFault();
    StopAt(kStopped);
    ShowCommError(context_.boxes, fault_text_, fault);
  }
}

bool UnitOperation::MayStart() const {
  if (context_.running.Active()) return false;
  if (!context_.target.PortChosen()) {
    Show({"No comm port selected!!!\r\n\r\nYou must select a comm port first.", "No Port Selected",
          BoxIcon::kExclamation});
    return false;
  }
  return !context_.starting || context_.starting();
}

void UnitOperation::OnPollReply(bool replied, std::uint8_t unit, std::uint8_t kind, const Bytes& data) {
  if (poll_kinds_.find(static_cast<char>(kind)) == std::string_view::npos) return;
  try {
    if (context_.running.Cancelled()) {
      OnLastReply(replied, data);
      return Abort();
    }
    OnReply(replied, unit, data);
  } catch (...) {
    Fail({"Serial Event Error (Poll Type " + std::to_string(kind) + ")\r\n\r\n" + DescribeCurrentFault(),
          "Serial Event Error", BoxIcon::kNone});
  }
}

Timer& UnitOperation::MakeTimer(std::int32_t interval_ms, std::function<void()> on_tick) {
  timer_ = context_.timers.CreateTimer([this, on_tick = std::move(on_tick)] {
    try {
      if (!context_.running.Cancelled()) {
        on_tick();
      } else if (!Link().PollOutstanding()) {
        Abort();
      }
    } catch (...) {
      const std::string fault = DescribeCurrentFault();
      Abort();
      ShowCommError(context_.boxes, fault_text_, fault);
    }
  });
  timer_->SetInterval(interval_ms);
  return *timer_;
}

void UnitOperation::Refuse(const BoxMessage& box) {
  StopAt(kStopped);
  Show(box);
}

void UnitOperation::Stop() {
  StopTimer();
  context_.running.Stop();
}

void UnitOperation::Cancel() {
  context_.running.SetCancelled();
  if (!Link().PollOutstanding()) Abort();
}

void UnitOperation::Succeed(const std::string& text) {
  StopTimer();
  context_.running.EndCommandProgress(Outcome::kSuccess, text, Aftermath());
}

void UnitOperation::Fail(const BoxMessage& box) {
  Abort();
  Show(box);
}

void UnitOperation::StopAt(const std::string& where) {
  StopTimer();
  context_.running.StopAt({what_, where, Aftermath()});
}

void UnitOperation::Abort() {
  StopTimer();
  context_.running.EndCommandProgress(Outcome::kFailure, "COMMAND FAILED!", Aftermath());
}

void UnitOperation::SendUnlocked(bool& perhaps, const std::function<void()>& command) {
  // The link counts a packet when it tries to write it, as one byte less.
  const double with_unlock = Link().SentByteCount() + static_cast<double>(UnlockPacket(kAllUnits).size()) - 1;
  try {
    command();
    perhaps = true;
  } catch (...) {
    perhaps = Link().SentByteCount() > with_unlock;
    throw;
  }
}

void UnitOperation::StopTimer() {
  if (timer_) timer_->SetEnabled(false);
}

}  // namespace tendril
