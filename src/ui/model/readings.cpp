#include "ui/model/readings.h"

#include "ui/model/unit_place.h"

namespace tendril {

bool Readings::SendBegins(std::int16_t port, std::uint8_t unit) {
  for (auto& [place, kept] : units_) {
    const bool meant = MayBeSameUnit({place.first, place.second}, {port, unit});
    if (meant && kept.latest) kept.before_send = std::exchange(kept.latest, std::nullopt);
  }
  return !units_.try_emplace({port, unit}).second;
}

const Readings::Reading* Readings::WayBack(std::int16_t port, std::uint8_t unit) const {
  const auto found = units_.find({port, unit});
  if (found == units_.end()) return nullptr;
  const Unit& kept = found->second;
  const auto& reading = kept.before_send ? kept.before_send : kept.latest;
  return reading ? &*reading : nullptr;
}

}  // namespace tendril
