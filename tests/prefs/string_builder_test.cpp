#include "prefs/string_builder.h"

#include <gtest/gtest.h>

namespace tendril {
namespace {

TEST(StringBuilder, Capacity_DoublesWhenItDoesNotSufficeAndShrinksToTheText) {
  StringBuilder builder;
  for (const auto& [text, capacity, length] :
       {std::tuple(u"", 0, 0), {u"ab", 8, 4}, {u"cd", 8, 8}, {u"e\u4e16", 24, 12}}) {
    builder.Append(text);
    EXPECT_EQ(builder.capacity(), capacity);
    EXPECT_EQ(builder.length(), length);
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
