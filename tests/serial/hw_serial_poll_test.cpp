#include "serial/link_fixture.h"
#include "serial/packets.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class HwSerialPoll : public LinkFixture {
 protected:
  // Polls unit 5, and lets the adapter echo the poll.
  void PollAndEcho(std::uint8_t kind) {
    ASSERT_TRUE(link_.cmdPollStation(5, kind));
    device_.TakeWrites();
    device_.Receive({0, 5, 0x88, kind, 45, 0});
  }
};

TEST_F(HwSerialPoll, Reply_ReleasesTheLineAfterTheEchoAndReportsOnce) {
  ASSERT_TRUE(link_.cmdPollStation(5, 100));
  EXPECT_THAT(device_.TakeWrites(), ElementsAre(Bytes{0, 5, 0x88, 100, 45, 0}));
  EXPECT_EQ(device_.receive_threshold, 1);
  EXPECT_TRUE(device_.rts);
  device_.Receive({0, 5, 0x88, 100, 45});
  EXPECT_TRUE(device_.rts);
  device_.Receive({0});
  EXPECT_FALSE(device_.rts);
  for (const std::uint8_t byte : Bytes{0, 0, 0xFE, 101, 1, 2}) device_.Receive({byte});
  EXPECT_THAT(replies_, IsEmpty());
  device_.Receive({0, 0x77, 0x77});
  EXPECT_THAT(replies_, ElementsAre(ReportedReply{true, 5, 101, {1, 2}}));
  EXPECT_TRUE(device_.rts);
  EXPECT_THAT(device_.TakeWrites(), ElementsAre(Bytes{0, 0}));
  EXPECT_EQ(device_.receive_threshold, 4000);
  EXPECT_EQ(link_.LastPollPads(), 2u);
  time_.Advance(1000);
  EXPECT_EQ(replies_.size(), 1u);
  for (const std::uint32_t pads : {200u, 201u}) {
    PollAndEcho(100);
    device_.Receive(Bytes(pads, 0));
    EXPECT_EQ(link_.LastPollPads(), pads == 200 ? 200u : 0u);
    device_.Receive({0, 0, 0});
    EXPECT_EQ(link_.LastPollPads(), pads == 200 ? 0u : 3u);
    device_.Receive({0xFE, 101, 0});
  }
  EXPECT_EQ(time_.RunningTimers(), 0);
}

TEST_F(HwSerialPoll, Kinds_DecideWhatIsReported) {
  struct Case {
    int kind, reply_code;
    std::vector<ReportedReply> reported;
  };
  for (const Case& c : std::vector<Case>{{'0', 7, {{true, 5, '0', {6, 10}}}},
                                         {100, 104, {{true, 5, 104, {6, 10}}}},
                                         {100, 105, {{false, 5, 100, {6, 10}}}},
                                         {100, 100, {{false, 5, 100, {6, 10}}}},
                                         {111, 7, {{true, 5, 7, {6, 10}}}},
                                         {202, 7, {}},
                                         {203, 7, {}}}) {
    replies_.clear();
    PollAndEcho(static_cast<std::uint8_t>(c.kind));
    device_.Receive({0xFE, static_cast<std::uint8_t>(c.reply_code), 6, 10, 0});
    EXPECT_EQ(replies_, c.reported) << c.kind << " " << c.reply_code;
  }
  EXPECT_EQ(link_.Download(5).acknowledgement, 0);  // two bytes only
  EXPECT_TRUE(link_.Bootloader().received);
  EXPECT_EQ(link_.Bootloader().data, (Bytes{6, 10}));

  PollAndEcho(202);
  device_.Receive({0xFE, 7, 1, 2, 3, 0});
  EXPECT_EQ(link_.Download(5).acknowledgement, 3);
}

