// Rounding, as in the show-control software.
#pragma once

#include <cmath>
#include <cstdint>

namespace tendril {

// The nearest whole number; of two equally near ones, the even one. `value` must fit 32 bits.
inline std::int32_t RoundHalfToEven(double value) {
  return static_cast<std::int32_t>(std::nearbyint(value));  // in the default rounding mode
}

}  // namespace tendril
