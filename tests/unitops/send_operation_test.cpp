#include "unitops/send_operation.h"

#include <string>
#include <vector>

#include "command_fixture.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

const BoxMessage kNoResponse{"Unit did not respond to the Option Settings, Retry Command", "No Repsonse",
                             BoxIcon::kCritical};

const std::string kSending = "Sending to unit 01 at 14:05: ";

class Send : public CommandTest {
 protected:
  void ExpectSuccess() { CommandTest::ExpectSuccess("SUCCESS: Send Complete!"); }
  // Lets port `port` be acknowledged.
  void AcknowledgePort(const VirtualUnit& unit, std::size_t port) {
    const auto acknowledged = [&] {
      return unit.polls_heard() == port && !world_.bench.Line(1).NextEventUs();
    };
    ASSERT_TRUE(world_.time.AdvanceUntil(acknowledged, 1000));
  }
};

TEST_F(Send, EveryPort_GoesOutAsUnlockOptionsAndPoll) {
  auto& unit = world_.Attach("", 0x01);
  const Bytes sent = Sent([&] { Run(commands_.send); });
  ExpectSuccess();
  Bytes expected;
  for (std::uint8_t port = 1; port <= 8; ++port) {
    // The widths of the start; 0xAA + 17 + port + 1 + widths + checksum = 0 modulo 256.
    const Bytes packets{
        0, 0x01, 0x8A, 0x56, 0,    0,   0x01, 0x0A, 17,  port,
        1, 60,   240,  100,  200,  100, 200,  150,  150, static_cast<std::uint8_t>(0x94 - port),
        0, 0,    0x01, 0x88, 0x30, 45,  0,    0,    0};
    expected.insert(expected.end(), packets.begin(), packets.end());
  }
  EXPECT_EQ(sent, expected);
  EXPECT_EQ(unit.accepted_commands(), 8u);
  EXPECT_EQ(world_.bench.Line(1).counters().garbled_bytes, 0u);
}

TEST_F(Send, Ports_FollowEachOther300msAfterTheAcknowledgement) {
  auto& unit = world_.Attach("", 0x01);
  commands_.send.Start();
  EXPECT_EQ(commands_.running.What(), "Sending to unit 01");
  AcknowledgePort(unit, 1);
  // Nothing until the pause is over.
  EXPECT_THAT(Sent([&] { world_.time.Advance(298); }), testing::Each(0));
  EXPECT_THAT(Sent([&] { world_.time.Advance(20); }).size(), testing::Gt(10u));
  RunToTheEnd();
  ExpectSuccess();
  EXPECT_EQ(progress_.title, "Sending to unit 01: port 8 of 8");
  EXPECT_TRUE(progress_.shown);
  world_.time.Advance(3000);
  EXPECT_FALSE(progress_.shown);
  EXPECT_EQ(world_.time.RunningTimers(), 0);
}

TEST_F(Send, BadlyBehavedUnits_EndWithTheirOutcome) {
  target_.unit = 0x05;
  const auto polls = [&](const std::string& fault) {  // that reach the unit
    SCOPED_TRACE(fault);
    VirtualUnit& unit = world_.Attach(fault, 0x05);
    Run(commands_.send);
    const auto heard = unit.polls_heard();
    world_.bench.Detach(1, unit);
    return heard;
  };
  for (const char* fault : {"rambling", "slow", "deaf"}) {  // the last one to every second poll
    EXPECT_EQ(polls(fault), 8u);
    ExpectSuccess();
  }
  for (const char* fault : {"mute", "wrong-address", "unfinished"}) {
    EXPECT_EQ(polls(fault), 3u);
    ExpectFailure(kNoResponse);
  }
  for (const char* fault : {"wrong-answer", "locked"}) {
    EXPECT_EQ(polls(fault), 1u);
    ExpectFailure(kNoResponse);
  }
}

TEST_F(Send, OnlyTheReplysSecondByte_Accepts) {
  const auto accepted = [&](const Bytes& reply) {
    auto& unit = world_.bench.Attach<ScriptedUnit>(1, std::uint8_t{0x01}, reply);
    Run(commands_.send);
    world_.bench.Detach(1, unit);
    return world_.boxes.Take().empty();
  };
  EXPECT_TRUE(accepted({1, 10}));
  EXPECT_TRUE(accepted({1, 10, 3}));
  for (const Bytes& other : {Bytes{}, Bytes{10}, Bytes{10, 1}, Bytes{3, 1, 10}})
    EXPECT_FALSE(accepted(other));
}

TEST_F(Send, IdSetTo00InTheMiddle_IsASendErrorAtTheNextPort) {
  VirtualUnit& mute = world_.Attach("mute", 0x01);
  commands_.send.Start();
  target_.unit = 0x00;  // a repeat goes to the unit that did not answer
  RunToTheEnd();
  ExpectFailure(kNoResponse);
  world_.bench.Detach(1, mute);
  target_.unit = 0x01;
  world_.Attach("", 0x01);
  commands_.send.Start();
  target_.unit = 0;
  RunToTheEnd();
  EXPECT_EQ(said_, kSending + "COMMAND FAILED! Port 1 is written, 2 perhaps, 3 to 8 are not.");
  ExpectFailure({"Error sending configuration, Please retry", "Send Error", BoxIcon::kCritical});
}