TEST_F(HwSerialPoll, NoReply_EndsAtTheComputedTimeOut) {
  struct Case {
    int kind;
    std::size_t pending;
    int pads;
    std::uint64_t time_out_ms;
    std::int32_t baud = 19200;
  };
  // (pending + 38 + pads) bytes of 10 bits, twice; the slow kinds get 250 ms more.
  for (const Case& c : std::vector<Case>{{'0', 6, 45, 93},
                                         {'n', 33, 45, 121},
                                         {'0', 0, 200, 248},
                                         {'2', 6, 45, 343},
                                         {'1', 6, 45, 343},
                                         {'A', 6, 45, 343},
                                         {'o', 6, 45, 343},
                                         {'0', 6, 45, 15, 115200}}) {
    replies_.clear();
    device_.pending_output = c.pending;
    link_.SetBaudRate(c.baud);
    link_.SetPollPad(static_cast<std::uint8_t>(c.pads));
    ASSERT_TRUE(link_.cmdPollStation(5, static_cast<std::uint8_t>(c.kind)));
    device_.Receive({0, 5, 0x88, static_cast<std::uint8_t>(c.kind), static_cast<std::uint8_t>(c.pads), 0});
    device_.TakeWrites();
    time_.Advance(c.time_out_ms - 1);
    EXPECT_THAT(replies_, IsEmpty()) << c.kind;
    EXPECT_FALSE(device_.rts);
    time_.Advance(1);
    EXPECT_THAT(replies_, ElementsAre(ReportedReply{false, 5, c.kind, {}})) << c.kind;
    EXPECT_TRUE(device_.rts);
    EXPECT_THAT(device_.TakeWrites(), ElementsAre(Bytes{0}));
  }
}

TEST_F(HwSerialPoll, SilentKinds_KeepTheirTimeOutToThemselves) {
  for (const std::uint8_t kind : {std::uint8_t{202}, std::uint8_t{203}}) {
    PollAndEcho(kind);
    time_.Advance(500);
  }
  EXPECT_TRUE(link_.Download(5).timed_out);
  EXPECT_TRUE(link_.Bootloader().timed_out);
  EXPECT_THAT(replies_, IsEmpty());
}

TEST_F(HwSerialPoll, TimeOutAcrossTheClocksWrap_IsNoShorterOrLonger) {
  SimulatedTime late(0xFFFFFFFF - 40);
  HwSerial link(device_, late, late, log_);
  int replies = 0;
  link.SetPollReplyHandler([&](bool, std::uint8_t, std::uint8_t, Bytes&) { ++replies; });
  link.SetCommPort(3);
  link.SetBaudRate(19200);
  ASSERT_TRUE(link.cmdPollStation(5, '0'));  // (0 + 38 + 45) * 10 / 19200 * 2 = 86 ms
  late.Advance(85);
  EXPECT_EQ(replies, 0);
  late.Advance(1);
  EXPECT_EQ(replies, 1);
}

TEST_F(HwSerialPoll, ReplyThatNobodyLookedAt_StillCountsAtTheTimeOut) {
  PollAndEcho('0');
  device_.Receive({0xFE, '0', 6, 10, 0}, /*tell=*/false);
  time_.Advance(500);
  EXPECT_THAT(replies_, ElementsAre(ReportedReply{true, 5, '0', {6, 10}}));
}

TEST_F(HwSerialPoll, WhileOutstanding_PacketsWaitAndASecondPollIsRefused) {
  PollAndEcho('0');
  EXPECT_FALSE(link_.cmdPollStation(6, '0'));
  link_.SendUnlockCmd(5);
  link_.cmdSetTwinkle(5, 1);
  link_.RawOutput(Bytes{9});  // does not end in a zero
  EXPECT_THAT(device_.TakeWrites(), IsEmpty());
  device_.Receive({0xFE, '0', 6, 10, 0});
  // In order, one zero between two packets, and one byte more at the end.
  EXPECT_THAT(device_.TakeWrites(),
              ElementsAre(Bytes{0, 0}, Bytes{0, 5, 0x8A, 0x56, 0, 5, 6, 0x81, 9, 0}, Bytes{0}));
  link_.SendUnlockCmd(5);
  EXPECT_EQ(device_.TakeWrites().size(), 1u);
}

TEST_F(HwSerialPoll, PortChangedInThePoll_NothingOfItReachesTheNewLine) {
  PollAndEcho('0');
  link_.SendUnlockCmd(5);
  link_.SetCommPort(1);
  ASSERT_TRUE(link_.PortOpen());
  EXPECT_EQ(device_.receive_threshold, 4000);
  EXPECT_FALSE(link_.cmdPollStation(6, '0'));
  link_.cmdSetTwinkle(5, 1);  // meant for the new line: goes out at once
  EXPECT_THAT(device_.TakeWrites(), ElementsAre(Bytes{0, 5, 6, 0x81, 0}));
  device_.Receive({0, 0xFE, '0', 6, 10, 0});  // somebody else's
  EXPECT_THAT(replies_, IsEmpty());
  time_.Advance(500);
  EXPECT_THAT(replies_, ElementsAre(ReportedReply{false, 5, '0', {}}));
  EXPECT_THAT(device_.TakeWrites(), IsEmpty());
  EXPECT_TRUE(link_.cmdPollStation(6, '0'));
  device_.TakeWrites();
  time_.Advance(500);
  EXPECT_THAT(device_.TakeWrites(), ElementsAre(Bytes{0}))
      << "and nothing that was held back for the old one";
}

