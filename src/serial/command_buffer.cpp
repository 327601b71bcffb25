#include "serial/command_buffer.h"

namespace tendril {
namespace {

std::size_t PlaceInBlock(std::int16_t circuit) {
  return static_cast<std::size_t>(circuit % CommandBuffer::kCircuitsPerBlock);
}

}  // namespace

bool CommandBuffer::Store(std::uint8_t unit, std::int16_t circuit, BufferedCommand command) {
  const SlotKey key(unit, static_cast<std::int16_t>(circuit / kCircuitsPerBlock));
  if (slots_.size() >= kMaxSlots && !slots_.contains(key)) return false;
  slots_[key][PlaceInBlock(circuit)] = std::move(command);
  return true;
}

void CommandBuffer::Clear(std::uint8_t unit, std::int16_t circuit) {
  const auto slot = slots_.find({unit, static_cast<std::int16_t>(circuit / kCircuitsPerBlock)});
  if (circuit >= 0 && slot != slots_.end()) slot->second[PlaceInBlock(circuit)].reset();
}

const BufferedCommand* CommandBuffer::Find(std::uint8_t unit, std::int16_t circuit) const {
  const auto slot = slots_.find({unit, static_cast<std::int16_t>(circuit / kCircuitsPerBlock)});
  if (circuit < 0 || slot == slots_.end()) return nullptr;
  const auto& command = slot->second[PlaceInBlock(circuit)];
  return command ? &*command : nullptr;
}

}  // namespace tendril
