#include "unitops/unit_operation.h"

#include "platform/runtime_error.h"

namespace tendril {

void ShowCommError(MessageBoxes& boxes, const std::string& failure, const std::string& description) {
  boxes.Show(
      {failure.empty() ? description : failure + "\r\n" + description, "Comm Error!", BoxIcon::kCritical});
}

UnitOperation::UnitOperation(CommandContext& context, std::string_view poll_kinds, std::string fault_text)
    : context_(context), poll_kinds_(poll_kinds), fault_text_(std::move(fault_text)) {}

void UnitOperation::Start() {
  if (!MayStart()) return;
  try {
    Begin();
  } catch (...) {
    ShowCommError(context_.boxes, fault_text_, DescribeCurrentFault());
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
    if (cancelled_) {
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
      if (!cancelled_) {
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

void UnitOperation::Run(std::string what) {
  cancelled_ = false;
  context_.running.StartCommandProgress(*this, std::move(what));
}

void UnitOperation::Cancel() {
  cancelled_ = true;
  if (!Link().PollOutstanding()) Abort();
}

void UnitOperation::Succeed(const std::string& text) {
  StopTimer();
  context_.running.EndCommandProgress(Outcome::kSuccess, text);
}

void UnitOperation::Fail(const BoxMessage& box) {
  Abort();
  Show(box);
}

void UnitOperation::StopAt(const std::string& where) {
  StopTimer();
  context_.running.SetAftermath(Aftermath());
  context_.running.Stop(where);
}

void UnitOperation::Abort() {
  StopTimer();
  context_.running.SetAftermath(Aftermath());
  context_.running.EndCommandProgress(Outcome::kFailure, "COMMAND FAILED!");
}

void UnitOperation::StopTimer() {
  if (timer_) timer_->SetEnabled(false);
}

}  // namespace tendril
