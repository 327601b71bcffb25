#include "platform/ansi_text.h"

#include <gtest/gtest.h>

namespace tendril {
namespace {

TEST(AnsiText, CharactersBecomeOneByteEach) {
  EXPECT_EQ(AnsiBytes(u"A\u00B5\u20AC\u2122\u4E2D"), (Bytes{'A', 0xB5, 0x80, 0x99, '?'}));
}

}  // namespace
}  // namespace tendril
