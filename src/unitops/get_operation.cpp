#include "unitops/get_operation.h"

#include <cstddef>
#include <utility>

namespace tendril {

GetOperation::GetOperation(CommandContext& context, ChannelTable& working,
                           std::function<void(std::uint8_t unit)> on_replaced)
    : ReadOperation(context, kTexts), working_(working), on_replaced_(std::move(on_replaced)) {}

void GetOperation::OnRead(std::uint8_t unit, const ChannelTable& records, const OptionTable& /*held*/) {
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    ChannelConfig& record = working_.At(slot);
    const bool received = record.Received;  // the mark belongs to the other table
    record = records.At(slot);
    record.Received = received;
  }
  if (on_replaced_) on_replaced_(unit);
}

std::string GetOperation::Aftermath() const {
  return AllRead() ? "Ports 1 to 8 are read." : "Nothing has changed.";
}

}  // namespace tendril
