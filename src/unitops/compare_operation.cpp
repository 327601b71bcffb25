#include "unitops/compare_operation.h"

namespace tendril {

CompareOperation::CompareOperation(
    CommandContext& context, std::function<void(std::uint8_t unit, const OptionTable& held)> on_compared)
    : ReadOperation(context, kTexts), on_compared_(std::move(on_compared)) {}

std::string CompareOperation::Prepare() {
  failed_ = true;
  return ReadOperation::Prepare();
}

void CompareOperation::OnRead(std::uint8_t unit, const ChannelTable& /*records*/, const OptionTable& held) {
  failed_ = false;
  if (on_compared_) on_compared_(unit, held);
}

std::string CompareOperation::Aftermath() const { return "No record has changed."; }

}  // namespace tendril
