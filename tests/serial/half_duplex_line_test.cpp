#include "serial/half_duplex_line.h"

#include "serial/link_fixture.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

const Bytes kReply{0xFE, '0', 6, 10, 0};

class Poll : public LinkFixture {
 protected:
  // Polls unit 5, and lets the adapter echo the poll.
  void PollAndEcho(std::uint8_t kind) {
    ASSERT_TRUE(link_.cmdPollStation(5, kind));
    device_.TakeWrites();
    device_.Receive({0, 5, 0x88, kind, link_.PollPad(), 0});
  }
  void ExpectReplies(const std::vector<ReportedReply>& expected) {
    EXPECT_EQ(std::exchange(replies_, {}), expected);
  }
};

TEST_F(Poll, Reply_ReleasesTheLineAfterTheEchoAndReportsOnce) {
  ASSERT_TRUE(link_.cmdPollStation(5, 100));
  EXPECT_THAT(device_.TakeWrites(), ElementsAre(Bytes{0, 5, 0x88, 100, 45, 0}));
  EXPECT_EQ(device_.receive_threshold, 1);
  device_.Receive({0, 5, 0x88, 100, 45});
  EXPECT_TRUE(device_.rts);
  device_.Receive({0});
  EXPECT_FALSE(device_.rts);
  for (const std::uint8_t byte : Bytes{0, 0, 0xFE, 101, 1, 2}) device_.Receive({byte});
  ExpectReplies({});
  device_.Receive({0, 0x77, 0x77});
  ExpectReplies({{true, 5, 101, {1, 2}}});
  EXPECT_TRUE(device_.rts);
  EXPECT_THAT(device_.TakeWrites(), ElementsAre(Bytes{0, 0}));
  EXPECT_EQ(device_.receive_threshold, 4000);
  EXPECT_EQ(link_.LastPollPads(), 2u);
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

TEST_F(Poll, Kinds_DecideWhatIsReported) {
  const auto expect = [&](std::uint8_t kind, std::uint8_t reply_code,
                          const std::vector<ReportedReply>& reported) {
    PollAndEcho(kind);
    device_.Receive({0xFE, reply_code, 6, 10, 0});
    ExpectReplies(reported);
  };
  expect('0', 7, {{true, 5, '0', {6, 10}}});
  expect(100, 104, {{true, 5, 104, {6, 10}}});
  expect(100, 105, {{false, 5, 100, {6, 10}}});
  expect(111, 7, {{true, 5, 7, {6, 10}}});
  expect(202, 7, {});
  expect(203, 7, {});
  EXPECT_EQ(link_.Download(5).acknowledgement, 0);  // two bytes only
  EXPECT_TRUE(link_.Bootloader().received);
  EXPECT_EQ(link_.Bootloader().data, (Bytes{6, 10}));
  PollAndEcho(202);
  device_.Receive({0xFE, 7, 1, 2, 3, 0});
  EXPECT_EQ(link_.Download(5).acknowledgement, 3);

  for (const std::uint8_t kind : Bytes{202, 203, 111}) {
    PollAndEcho(kind);
    time_.Advance(500);
  }
  EXPECT_TRUE(link_.Download(5).timed_out);
  EXPECT_TRUE(link_.Bootloader().timed_out);
  ExpectReplies({{false, 5, 111, {}}});
}

TEST_F(Poll, NoReply_EndsAtTheComputedTimeOut) {
  // (pending + 38 + pads) bytes of 10 bits, twice; the slow kinds get 250 ms more.
  const auto expect = [&](std::uint8_t kind, std::size_t pending, std::uint8_t pads,
                          std::uint64_t time_out_ms) {
    device_.pending_output = pending;
    link_.SetPollPad(pads);
    PollAndEcho(kind);
    time_.Advance(time_out_ms - 1);
    ExpectReplies({});
    time_.Advance(1);
    ExpectReplies({{false, 5, kind, {}}});
    EXPECT_TRUE(device_.rts);
    EXPECT_THAT(device_.TakeWrites(), ElementsAre(Bytes{0}));
  };
  expect('0', 6, 45, 93);  // the clock wraps meanwhile
  expect('n', 33, 45, 121);
  expect('0', 0, 255, 248);  // 200 pads at most
  expect('0', 0, 1, 42);     // and 2 at least
  for (const std::uint8_t slow_kind : Bytes{'2', '1', 'A', 'o'}) expect(slow_kind, 6, 45, 343);
  link_.SetBaudRate(115200);
  expect('0', 6, 45, 15);

  PollAndEcho('0');
  device_.Receive(kReply, /*tell=*/false);  // a reply that has arrived counts
  time_.Advance(500);
  ExpectReplies({{true, 5, '0', {6, 10}}});
}

TEST_F(Poll, WhileOutstanding_PacketsWaitAndASecondPollIsRefused) {
  PollAndEcho('0');
  EXPECT_FALSE(link_.cmdPollStation(6, '0'));
  link_.SendUnlockCmd(5);
  link_.cmdSetTwinkle(5, 1);
  link_.RawOutput(Bytes{9});  // does not end in a zero
  EXPECT_THAT(device_.TakeWrites(), IsEmpty());
  device_.Receive(kReply);
  // In order, one zero between two packets, and one byte more at the end.
  EXPECT_THAT(device_.TakeWrites(),
              ElementsAre(Bytes{0, 0}, Bytes{0, 5, 0x8A, 0x56, 0, 5, 6, 0x81, 9, 0}, Bytes{0}));
}

TEST_F(Poll, PortChangedInThePoll_NothingOfItReachesTheNewLine) {
  PollAndEcho('0');
  link_.SendUnlockCmd(5);
  link_.SetCommPort(1);
  EXPECT_EQ(device_.receive_threshold, 4000);
  EXPECT_FALSE(link_.cmdPollStation(6, '0'));
  link_.cmdSetTwinkle(5, 1);  // meant for the new line: goes out at once
  EXPECT_THAT(device_.TakeWrites(), ElementsAre(Bytes{0, 5, 6, 0x81, 0}));
  device_.Receive({0, 0xFE, '0', 6, 10, 0});  // a reply to another program
  ExpectReplies({});
  time_.Advance(500);
  ExpectReplies({{false, 5, '0', {}}});
  EXPECT_THAT(device_.TakeWrites(), IsEmpty());
  PollAndEcho('0');
  time_.Advance(500);
  EXPECT_THAT(device_.TakeWrites(), ElementsAre(Bytes{0})) << "nothing that was held back for the old line";
}

TEST_F(Poll, RtsOrWriteThatFails_StopsNothingElse) {
  for (const bool answered : {false, true}) {
    PollAndEcho('0');
    link_.SendUnlockCmd(5);
    device_.rts_failure = RuntimeError(kErrDeviceIo, "broken");
    if (answered) {
      device_.write_failure = RuntimeError(kErrDeviceIo, "broken");
      device_.Receive(kReply);
    } else {
      time_.Advance(500);
      EXPECT_THAT(device_.TakeWrites(), ElementsAre(Bytes{0, 5, 0x8A, 0x56, 0}, Bytes{0}, Bytes{0}));
    }
    EXPECT_EQ(std::exchange(replies_, {}).size(), 1u);
    device_.rts_failure.reset();
    device_.write_failure.reset();
    link_.SendUnlockCmd(5);
    EXPECT_EQ(device_.TakeWrites().size(), 1u) << "what was held back is gone";
    EXPECT_TRUE(device_.rts) << "the line is taken back with the next packet";
  }
}

TEST_F(Poll, InputThatAnswersNoPoll_IsDiscarded) {
  link_.SetPortOpen(true);
  device_.Receive(kReply);
  EXPECT_THAT(device_.input, IsEmpty());
  device_.Receive({0, 0xFE, '0', 6, 10, 0}, /*tell=*/false);  // before the poll
  PollAndEcho('0');
  device_.Receive(Bytes(4050, 0x55), /*tell=*/false);
  device_.Raise(SerialEvent::kReceiveOverflow);
  EXPECT_THAT(device_.input, IsEmpty());
  device_.Receive(kReply);
  ExpectReplies({{true, 5, '0', {6, 10}}});
}

TEST_F(Poll, RefusedOrFailed_LeavesNoneOutstanding) {
  EXPECT_FALSE(link_.cmdPollStation(0, '0'));
  link_.SetCommPort(0);
  EXPECT_EQ(FailureOf([&] { link_.cmdPollStation(5, '0'); }).number(), kErrPortNotOpen);
  link_.SetCommPort(3);
  link_.SetPortOpen(true);
  device_.write_failure = RuntimeError(kErrReadFault, "broken");
  EXPECT_EQ(FailureOf([&] { link_.cmdPollStation(5, '0'); }).description(), "broken");
  EXPECT_EQ(device_.receive_threshold, 4000);
  device_.write_failure.reset();
  EXPECT_TRUE(link_.cmdPollStation(5, '0'));
}

TEST_F(Poll, Trace_ShowsTheTrafficWhileItIsOn) {
  link_.SetTraceOutput(true);
  link_.cmdSetTwinkle(5, 1);
  PollAndEcho('0');
  time_.Advance(12);
  device_.Receive({0, 0xFE, '0', 10, 0});
  EXPECT_THAT(traces_, ElementsAre("Write[4294967255](0,5,6,81,0)", "POLL[4294967255](0,5,88,30,2D,0)",
                                   "Poll read 6 bytes (0,5,88,30,2D,0)", "Poll read 5 bytes (0,FE,30,A,0)",
                                   "Poll Took - 12ms, received 1 nulls"));
}

}  // namespace
}  // namespace tendril::test
