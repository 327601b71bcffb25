#include "serial/reply_parser.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>

namespace tendril {
namespace {

using Verdict = ReplyParser::Verdict;

// The last verdict on `line` after a poll of unit 5, and the data of the reply; nothing follows a complete reply.
std::pair<Verdict, Bytes> Parse(const Bytes& line) {
  ReplyParser parser;
  parser.Start(5);
  Verdict verdict = Verdict::kNeedMore;
  for (const std::uint8_t byte : line) {
    verdict = parser.Push(byte);
    if (verdict == Verdict::kReplyComplete) break;
  }
  return {verdict, parser.data()};
}

TEST(ReplyParser, WhatIsNoReply_IsSkipped) {
  const std::pair<Verdict, Bytes> need_more{Verdict::kNeedMore, {}}, echo{Verdict::kEchoSeen, {}},
      complete{Verdict::kReplyComplete, {6, 10}};
  EXPECT_EQ(Parse({0, 0xFE, 0x30, 6, 10, 0}), complete) << "no echo";
  EXPECT_EQ(Parse({0, 5, 0x88, 1, 2, 0, 5, 0x30, 6, 10, 0}), need_more) << "reply with the unit's own ID";
  EXPECT_EQ(Parse({0, 6, 0x88, 1, 2, 0}), need_more) << "echo with another ID";
  EXPECT_EQ(Parse({9, 9, 0, 7, 7, 7, 0, 0, 5, 0x88, 1, 2, 0}), echo) << "noise before the echo";
  EXPECT_EQ(Parse({0, 5, 0x88, 1, 2, 0, 7, 8, 9, 0, 0xFE, 0x30, 6, 10, 0}), complete) << "noise after it";
  EXPECT_EQ(Parse({0, 5, 0x88, 1, 2, 0, 7, 0xFE, 0x30, 0}), need_more) << "address in the middle of noise";
  EXPECT_EQ(Parse({0, 5, 0x88, 1, 10, 0, 0xFE, 0}), std::pair(Verdict::kReplyComplete, Bytes{}))
      << "a reply cut before its code holds nothing of the echo";
}

TEST(ReplyParser, OversizedReply_IsCutAndTheNextReplyStillDecodes) {
  ReplyParser parser;
  for (const std::size_t size : {std::size_t{100000}, std::size_t{2}}) {
    parser.Start(5);
    for (const std::uint8_t byte : Bytes{0, 5, 0x88, 0x64, 0x2D, 0, 0, 0xFE, 0x30}) parser.Push(byte);
    for (std::size_t i = 0; i < size; ++i) parser.Push(0x55);
    EXPECT_EQ(parser.Push(0), Verdict::kReplyComplete);
    EXPECT_EQ(parser.data().size(), size == 2 ? 2 : ReplyParser::kMaxData);
  }
}

}  // namespace
}  // namespace tendril
