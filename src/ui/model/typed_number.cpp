#include "ui/model/typed_number.h"

#include <cstdlib>

#include "config/channel_config.h"

namespace tendril {
namespace {

std::string RangeOf(const BoundedValue& limits) {
  return std::to_string(limits.Minimum()) + " to " + std::to_string(limits.Maximum());
}

}  // namespace

std::string TypedNumberHint(std::optional<long long> typed, const BoundedValue& limits, NumberMeaning meaning,
                            int origin) {
  std::string range = RangeOf(limits);
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

std::string DroppedNumber(const std::string& typed, const std::string& field, const BoundedValue& value) {
  return (typed.empty() ? "Nothing was typed" : typed + " was not taken") + " as " + field + ": " +
         RangeOf(value) + ". It is " + std::to_string(value.Value()) + " again.";
}

}  // namespace tendril
