#include "ui/model/moving.h"

#include "platform/hex_text.h"
#include "serial/packets.h"

namespace tendril {
namespace {

// What keeps the live test's commands from being sent; empty when nothing does.
std::string WhyDrawingOnly(const MovingFacts& facts) {
  if (facts.command_runs) return "a command runs";
  if (facts.port == 0) return facts.channel ? "no port chosen" : "no port and no channel chosen";
  return facts.channel ? "" : "no channel chosen";
}

}  // namespace

std::string MovingSentence(const MovingFacts& facts) {
  if (facts.moves == Moves::kNothing) return "Nothing moves";
  const bool sweep = facts.moves == Moves::kSweep;
  if (facts.command_runs && !sweep) return "The slider waits: a command runs";
  if (const std::string why = WhyDrawingOnly(facts); !why.empty())
    return (sweep ? "Drawing only: " : "The slider only draws: ") + why;
  const std::string servo = "channel " + std::to_string(*facts.channel + 1) + " of " +
                            (facts.unit == kAllUnits ? "every unit" : "unit " + HexByte(facts.unit));
  if (sweep) return "Moving " + servo;
  if (facts.port_open) return "The slider moves " + servo;
  return "The slider's next move opens Comm " + std::to_string(facts.port);
}

}  // namespace tendril
