// CommandBuffer: light commands that wait to be sent together, the newest for each circuit.
#pragma once

#include <cstddef>
#include <cstdint>
#include <map>
#include <utility>

#include "platform/bytes.h"

namespace tendril {

// A command that is held instead of being sent.
struct BufferedCommand {
  std::uint8_t code = 0;
  std::uint8_t intensity = 0;  // the command's intensity argument, 255 where it has none
  Bytes packet;
  bool two_byte_circuit = false;
  std::uint8_t special = 0;  // marker of the special effects
};

// Keeps commands by unit and circuit. Circuits are grouped in blocks of 16; each (unit, block) takes one of
// 1024 slots on first use and keeps it.
class CommandBuffer {
 public:
  static constexpr std::int16_t kCircuitsPerBlock = 16;
  static constexpr std::size_t kMaxSlots = 1024;

  using SlotKey = std::pair<std::uint8_t, std::int16_t>;  // unit, circuit div 16
  using Slot = std::map<std::int16_t, BufferedCommand>;   // by circuit

  // Replaces what is held for that circuit. Drops `command` when its block has no slot and none is free.
  void Store(std::uint8_t unit, std::int16_t circuit, BufferedCommand command) {
    const SlotKey key = KeyOf(unit, circuit);
    if (slots_.size() < kMaxSlots || slots_.contains(key)) slots_[key][circuit] = std::move(command);
  }
  // Forgets what is held for that circuit, if anything.
  void Clear(std::uint8_t unit, std::int16_t circuit) {
    const auto slot = slots_.find(KeyOf(unit, circuit));
    if (slot != slots_.end()) slot->second.erase(circuit);
  }
  // What is held.
  const std::map<SlotKey, Slot>& Slots() const { return slots_; }

 private:
  static SlotKey KeyOf(std::uint8_t unit, std::int16_t circuit) {
    return {unit, static_cast<std::int16_t>(circuit / kCircuitsPerBlock)};
  }

  std::map<SlotKey, Slot> slots_;
};

}  // namespace tendril
