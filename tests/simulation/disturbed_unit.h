// DisturbedUnit: a unit on a bad line, on which bytes are lost, doubled, altered, late or out of nowhere.
#pragma once

#include <cstdint>
#include <memory>
#include <utility>
#include <vector>

#include "bench/virtual_unit.h"
#include "simulation/random_source.h"

namespace tendril::test {

// What goes wrong on the way: one byte in so many suffers it; 0: none does.
struct Weather {
  std::uint32_t lost = 0;
  std::uint32_t doubled = 0;
  std::uint32_t altered = 0;
  std::uint32_t late = 0;  // replies: the first byte and all that follow
};

// Hears and speaks through the weather. Everything handed in must outlive it.
class DisturbedUnit final : public LineUnit {
 public:
  DisturbedUnit(std::unique_ptr<VirtualUnit> unit, const Weather& weather, RandomSource& random)
      : unit_(std::move(unit)), weather_(weather), random_(random) {}

  std::vector<Transmission> Hear(std::uint8_t byte, std::uint64_t at_us) override;
  // With the next byte on the line comes `noise`: the unit hears it first, and so does the program.
  void AddNoise(const Bytes& noise) { noise_.insert(noise_.end(), noise.begin(), noise.end()); }
  const VirtualUnit& unit() const { return *unit_; }

 private:
  Bytes Spoil(const Bytes& bytes);

  std::unique_ptr<VirtualUnit> unit_;
  const Weather& weather_;
  RandomSource& random_;
  Bytes noise_;
};

}  // namespace tendril::test
