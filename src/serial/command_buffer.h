// CommandBuffer: light commands that wait to be sent together, the newest for each circuit.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <map>
#include <optional>
#include <utility>

#include "platform/bytes.h"

namespace tendril {

// A command that was held instead of being sent.
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

  // Holds `command`, in the place of whatever was held for that circuit. False when it had to be dropped
  // because its block has no slot and none is free.
  bool Store(std::uint8_t unit, std::int16_t circuit, BufferedCommand command);
  // Forgets what is held for that circuit, if anything.
  void Clear(std::uint8_t unit, std::int16_t circuit);
  // What is held for that circuit; nullptr when nothing is.
  const BufferedCommand* Find(std::uint8_t unit, std::int16_t circuit) const;

 private:
  using Block = std::array<std::optional<BufferedCommand>, kCircuitsPerBlock>;
  using SlotKey = std::pair<std::uint8_t, std::int16_t>;  // unit, circuit div 16

  std::map<SlotKey, Block> slots_;
};

}  // namespace tendril
