#include "prefs/string_builder.h"

#include <gtest/gtest.h>

namespace tendril {
namespace {

TEST(StringBuilder, Capacity_DoublesWhenItDoesNotSufficeAndShrinksToTheText) {
  struct Step {
    std::u16string_view text;
    std::int32_t capacity, length;
  };
  StringBuilder builder;
  for (const Step& step : {Step{u"", 0, 0}, Step{u"ab", 8, 4}, Step{u"cd", 8, 8}, Step{u"e\u4e16", 24, 12}}) {
    builder.Append(step.text);
    EXPECT_EQ(builder.capacity(), step.capacity);
    EXPECT_EQ(builder.length(), step.length);
  }
  EXPECT_EQ(builder.ToString(), u"abcde\u4e16");
  EXPECT_EQ(builder.capacity(), 12);
  builder.Append(u"f");
  EXPECT_EQ(builder.capacity(), 28);
  builder.Reset();
  EXPECT_EQ(builder.ToString(), u"");
  EXPECT_EQ(builder.capacity(), 0);
}

}  // namespace
}  // namespace tendril
