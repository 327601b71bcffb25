// UnitTarget: the chosen comm port and unit.
#pragma once

#include <cstdint>

namespace tendril {

// Every ID in between can be given to a unit and be polled.
inline constexpr std::uint8_t kFirstUnitId = 0x01;
inline constexpr std::uint8_t kLastUnitId = 0xFD;

// The connection area of the window; the unit commands read it for every packet that they send.
class UnitTarget {
 public:
  virtual ~UnitTarget() = default;
  // Whether a comm port is chosen.
  virtual bool PortChosen() const = 0;
  // The unit ID that is chosen now, 0 to 255.
  virtual std::uint8_t UnitId() const = 0;
};

}  // namespace tendril
