#include "ui/model/typed_number.h"

#include <cstdlib>

#include "config/channel_config.h"

namespace tendril {

std::string TypedNumberHint(std::optional<long long> typed, const BoundedValue& limits, NumberMeaning meaning,
                            int origin) {
  const std::string range = std::to_string(limits.Minimum()) + " to " + std::to_string(limits.Maximum());
  if (!typed) return "A whole number, " + range;
  if (*typed < kMinPulseWidth || *typed > kMaxPulseWidth) return range;
  const bool half = meaning == NumberMeaning::kHalfWidth;
  const int distance = static_cast<int>(*typed) - origin;
  const int wanted = half ? std::abs(distance) : distance;
  if (wanted < limits.Minimum() || wanted > limits.Maximum()) return range;
  const std::string type = " type " + std::to_string(wanted);
  return half ? range + ". This is half the width: for " + std::to_string(origin - wanted) + " to " +
                    std::to_string(origin + wanted) + type
              : range + ". This is relative to " + std::to_string(origin) + " µs: for " +
                    std::to_string(*typed) + type;
}

}  // namespace tendril
