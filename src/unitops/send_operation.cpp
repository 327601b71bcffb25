#include "unitops/send_operation.h"

#include <span>

#include "config/option_bytes.h"
#include "platform/hex_text.h"
#include "platform/runtime_error.h"

namespace tendril {
namespace {

constexpr std::int32_t kNextPortMs = 300;
constexpr std::int32_t kMaxPolls = 3;
// The second byte of a reply that accepts the options.
constexpr std::uint8_t kAccepted = 10;

constexpr char kSendError[] = "Send Error";

}  // namespace

SendOperation::SendOperation(CommandContext& context, TimerFactory& timers, const ChannelTable& working)
    : context_(context), working_(working), next_port_timer_(timers.CreateTimer([this] { OnNextPort(); })) {
  next_port_timer_->SetInterval(kNextPortMs);
}

void SendOperation::Start() {
  if (!MayStartCommand(context_)) return;
  try {
    port_index_ = 0;
    unanswered_ = 0;
    if (!EncodeAndSendPort(port_index_)) return;
    const std::uint8_t unit = context_.target.UnitId();
    if (!context_.link.cmdPollStation(unit, kAcknowledgePoll)) {
      context_.boxes.Show({"Error sending configuration, Please retry", kSendError, BoxIcon::kCritical});
      return;
    }
    context_.running.Begin(UnitCommand::kSend, "Sending the configuration to unit " + HexByte(unit));
    context_.progress.StartCommandProgress();
  } catch (...) {
    ShowFault(DescribeCurrentFault());
  }
}

void SendOperation::OnPollReply(bool replied, std::uint8_t unit, const Bytes& data) {
  if (replied && data.size() >= 2 && data[1] == kAccepted) {
    next_port_timer_->SetEnabled(true);
    return;
  }
  if (!replied && ++unanswered_ < kMaxPolls) {
    if (!context_.link.cmdPollStation(unit, kAcknowledgePoll)) {
      Fail("Error sending option command to the controller, Please retry", kSendError);
    }
    return;
  }
  Fail("Unit did not respond to the Option Settings, Retry Command", "No Repsonse");
}

void SendOperation::OnNextPort() {
  next_port_timer_->SetEnabled(false);
  try {
    unanswered_ = 0;
    ++port_index_;
    if (port_index_ >= kPortCount) {
      context_.running.End();
      context_.progress.EndCommandProgress(Outcome::kSuccess, "SUCCESS: Send Complete!");
      return;
    }
    if (!EncodeAndSendPort(port_index_)) return;
    if (!context_.link.cmdPollStation(context_.target.UnitId(), kAcknowledgePoll)) {
      Fail("Error sending configuration, Please retry", kSendError);
    }
  } catch (...) {
    Abort();
    ShowFault(DescribeCurrentFault());
  }
}

bool SendOperation::EncodeAndSendPort(std::uint8_t port_index) {
  const auto encoded = EncodeOptions(working_.At(port_index));
  if (const auto* invalid = std::get_if<InvalidRecord>(&encoded)) {
    context_.running.End("Stopped: channel " + std::to_string(port_index + 1) + ": " + invalid->field +
                         " cannot be sent");
    context_.boxes.Show({invalid->text, "Internal Error", BoxIcon::kNone});
    return false;
  }
  const auto& options = std::get<OptionBytes>(encoded);
  context_.link.cmdSetManyOptions(context_.target.UnitId(), 0, kOptionServoPort,
                                  static_cast<std::uint8_t>(port_index + 1), options[0], options[1],
                                  options[2], std::span(options).subspan(3));
  return true;
}

void SendOperation::Stop() {
  next_port_timer_->SetEnabled(false);
  context_.running.End();
}

void SendOperation::Abort() {
  next_port_timer_->SetEnabled(false);
  EndAsFailed(context_);
}

void SendOperation::Fail(const std::string& text, const std::string& title) {
  Abort();
  context_.boxes.Show({text, title, BoxIcon::kCritical});
}

void SendOperation::ShowFault(const std::string& description) {
  ShowCommError(context_.boxes, "Download Failed", description);
}

}  // namespace tendril
