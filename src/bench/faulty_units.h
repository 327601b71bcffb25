// Badly behaved units. Each does everything as a VirtualUnit does, except for the one thing that its name says.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string_view>

#include "bench/virtual_unit.h"

namespace tendril {

// Hears and obeys, and never answers.
class MuteUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  std::optional<Bytes> ReplyData(std::uint8_t /*kind*/) override { return std::nullopt; }
};

// The badly behaved units by name, as a user asks for them.
struct FaultKind {
  std::string_view name;
  std::string_view description;  // half a sentence: "never answers"
  std::unique_ptr<VirtualUnit> (*make)(std::uint8_t id) = nullptr;
};

std::span<const FaultKind> FaultKinds();
// The kind called `name`, or null.
const FaultKind* FindFaultKind(std::string_view name);

}  // namespace tendril
