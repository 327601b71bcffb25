// UnitPlace: where a unit is.
#pragma once

#include <cstdint>

#include "serial/packets.h"

namespace tendril {

// A unit ID, on comm port `port`. On another port it is another unit.
struct UnitPlace {
  std::int16_t port = 0;
  std::uint8_t unit = 0;

  friend bool operator==(const UnitPlace&, const UnitPlace&) = default;
};

// Whether both can be one unit: each answers at FF, too.
inline bool MayBeSameUnit(const UnitPlace& a, const UnitPlace& b) {
  return a.port == b.port && (a.unit == b.unit || a.unit == kAllUnits || b.unit == kAllUnits);
}

}  // namespace tendril
