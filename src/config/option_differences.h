// The parts of a port's configuration in words, and which of them differ from what a unit holds.
#pragma once

#include <array>
#include <string>
#include <vector>

#include "config/channel_config.h"
#include "config/option_bytes.h"

namespace tendril {

// What a user sees of a port in one place. A range has two values, and so do both stops together.
enum class ComparedPart {
  kOutput,
  kActualRange,
  kVirtualRange,
  kStops,
  kLeftStop,
  kRightStop,
  kDefaultPosition,
  kNeutralPosition,
  kPowerUp,
  kLostComm
};
// The parts that have each value of a port once, in the order of a report.
inline constexpr std::array kWholeParts{ComparedPart::kOutput,          ComparedPart::kActualRange,
                                        ComparedPart::kVirtualRange,    ComparedPart::kStops,
                                        ComparedPart::kDefaultPosition, ComparedPart::kNeutralPosition,
                                        ComparedPart::kPowerUp,         ComparedPart::kLostComm};

// "Virtual range".
const char* NameOf(ComparedPart part);

// "1000 to 2000", "Move to Neutral Position". Flags that no option has are given as a number.
std::string InWords(const ChannelConfig& record, ComparedPart part);
std::string InWords(const OptionBytes& held, ComparedPart part);

// The number of values of `part` that differ, 0 to 2. A value is equal when a send of `record` would give a unit the
// bits that it holds: 1505 and 1500 are one value in a unit. A record that cannot be sent is compared, too.
int CountDiffering(const ChannelConfig& record, const OptionBytes& held, ComparedPart part);

// A part in which a port differs, both in words.
struct OptionDifference {
  ComparedPart part;
  std::string wanted;
  std::string held;

  friend bool operator==(const OptionDifference&, const OptionDifference&) = default;
};
// All parts in which `held` differs from `wanted`; none exactly when the bytes are the same.
std::vector<OptionDifference> DifferencesBetween(const OptionBytes& wanted, const OptionBytes& held);

}  // namespace tendril
