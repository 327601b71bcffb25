#include "commlistener/comm_frame.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

#include "platform/runtime_error.h"
#include "support/scripted_socket.h"

namespace tendril::test {
namespace {

TEST(CommFrame, LengthField_HoldsEveryLegalLengthAndNoOther) {
  EXPECT_EQ(BuildFrame('A', '7', {}), BytesOf("A700000"));
  EXPECT_EQ(BuildFrame('C', '4', Bytes{3, 0}), BytesOf(std::string_view("C400002\x03\0", 9)));
  for (const std::size_t length : {9u, 10u, 1234u, 54321u, 99999u}) {
    const Bytes frame = BuildFrame('L', '0', Bytes(length, 0xAB));
    EXPECT_EQ(frame.size(), length + 7);
    EXPECT_EQ(frame.back(), 0xAB);
    const auto header = ParseFrameHeader(frame);
    ASSERT_TRUE(header);
    EXPECT_EQ(header->length, length);
  }
  try {
    BuildFrame('L', '0', Bytes(100000));
    FAIL();
  } catch (const RuntimeError& error) {
    EXPECT_EQ(error.number(), 37);
    EXPECT_EQ(error.description(), "Invalid length for length field: 100000");
  }
}

TEST(CommFrame, Header_NeedsSevenBytesAndStrictDigits) {
  EXPECT_FALSE(ParseFrameHeader(BytesOf("100000")));
  const auto header = ParseFrameHeader(BytesOf("0912345x"));
  ASSERT_TRUE(header);
  EXPECT_EQ(header->identifier, '0');
  EXPECT_EQ(header->sequence, '9');
  EXPECT_EQ(header->length, 12345u);

  const std::pair<const char*, int> cases[] = {{"10A0000", 65}, {"100000 ", 32}, {"10-0001", 45},
                                               {"1000/00", 47}, {"1000:00", 58}, {"10A000B", 66}};
  for (const auto& [text, byte] : cases) {
    SCOPED_TRACE(text);
    try {
      ParseFrameHeader(BytesOf(text));
      ADD_FAILURE();
    } catch (const RuntimeError& error) {
      EXPECT_EQ(error.number(), 37);
      EXPECT_EQ(error.description(), "Invalid digit byte: " + std::to_string(byte));
    }
  }
}

}  // namespace
}  // namespace tendril::test
