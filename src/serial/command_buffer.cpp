#include "serial/command_buffer.h"

namespace tendril {
namespace {

CommandBuffer::SlotKey KeyOf(std::uint8_t unit, std::int16_t circuit) {
  return {unit, static_cast<std::int16_t>(circuit / CommandBuffer::kCircuitsPerBlock)};
}

}  // namespace

void CommandBuffer::Store(std::uint8_t unit, std::int16_t circuit, BufferedCommand command) {
  const SlotKey key = KeyOf(unit, circuit);
  if (slots_.size() >= kMaxSlots && !slots_.contains(key)) return;
  slots_[key][circuit] = std::move(command);
}

void CommandBuffer::Clear(std::uint8_t unit, std::int16_t circuit) {
  const auto slot = slots_.find(KeyOf(unit, circuit));
  if (slot != slots_.end()) slot->second.erase(circuit);
}

}  // namespace tendril