TEST_F(Send, Refusals_AreShownAndStartNothing) {
  target_.port_chosen = false;
  commands_.send.Start();
  EXPECT_THAT(world_.boxes.Take(),
              ElementsAre(BoxMessage{"No comm port selected!!!\r\n\r\nYou must select a comm port first.",
                                     "No Port Selected", BoxIcon::kExclamation}));
  target_.port_chosen = true;
  target_.unit = 0x00;
  commands_.send.Start();
  EXPECT_THAT(world_.boxes.Take(), ElementsAre(BoxMessage{"Error sending configuration, Please retry",
                                                          "Send Error", BoxIcon::kCritical}));
  EXPECT_FALSE(commands_.running.Active());
  EXPECT_FALSE(progress_.shown);
  EXPECT_EQ(said_, "Sending to unit 00 at 14:05: Stopped. Port 1 is perhaps written, 2 to 8 are not.");
}

TEST_F(Send, InvalidRecord_StopsBeforeItsPort) {
  VirtualUnit& unit = world_.Attach("", 0x01);
  working_.At(4).ActualRange[0] = 9;
  world_.boxes.while_open = [&] { EXPECT_FALSE(commands_.running.Active()); };
  const std::vector<BoxMessage> box{
      {"Internal Error - Invalid ActualRange(0)=9", "Internal Error", BoxIcon::kNone}};
  Run(commands_.send);
  EXPECT_EQ(world_.boxes.Take(), box);
  EXPECT_EQ(unit.accepted_commands(), 4u);
  EXPECT_EQ(progress_.title, "Stopped: channel 5: 9 to 2400 cannot be sent");
  EXPECT_EQ(said_, kSending + progress_.title + ". Ports 1 to 4 are written, 5 to 8 are not.");
  // The display is not ended; the next command takes it over.
  world_.time.Advance(10000);
  EXPECT_EQ(unit.polls_heard(), 4u);
  EXPECT_TRUE(progress_.shown);
  EXPECT_EQ(progress_.text, "");
  std::swap(working_.At(0), working_.At(4));  // the first port: nothing starts at all
  commands_.send.Start();
  EXPECT_EQ(world_.boxes.Take(), box);
  EXPECT_FALSE(commands_.running.Active());
  EXPECT_EQ(said_, kSending + "Stopped: channel 1: 9 to 2400 cannot be sent. Nothing is written.");
  working_.At(0).ActualRange[0] = 10;
  Run(commands_.send);
  ExpectSuccess();
}

TEST_F(Send, UnpluggedBetweenTwoPorts_IsADownloadFailure) {
  auto& unit = world_.Attach("", 0x01);
  commands_.send.Start();
  AcknowledgePort(unit, 2);
  world_.bench.Unplug(1);
  RunToTheEnd();
  EXPECT_EQ(world_.boxes.shown.at(0).icon, BoxIcon::kCritical);
  const auto fault = Fault("Comm Error!", "Download Failed\r\nOpen of serial port 1 has failed\r\n");
  ExpectFailure(fault);
  EXPECT_EQ(said_, kSending + "COMMAND FAILED! Ports 1 to 2 are written, 3 to 8 are not.");

  // Still gone: the start itself fails. Back again: it works, without choosing the port anew.
  commands_.send.Start();
  EXPECT_THAT(world_.boxes.Take(), ElementsAre(fault));
  EXPECT_EQ(said_, kSending + "Stopped. Nothing is written.");
  world_.bench.Replug(1);
  Run(commands_.send);
  ExpectSuccess();
}

TEST_F(Send, SecondStartAndRepliesOfOtherKinds_AreIgnored) {
  auto& unit = world_.Attach("", 0x01);
  commands_.send.Start();
  commands_.running.Operation()->OnPollReply(true, 0x01, 'n', Bytes{1, 11});
  world_.time.Advance(700);
  Run(commands_.send);
  ExpectSuccess();
  EXPECT_EQ(unit.accepted_commands(), 8u);
}

TEST_F(Send, StoppedByTheClosingWindow_ShowsAndSendsNothingMore) {
  auto& unit = world_.Attach("", 0x01);
  for (const std::uint64_t ms : {10u, 200u}) {  // while a poll is out, and in the pause after the first port
    commands_.send.Start();
    world_.time.Advance(ms);
    commands_.Stop();
    world_.time.Advance(60000);
  }
  EXPECT_THAT(world_.boxes.Take(), IsEmpty());
  EXPECT_EQ(unit.accepted_commands(), 2u);
}

}  // namespace
}  // namespace tendril::test