TEST_F(HwSerialPoll, WhatCameBeforeThePoll_IsNoReply) {
  link_.SetPortOpen(true);
  device_.Receive({0, 0xFE, '0', 6, 10, 0}, /*tell=*/false);
  PollAndEcho('0');
  EXPECT_THAT(replies_, IsEmpty());
  time_.Advance(500);
  EXPECT_THAT(replies_, ElementsAre(ReportedReply{false, 5, '0', {}}));
}

TEST_F(HwSerialPoll, RtsOrWriteThatFails_KeepsNothingElseFromHappening) {
  for (const bool answered : {false, true}) {
    PollAndEcho('0');
    link_.SendUnlockCmd(5);
    device_.rts_failure = RuntimeError(kErrDeviceIo, "broken");
    if (answered) {
      device_.write_failure = RuntimeError(kErrDeviceIo, "broken");
      device_.Receive({0xFE, '0', 6, 10, 0});
    } else {
      time_.Advance(500);
      EXPECT_THAT(device_.TakeWrites(), ElementsAre(Bytes{0, 5, 0x8A, 0x56, 0}, Bytes{0}, Bytes{0}));
    }
    EXPECT_EQ(std::exchange(replies_, {}).size(), 1u);
    device_.rts_failure.reset();
    device_.write_failure.reset();
    link_.SendUnlockCmd(5);
    EXPECT_THAT(device_.TakeWrites(), ElementsAre(Bytes{0, 5, 0x8A, 0x56, 0})) << "held back before";
    EXPECT_TRUE(device_.rts) << "the line is taken back with the next packet";
  }
}

TEST_F(HwSerialPoll, WithoutAPoll_InputIsDiscarded) {
  link_.SetPortOpen(true);
  device_.Receive({0xFE, '0', 6, 10, 0});
  EXPECT_THAT(device_.input, IsEmpty());
  EXPECT_THAT(replies_, IsEmpty());
  PollAndEcho('0');
  device_.Receive(Bytes(4050, 0x55), /*tell=*/false);
  device_.Raise(SerialEvent::kReceiveOverflow);
  EXPECT_THAT(device_.input, IsEmpty());
  device_.Receive({0, 0xFE, '0', 6, 10, 0});
  EXPECT_EQ(replies_.size(), 1u);
}

TEST_F(HwSerialPoll, Refusals_SendNothing) {
  EXPECT_FALSE(link_.cmdPollStation(0, '0'));
  EXPECT_THAT(device_.TakeWrites(), IsEmpty());
  link_.SetCommPort(0);
  EXPECT_EQ(FailureOf([&] { link_.cmdPollStation(5, '0'); }).number(), kErrPortNotOpen);
  EXPECT_FALSE(link_.PollOutstanding());
}

TEST_F(HwSerialPoll, PollThatCannotBeWritten_IsUndone) {
  link_.SetPortOpen(true);
  device_.write_failure = RuntimeError(kErrReadFault, "broken");
  EXPECT_EQ(FailureOf([&] { link_.cmdPollStation(5, '0'); }).description(), "broken");
  EXPECT_FALSE(link_.PollOutstanding());
  EXPECT_EQ(device_.receive_threshold, 4000);
  device_.write_failure.reset();
  EXPECT_TRUE(link_.cmdPollStation(5, '0'));
}

TEST_F(HwSerialPoll, Trace_TellsTheTrafficWhileItIsOn) {
  link_.SetTraceOutput(true);
  link_.cmdSetTwinkle(5, 1);
  PollAndEcho('0');
  time_.Advance(12);
  device_.Receive({0, 0xFE, '0', 10, 0});
  EXPECT_THAT(traces_, ElementsAre("Write[1000](0,5,6,81,0)", "POLL[1000](0,5,88,30,2D,0)",
                                   "Poll read 6 bytes (0,5,88,30,2D,0)", "Poll read 5 bytes (0,FE,30,A,0)",
                                   "Poll Took - 12ms, received 1 nulls"));
}

}  // namespace
}  // namespace tendril::test
