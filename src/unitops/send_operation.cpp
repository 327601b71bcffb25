#include "unitops/send_operation.h"

#include <span>
#include <string>

#include "config/option_bytes.h"
#include "platform/hex_text.h"

namespace tendril {
namespace {

constexpr std::uint8_t kAcknowledgePoll = '0';
constexpr std::int32_t kNextPortMs = 300;
constexpr std::int32_t kMaxSendPolls = 3;
// The second byte of a reply that accepts the options.
constexpr std::uint8_t kAccepted = 10;
constexpr char kCannotPoll[] = "Error sending configuration, Please retry";

}  // namespace

SendOperation::SendOperation(CommandContext& context, const ChannelTable& working)
    : UnitOperation(context, "0", "Download Failed"),
      working_(working),
      tmrDownload_(MakeTimer(kNextPortMs, [this] { OnNextPort(); })) {}

void SendOperation::Begin() {
  port_index_ = 0;
  unanswered_ = 0;
  if (!EncodeAndSendPort(port_index_)) return;
  const std::uint8_t unit = UnitId();
  if (!Link().cmdPollStation(unit, kAcknowledgePoll)) return Show(SendError(kCannotPoll));
  Run("Sending the configuration to unit " + HexByte(unit));
}

void SendOperation::OnReply(bool replied, std::uint8_t unit, const Bytes& data) {
  if (replied && data.size() >= 2 && data[1] == kAccepted) {
    tmrDownload_.SetEnabled(true);
    return;
  }
  if (!replied && ++unanswered_ < kMaxSendPolls) {
    if (!Link().cmdPollStation(unit, kAcknowledgePoll)) {
      Fail(SendError("Error sending option command to the controller, Please retry"));
    }
    return;
  }
  Fail({"Unit did not respond to the Option Settings, Retry Command", "No Repsonse", BoxIcon::kCritical});
}

void SendOperation::OnNextPort() {
  tmrDownload_.SetEnabled(false);
  unanswered_ = 0;
  ++port_index_;
  if (port_index_ >= kPortCount) return Succeed("SUCCESS: Send Complete!");
  if (!EncodeAndSendPort(port_index_)) return;
  if (!Link().cmdPollStation(UnitId(), kAcknowledgePoll)) Fail(SendError(kCannotPoll));
}

bool SendOperation::EncodeAndSendPort(std::uint8_t port_index) {
  const auto encoded = EncodeOptions(working_.At(port_index));
  if (const auto* invalid = std::get_if<InvalidRecord>(&encoded)) {
    StopAt("Stopped: channel " + std::to_string(port_index + 1) + ": " + invalid->field + " cannot be sent");
    Show({invalid->text, "Internal Error", BoxIcon::kNone});
    return false;
  }
  const auto& options = std::get<OptionBytes>(encoded);
  Link().cmdSetManyOptions(UnitId(), 0, kOptionServoPort, static_cast<std::uint8_t>(port_index + 1),
                           options[0], options[1], options[2], std::span(options).subspan(3));
  return true;
}

}  // namespace tendril
