// What the editor says about a number that was typed and cannot be taken.
#pragma once

#include <optional>
#include <string>

#include "ui/model/bounded_value.h"

namespace tendril {

// What the number of a spin button means: half a width about an origin, or a distance from it.
enum class NumberMeaning { kHalfWidth, kDistance };

// Limits, and what to type if `typed` (nothing for a text that is no whole number) was meant as a pulse width: "0 to
// 1000. This is half the width: for 600 to 2400 type 900". `origin` is the pulse width that the number is relative to.
std::string TypedNumberHint(std::optional<long long> typed, const BoundedValue& limits, NumberMeaning meaning,
                            int origin);

// That `typed` is gone and the value is shown again: "2400 was not taken as Actual Pulse Range: 0 to 1000. It is 900
// again." `typed` may be empty.
std::string DroppedNumber(const std::string& typed, const std::string& field, const BoundedValue& value);

}  // namespace tendril
