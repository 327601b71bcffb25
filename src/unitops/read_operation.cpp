#include "unitops/read_operation.h"

#include <algorithm>
#include <span>

#include "platform/hex_text.h"

namespace tendril {
namespace {

constexpr std::uint8_t kConfigurationPoll = 'n';
constexpr std::int16_t kMaxReadPolls = 33;
constexpr std::size_t kReplySize = 1 + kOptionByteCount;  // the port number and its option bytes

}  // namespace

ReadOperation::ReadOperation(CommandContext& context, const Texts& texts)
    : UnitOperation(context, "n", texts.fault), texts_(texts) {}

std::string ReadOperation::Prepare() {
  for (std::size_t slot = 0; slot < kPortCount; ++slot) read_back_.At(slot).Received = false;
  repeats_ = 0;
  all_read_ = false;
  return texts_.what + HexByte(UnitId());
}

void ReadOperation::Begin() {
  if (!Link().cmdPollStation(UnitId(), kConfigurationPoll)) {
    return Refuse(CannotPoll("Error Uploading Configuration, Please retry"));
  }
  Run();
  ShowProgress();
}

void ReadOperation::ShowProgress() {
  ShowStep(std::to_string(ReceivedPorts()) + " of " + std::to_string(kPortCount) + " ports");
}

void ReadOperation::OnReply(bool replied, std::uint8_t unit, const Bytes& data) {
  if (replied && data.size() >= kReplySize) {
    const int index = data[0] - 1;
    if (index < 0 || index >= static_cast<int>(kPortCount)) {
      return Fail({"Upload error: Invalid Port Index Received = " + std::to_string(index), texts_.data_error,
                   BoxIcon::kExclamation});
    }
    const auto slot = static_cast<std::size_t>(index);
    const auto options = std::span(data).subspan<1, kOptionByteCount>();
    read_back_.At(slot) = DecodeOptions(options);
    std::copy(options.begin(), options.end(), held_[slot].begin());
    ShowProgress();
  }
  if (ReceivedPorts() == kPortCount) {
    all_read_ = true;
    OnRead(unit, read_back_, held_);
    return Succeed(texts_.success);
  }
  if (++repeats_ >= kMaxReadPolls) {
    Fail(CannotPoll("Error:1  Uploading Configuration, Please retry"));
  } else if (!Link().cmdPollStation(UnitId(), kConfigurationPoll)) {
    Fail(CannotPoll("Error:2 Uploading Configuration, Please retry"));
  }
}

std::size_t ReadOperation::ReceivedPorts() const {
  std::size_t count = 0;
  for (std::size_t slot = 0; slot < kPortCount; ++slot) count += read_back_.At(slot).Received ? 1 : 0;
  return count;
}

}  // namespace tendril
