#include "unitops/send_operation.h"

#include <span>
#include <string>
#include <utility>

#include "config/option_bytes.h"
#include "platform/hex_text.h"
#include "serial/packets.h"

namespace tendril {
namespace {

constexpr std::uint8_t kAcknowledgePoll = '0';
constexpr std::int32_t kNextPortMs = 300;
constexpr std::int32_t kMaxSendPolls = 3;
constexpr char kCannotPoll[] = "Error sending configuration, Please retry";

}  // namespace

SendOperation::SendOperation(CommandContext& context, const ChannelTable& working,
                             std::function<void(std::uint8_t unit)> on_sent)
    : UnitOperation(context, "0", "Download Failed"),
      working_(working),
      on_sent_(std::move(on_sent)),
      tmrDownload_(MakeTimer(kNextPortMs, [this] { OnNextPort(); })) {}

std::string SendOperation::Prepare() {
  port_index_ = 0;
  unanswered_ = 0;
  written_ = 0;
  perhaps_written_ = false;
  writing_taken_ = false;
  unit_ = UnitId();
  return "Sending to unit " + HexByte(unit_);
}

void SendOperation::Begin() {
  if (!EncodeAndSendPort(port_index_)) return;
  if (!Link().cmdPollStation(unit_, kAcknowledgePoll)) return Refuse(SendError(kCannotPoll));
  Run();
  ShowPort();
}

void SendOperation::OnReply(bool replied, std::uint8_t unit, const Bytes& data) {
  OnLastReply(replied, data);
  if (!perhaps_written_) {
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

void SendOperation::OnLastReply(bool replied, const Bytes& data) {
  if (!replied || data.size() < 2 || data[1] != kReplyAccepted) return;
  ++written_;
  perhaps_written_ = false;
}

void SendOperation::OnNextPort() {
  tmrDownload_.SetEnabled(false);
  unanswered_ = 0;
  ++port_index_;
  if (port_index_ >= kPortCount) {
    if (on_sent_) on_sent_(unit_);
    return Succeed("SUCCESS: Send Complete!");
  }
  if (!EncodeAndSendPort(port_index_)) return;
  ShowPort();
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
  SendUnlocked(perhaps_written_, [&] {
    Link().cmdSetManyOptions(UnitId(), 0, kOptionServoPort, static_cast<std::uint8_t>(port_index + 1),
                             options[0], options[1], options[2], std::span(options).subspan(3));
  });
  return true;
}

SendOperation::Written SendOperation::WhatIsWritten() const {
  if (written_ == static_cast<std::int32_t>(kPortCount)) return Written::kAll;
  if (written_ > 0) return Written::kPart;
  return perhaps_written_ ? Written::kPerhaps : Written::kNothing;
}

std::string SendOperation::Aftermath() const {
  const auto ports = [](std::int32_t first, std::int32_t last) {
    return first == last ? std::to_string(first) : std::to_string(first) + " to " + std::to_string(last);
  };
  const std::int32_t count = static_cast<std::int32_t>(kPortCount);
  const std::int32_t untouched = written_ + (perhaps_written_ ? 2 : 1);  // the first one
  std::string text;
  if (written_ == 0 && !perhaps_written_) return "Nothing is written.";
  if (written_ > 0) {
    text += std::string(written_ == 1 ? "Port " : "Ports ") + ports(1, written_) +
            (written_ == 1 ? " is" : " are") + " written";
  }
  if (perhaps_written_)
    text += written_ == 0 ? "Port 1 is perhaps written" : ", " + std::to_string(written_ + 1) + " perhaps";
  if (untouched <= count)
    text += ", " + ports(untouched, count) + (untouched == count ? " is" : " are") + " not";
  return text + ".";
}

}  // namespace tendril
