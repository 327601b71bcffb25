#include "simulation/disturbed_unit.h"

namespace tendril::test {

Bytes DisturbedUnit::Spoil(const Bytes& bytes) {
  Bytes spoilt;
  for (const std::uint8_t byte : bytes) {
    if (random_.OneIn(weather_.lost)) continue;
    const bool altered = random_.OneIn(weather_.altered);
    spoilt.push_back(altered ? static_cast<std::uint8_t>(byte ^ (1 + random_.Below(255))) : byte);
    if (random_.OneIn(weather_.doubled)) spoilt.push_back(byte);
  }
  return spoilt;
}

std::vector<Transmission> DisturbedUnit::Hear(std::uint8_t byte, std::uint64_t at_us) {
  std::vector<Transmission> said;
  Bytes heard = std::exchange(noise_, {});
  if (!heard.empty()) said.push_back({.start_us = at_us, .bytes = heard});
  const Bytes spoilt = Spoil({byte});
  heard.insert(heard.end(), spoilt.begin(), spoilt.end());
  for (const std::uint8_t each : heard) {
    for (Transmission& answer : unit_->Hear(each, at_us)) {
      answer.bytes = Spoil(answer.bytes);
      if (random_.OneIn(weather_.late)) answer.start_us += random_.Below(60'000);
      said.push_back(std::move(answer));
    }
  }
  return said;
}

}  // namespace tendril::test
