#include "ui/model/typed_number.h"

#include <gtest/gtest.h>

namespace tendril {
namespace {

TEST(TypedNumber, HintSaysWhatToTypeInstead) {
  BoundedValue width;
  width.SetLimits(0, 1000);
  BoundedValue stop;
  stop.SetLimits(-500, 0);
  const auto hint = [](std::optional<long long> typed, const BoundedValue& limits, NumberMeaning meaning,
                       int origin) { return TypedNumberHint(typed, limits, meaning, origin); };
  EXPECT_EQ(hint(2400, width, NumberMeaning::kHalfWidth, 1500),
            "0 to 1000. This is half the width: for 600 to 2400 type 900");
  EXPECT_EQ(hint(600000, width, NumberMeaning::kHalfWidth, 1500), "0 to 1000");
  EXPECT_EQ(hint(-5, width, NumberMeaning::kHalfWidth, 1500), "0 to 1000");
  EXPECT_EQ(hint(2550, width, NumberMeaning::kHalfWidth, 1500), "0 to 1000")
      << "as half a width it is too large, too";
  EXPECT_EQ(hint(std::nullopt, width, NumberMeaning::kHalfWidth, 1500), "A whole number, 0 to 1000");
  EXPECT_EQ(hint(1250, stop, NumberMeaning::kDistance, 1600),
            "-500 to 0. This is relative to 1600 µs: for 1250 type -350");
  EXPECT_EQ(DroppedNumber("", "Left Virtual Stop", stop),
            "Nothing was typed as Left Virtual Stop: -500 to 0. It is 0 again.");
  EXPECT_EQ(hint(1700, stop, NumberMeaning::kDistance, 1600), "-500 to 0");
}

}  // namespace
}  // namespace tendril
