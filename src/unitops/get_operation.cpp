#include "unitops/get_operation.h"

#include <cstddef>
#include <span>
#include <string>
#include <utility>

#include "config/option_bytes.h"
#include "platform/hex_text.h"

namespace tendril {
namespace {

constexpr std::uint8_t kConfigurationPoll = 'n';
constexpr std::int16_t kMaxGetPolls = 33;
constexpr std::size_t kReplySize = 1 + kOptionByteCount;  // the port number and its option bytes

}  // namespace

GetOperation::GetOperation(CommandContext& context, ChannelTable& working,
                           std::function<void(std::uint8_t unit)> on_replaced)
    : UnitOperation(context, "n", "Upload Failed"), working_(working), on_replaced_(std::move(on_replaced)) {}

std::string GetOperation::Prepare() {
  for (std::size_t slot = 0; slot < kPortCount; ++slot) read_back_.At(slot).Received = false;
  repeats_ = 0;
  replaced_ = false;
  return "Reading unit " + HexByte(UnitId());
}

void GetOperation::Begin() {
  if (!Link().cmdPollStation(UnitId(), kConfigurationPoll)) {
    return Refuse(SendError("Error Uploading Configuration, Please retry"));
  }
  Run();
  ShowProgress();
}

void GetOperation::ShowProgress() {
  ShowStep(std::to_string(ReceivedPorts()) + " of " + std::to_string(kPortCount) + " ports");
}

void GetOperation::OnReply(bool replied, std::uint8_t unit, const Bytes& data) {
  if (replied && data.size() >= kReplySize) {
    const int slot = data[0] - 1;
    if (slot < 0 || slot >= static_cast<int>(kPortCount)) {
      return Fail({"Upload error: Invalid Port Index Received = " + std::to_string(slot), "Error",
                   BoxIcon::kExclamation});
    }
    read_back_.At(static_cast<std::size_t>(slot)) =
        DecodeOptions(std::span(data).subspan<1, kOptionByteCount>());
    ShowProgress();
  }
  if (ReceivedPorts() == kPortCount) {
    ReplaceWorkingConfiguration(unit);
    return Succeed("SUCCESS: Upload Complete");
  }
  if (++repeats_ >= kMaxGetPolls) {
    Fail(SendError("Error:1  Uploading Configuration, Please retry"));
  } else if (!Link().cmdPollStation(UnitId(), kConfigurationPoll)) {
    Fail(SendError("Error:2 Uploading Configuration, Please retry"));
  }
}

std::size_t GetOperation::ReceivedPorts() const {
  std::size_t count = 0;
  for (std::size_t slot = 0; slot < kPortCount; ++slot) count += read_back_.At(slot).Received ? 1 : 0;
  return count;
}

std::string GetOperation::Aftermath() const {
  return replaced_ ? "Ports 1 to 8 are read." : "Nothing has changed.";
}

void GetOperation::ReplaceWorkingConfiguration(std::uint8_t unit) {
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    ChannelConfig& record = working_.At(slot);
    const bool received = record.Received;  // the mark belongs to the other table
    record = read_back_.At(slot);
    record.Received = received;
  }
  replaced_ = true;
  if (on_replaced_) on_replaced_(unit);
}

}  // namespace tendril
