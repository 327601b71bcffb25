#include "serial/reply_parser.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace tendril {
namespace {

using Verdict = ReplyParser::Verdict;

constexpr std::uint8_t kUnit = 5;
const Bytes kEcho{0, kUnit, 0x88, 0x64, 0x2D, 0};

// Feeds bytes until the reply is complete; returns the last verdict.
Verdict Feed(ReplyParser& parser, const Bytes& bytes) {
  Verdict verdict = Verdict::kNeedMore;
  for (const std::uint8_t byte : bytes) {
    verdict = parser.Push(byte);
    if (verdict == Verdict::kReplyComplete) break;
  }
  return verdict;
}

TEST(ReplyParser, WhatIsNoReply_IsPassedOver) {
  struct Case {
    std::string what;
    Bytes line;
    Verdict verdict;
    Bytes data;
  };
  for (const Case& c : std::vector<Case>{
           {"no echo, reply alone", {0, 0xFE, 0x30, 6, 10, 0}, Verdict::kReplyComplete, {6, 10}},
           {"reply to the unit's own ID after the echo",
            {0, 5, 0x88, 1, 2, 0, 5, 0x30, 6, 10, 0},
            Verdict::kNeedMore,
            {}},
           {"echo with a foreign ID", {0, 6, 0x88, 1, 2, 0}, Verdict::kNeedMore, {}},
           {"noise before the echo", {9, 9, 0, 7, 7, 7, 0, 0, 5, 0x88, 1, 2, 0}, Verdict::kEchoSeen, {}},
           {"noise between echo and reply",
            {0, 5, 0x88, 1, 2, 0, 7, 8, 9, 0, 0xFE, 0x30, 6, 10, 0},
            Verdict::kReplyComplete,
            {6, 10}},
           {"address in the middle of noise",
            {0, 5, 0x88, 1, 2, 0, 7, 0xFE, 0x30, 0},
            Verdict::kNeedMore,
            {}},
           {"a reply cut before its code holds nothing of the echo",
            {0, 5, 0x88, 1, 10, 0, 0xFE, 0},
            Verdict::kReplyComplete,
            {}},
       }) {
    ReplyParser parser;
    parser.Start(kUnit);
    EXPECT_EQ(Feed(parser, c.line), c.verdict) << c.what;
    EXPECT_EQ(parser.data(), c.data) << c.what;
  }
}

TEST(ReplyParser, OversizedReply_IsCutAndTheNextReplyStillDecodes) {
  ReplyParser parser;
  parser.Start(kUnit);
  Feed(parser, kEcho);
  Feed(parser, {0xFE, 0x30});
  Feed(parser, Bytes(100000, 0x55));
  EXPECT_EQ(parser.Push(0), Verdict::kReplyComplete);
  EXPECT_EQ(parser.data().size(), ReplyParser::kMaxData);

  parser.Start(kUnit);
  EXPECT_EQ(parser.data().size(), 0u);
  Feed(parser, kEcho);
  EXPECT_EQ(Feed(parser, {0, 0xFE, 0x30, 6, 10, 0}), Verdict::kReplyComplete);
  EXPECT_EQ(parser.data(), (Bytes{6, 10}));
}

}  // namespace
}  // namespace tendril
