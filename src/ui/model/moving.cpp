#include "ui/model/moving.h"

#include "platform/hex_text.h"

namespace tendril {
namespace {

constexpr std::uint8_t kAllUnits = 0xFF;

// What keeps the live test's commands from being sent; empty when nothing does.
std::string WhyDrawingOnly(const MovingFacts& facts) {
  if (facts.command_runs) return "a command runs";
  if (facts.port == 0) return facts.channel ? "no port chosen" : "no port and no channel chosen";
  return facts.channel ? "" : "no channel chosen";
}

}  // namespace

std::string MovingSentence(const MovingFacts& facts) {
  if (facts.moves == Moves::kNothing) return "Nothing moves";
  if (const std::string why = WhyDrawingOnly(facts); !why.empty()) return "Drawing only: " + why;
  const std::string servo = "channel " + std::to_string(*facts.channel + 1) + " of " +
                            (facts.unit == kAllUnits ? "every unit" : "unit " + HexByte(facts.unit));
  return facts.moves == Moves::kSweep ? "Moving " + servo : "The slider moves " + servo;
}

}  // namespace tendril
