#include "prefs/string_builder.h"

#include <gtest/gtest.h>

namespace tendril {
namespace {

TEST(StringBuilder, EmptyText_AllocatesNothing) {
  StringBuilder builder;
  builder.Append(u"");
  EXPECT_TRUE(builder.IsEmpty());
  EXPECT_EQ(builder.capacity(), 0);
  EXPECT_EQ(builder.ToString(), u"");
}

TEST(StringBuilder, Capacity_DoublesOnlyWhenItDoesNotSuffice) {
  struct Step {
    std::u16string_view text;
    std::int32_t capacity, length;
  };
  StringBuilder builder;
  for (const Step& step :
       {Step{u"ab", 8, 4}, Step{u"cd", 8, 8}, Step{u"", 8, 8}, Step{u"e", 20, 10}, Step{u"fghijk", 44, 22}}) {
    builder.Append(step.text);
    EXPECT_EQ(builder.capacity(), step.capacity);
    EXPECT_EQ(builder.length(), step.length);
  }
  EXPECT_EQ(builder.ToString(), u"abcdefghijk");
}

TEST(StringBuilder, ToString_ShrinksAndTheNextAppendGrowsAgain) {
  StringBuilder builder;
  builder.Append(u"ab");
  EXPECT_EQ(builder.ToString(), u"ab");
  EXPECT_EQ(builder.capacity(), 4);
  builder.Append(u"\u00e9\u4e16");
  EXPECT_EQ(builder.capacity(), 16);
  EXPECT_EQ(builder.ToString(), u"ab\u00e9\u4e16");
}

TEST(StringBuilder, Reset_StartsAnew) {
  StringBuilder builder;
  builder.Append(u"ab");
  builder.Reset();
  EXPECT_TRUE(builder.IsEmpty());
  EXPECT_EQ(builder.capacity(), 0);
  EXPECT_EQ(builder.ToString(), u"");
  builder.Append(u"xyz");
  EXPECT_EQ(builder.ToString(), u"xyz");
}

}  // namespace
}  // namespace tendril
