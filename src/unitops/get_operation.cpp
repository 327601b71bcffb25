#include "unitops/get_operation.h"

#include <cstddef>
#include <span>
#include <utility>

#include "config/option_bytes.h"
#include "platform/hex_text.h"
#include "platform/runtime_error.h"

namespace tendril {
namespace {

constexpr std::int16_t kMaxPolls = 33;
constexpr std::size_t kReplySize = 1 + kOptionByteCount;  // the port number and its option bytes
constexpr char kSendError[] = "Send Error";

}  // namespace

GetOperation::GetOperation(CommandContext& context, ChannelTable& working, std::function<void()> on_replaced)
    : context_(context), working_(working), on_replaced_(std::move(on_replaced)) {}

void GetOperation::Start() {
  if (!MayStartCommand(context_)) return;
  try {
    for (std::size_t slot = 0; slot < kPortCount; ++slot) read_back_.At(slot).Received = false;
    repeats_ = 0;
    const std::uint8_t unit = context_.target.UnitId();
    if (!context_.link.cmdPollStation(unit, kConfigurationPoll)) {
      context_.boxes.Show({"Error Uploading Configuration, Please retry", kSendError, BoxIcon::kCritical});
      return;
    }
    context_.running.Begin(UnitCommand::kGet, "Reading the configuration of unit " + HexByte(unit));
    context_.progress.StartCommandProgress();
  } catch (...) {
    ShowCommError(context_.boxes, "Upload Failed", DescribeCurrentFault());
  }
}

void GetOperation::OnPollReply(bool replied, const Bytes& data) {
  if (replied && data.size() >= kReplySize) {
    const int slot = data[0] - 1;
    if (slot < 0 || slot >= static_cast<int>(kPortCount)) {
      Fail("Upload error: Invalid Port Index Received = " + std::to_string(slot), "Error",
           BoxIcon::kExclamation);
      return;
    }
    read_back_.At(static_cast<std::size_t>(slot)) =
        DecodeOptions(std::span(data).subspan<1, kOptionByteCount>());
  }
  if (HasAllPorts()) {
    ReplaceWorkingConfiguration();
    context_.running.End();
    context_.progress.EndCommandProgress(Outcome::kSuccess, "SUCCESS: Upload Complete");
    return;
  }
  if (++repeats_ >= kMaxPolls) {
    Fail("Error:1  Uploading Configuration, Please retry", kSendError, BoxIcon::kCritical);
  } else if (!context_.link.cmdPollStation(context_.target.UnitId(), kConfigurationPoll)) {
    Fail("Error:2 Uploading Configuration, Please retry", kSendError, BoxIcon::kCritical);
  }
}

bool GetOperation::HasAllPorts() const {
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    if (!read_back_.At(slot).Received) return false;
  }
  return true;
}

void GetOperation::ReplaceWorkingConfiguration() {
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    ChannelConfig& record = working_.At(slot);
    const bool received = record.Received;  // the mark belongs to the other table
    record = read_back_.At(slot);
    record.Received = received;
  }
  if (on_replaced_) on_replaced_();
}

void GetOperation::Fail(const std::string& text, const std::string& title, BoxIcon icon) {
  EndAsFailed(context_);
  context_.boxes.Show({text, title, icon});
}

}  // namespace tendril
