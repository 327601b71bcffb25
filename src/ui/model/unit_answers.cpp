#include "ui/model/unit_answers.h"

#include "platform/hex_text.h"
#include "serial/packets.h"

namespace tendril {

void UnitAnswers::Note(std::int16_t port, std::uint8_t unit, bool replied, const std::string& time) {
  polls_[{port, unit}] = {replied, time};
}

bool UnitAnswers::Missing(std::int16_t port, std::uint8_t unit) const {
  auto poll = polls_.find({port, unit});
  if (poll == polls_.end()) poll = polls_.find({port, kAllUnits});
  return poll != polls_.end() && !poll->second.replied;
}

std::string UnitAnswers::Sentence(std::int16_t port, std::uint8_t unit) const {
  const std::string name = "Unit " + HexByte(unit);
  const auto poll = polls_.find({port, unit});
  if (poll == polls_.end()) return name + ": not asked yet";
  return name + (poll->second.replied ? " answered at " : ": no answer at ") + poll->second.time;
}

}  // namespace tendril
