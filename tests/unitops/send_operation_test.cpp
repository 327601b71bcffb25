#include "unitops/send_operation.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "command_fixture.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

const BoxMessage kNoResponse{"Unit did not respond to the Option Settings, Retry Command", "No Repsonse",
                             BoxIcon::kCritical};

class Send : public CommandTest {
 protected:
  void ExpectSuccess() { CommandTest::ExpectSuccess("SUCCESS: Send Complete!"); }
};

// What the program puts on the line of Comm `port`.
Bytes Recorded(VirtualPorts& bench, std::int32_t port, const std::function<void()>& action) {
  Bytes bytes;
  bench.Line(port).SetTap([&](const LineByte& byte) {
    if (byte.from == LineSide::kProgram) bytes.push_back(byte.value);
  });
  action();
  bench.Line(port).SetTap(nullptr);
  return bytes;
}

TEST_F(Send, EveryPort_GoesOutAsUnlockOptionsAndPoll) {
  struct Case {
    std::int16_t comm;
    bool echo;
    std::uint8_t unit;
    Bytes widths;  // the eight width bytes of each port
    Bytes checksums;
  };
  // Every packet written out by hand. Checksums: 0xAA + 17 + port + 1 + widths + checksum = 0 modulo 256.
  for (const Case& c : std::vector<Case>{{5,
                                          true,
                                          0x01,
                                          {60, 240, 100, 200, 100, 200, 150, 150},
                                          {0x93, 0x92, 0x91, 0x90, 0x8F, 0x8E, 0x8D, 0x8C}},
                                         {6,  // the narrowest and the widest pulse
                                          false,
                                          0xFE,
                                          {1, 255, 1, 255, 1, 255, 1, 255},
                                          {0x43, 0x42, 0x41, 0x40, 0x3F, 0x3E, 0x3D, 0x3C}}}) {
    SCOPED_TRACE(c.comm);
    world_.bench.AddPort(c.comm, {.echo = c.echo});
    auto& unit = world_.bench.Attach<VirtualUnit>(c.comm, c.unit);
    link_.SetCommPort(c.comm);
    target_.unit = c.unit;
    for (std::size_t slot = 0; slot < kPortCount; ++slot) {
      const auto width = [&](std::size_t i) { return c.widths[i] * 10; };
      ChannelConfig& record = working_.At(slot);
      record.ActualRange = {width(0), width(1)};
      record.VirtualRange = {width(2), width(3)};
      record.VirtualStops = {width(4), width(5)};
      record.DefaultPosition = width(6);
      record.NeutralPosition = width(7);
    }
    const Bytes sent = Recorded(world_.bench, c.comm, [&] {
      commands_.send.Start();
      RunToTheEnd();
    });
    ExpectSuccess();
    Bytes expected;
    for (std::uint8_t port = 1; port <= 8; ++port) {
      Bytes packets{0, c.unit, 0x8A, 0x56, 0, 0, c.unit, 0x0A, 17, port, 1};
      packets.insert(packets.end(), c.widths.begin(), c.widths.end());
      const Bytes rest{c.checksums[port - 1u], 0, 0, c.unit, 0x88, 0x30, 45, 0, 0, 0};
      packets.insert(packets.end(), rest.begin(), rest.end());
      expected.insert(expected.end(), packets.begin(), packets.end());
      EXPECT_EQ(unit.PortOptions(port)[1], c.widths[0]);
    }
    EXPECT_EQ(sent, expected);
    EXPECT_EQ(unit.accepted_commands(), 8u);
    EXPECT_EQ(world_.bench.Line(c.comm).counters().program_talked_into_reply, 0u);
  }
}

TEST_F(Send, Ports_FollowEachOther300msAfterTheAcknowledgement) {
  auto& unit = world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x01});
  commands_.send.Start();
  EXPECT_EQ(commands_.running.What(), "Sending the configuration to unit 01");
  ASSERT_TRUE(
      world_.time.AdvanceUntil([&] { return unit.polls_heard() == 1 && !link_.PollOutstanding(); }, 200));
  // Nothing until the pause is over.
  EXPECT_THAT(Recorded(world_.bench, 1, [&] { world_.time.Advance(299); }), ElementsAre(0, 0));
  EXPECT_THAT(Recorded(world_.bench, 1, [&] { world_.time.Advance(20); }).size(), testing::Gt(10u));
  RunToTheEnd();
  ExpectSuccess();
  EXPECT_TRUE(progress_.shown);
  world_.time.Advance(3000);
  EXPECT_FALSE(progress_.shown);
  EXPECT_EQ(world_.time.RunningTimers(), 0);
}

TEST_F(Send, BadlyBehavedUnits_EndWithTheirOutcome) {
  struct Case {
    std::string unit;
    std::size_t polls;  // that reach the unit
    bool success;
  };
  for (const Case& c : std::vector<Case>{{"mute", 3, false},
                                         {"wrong-answer", 1, false},
                                         {"locked", 1, false},
                                         {"rambling", 8, true},
                                         {"slow", 8, true},
                                         {"deaf", 8, true},  // to every second poll
                                         {"wrong-address", 3, false},
                                         {"unfinished", 3, false}}) {
    SCOPED_TRACE(c.unit);
    VirtualUnit& unit = Attach(c.unit, 0x05);
    target_.unit = 0x05;
    commands_.send.Start();
    RunToTheEnd();
    EXPECT_EQ(unit.polls_heard(), c.polls);
    if (c.success) {
      ExpectSuccess();
    } else {
      ExpectFailure(kNoResponse);
    }
    world_.bench.Detach(1, unit);

    // The program is usable afterwards.
    auto& good = world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x05});
    commands_.send.Start();
    RunToTheEnd();
    ExpectSuccess();
    world_.bench.Detach(1, good);
  }
}

TEST_F(Send, OnlyTheReplysSecondByte_Accepts) {
  struct Case {
    Bytes data;
    bool accepted;
  };
  for (const Case& c : std::vector<Case>{{{10}, false},
                                         {{1, 10}, true},
                                         {{10, 1}, false},
                                         {{1, 10, 3}, true},
                                         {{3, 1, 10}, false},
                                         {{}, false}}) {
    SCOPED_TRACE(testing::PrintToString(c.data));
    auto& unit = world_.bench.Attach<ScriptedUnit>(1, std::uint8_t{0x01}, c.data);
    commands_.send.Start();
    RunToTheEnd();
    if (c.accepted) {
      ExpectSuccess();
    } else {
      ExpectFailure(kNoResponse);
    }
    world_.bench.Detach(1, unit);
  }
}

TEST_F(Send, IdSetTo00InTheMiddle_IsASendErrorAtTheNextPort) {
  VirtualUnit& mute = Attach("mute", 0x01);
  commands_.send.Start();
  target_.unit = 0x00;  // a repeat goes to the unit that did not answer
  RunToTheEnd();
  ExpectFailure(kNoResponse);
  world_.bench.Detach(1, mute);
  target_.unit = 0x01;
  world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x01});
  commands_.send.Start();
  target_.unit = 0;
  RunToTheEnd();
  ExpectFailure({"Error sending configuration, Please retry", "Send Error", BoxIcon::kCritical});
}

TEST_F(Send, PollTakenBySomebodyElse_IsASendErrorOfTheRepeat) {
  world_.bench.Attach<MuteUnit>(1, std::uint8_t{0x01});
  commands_.send.Start();
  // Whoever hears of the missing reply first polls for something of his own.
  auto handler = [&](bool replied, std::uint8_t unit, std::uint8_t kind, Bytes& data) {
    link_.cmdPollStation(0x02, 'n');
    commands_.running.Operation()->OnPollReply(replied, unit, kind, data);
  };
  link_.SetPollReplyHandler(handler);
  RunToTheEnd();
  ExpectFailure(
      {"Error sending option command to the controller, Please retry", "Send Error", BoxIcon::kCritical});
}

TEST_F(Send, Refusals_AreToldAndStartNothing) {
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
}

TEST_F(Send, InvalidRecord_StopsBeforeItsPort) {
  auto& unit = world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x01});
  for (std::size_t slot = 0; slot < kPortCount; ++slot) working_.At(slot).DefaultPosition = 1200;
  working_.At(4).ActualRange[0] = 9;
  world_.boxes.while_open = [&] { EXPECT_FALSE(commands_.running.Active()); };
  commands_.send.Start();
  RunToTheEnd();
  EXPECT_THAT(world_.boxes.Take(), ElementsAre(BoxMessage{"Internal Error - Invalid ActualRange(0)=9",
                                                          "Internal Error", BoxIcon::kNone}));
  EXPECT_EQ(unit.accepted_commands(), 4u);
  EXPECT_EQ(unit.PortOptions(4)[7], 120);
  EXPECT_EQ(unit.PortOptions(5)[7], 150);
  // The display is not ended; the next command takes it over.
  world_.time.Advance(10000);
  EXPECT_EQ(unit.polls_heard(), 4u);
  EXPECT_TRUE(progress_.shown);
  EXPECT_EQ(progress_.text, "");
  working_.At(4).ActualRange[0] = 10;
  commands_.send.Start();
  RunToTheEnd();
  ExpectSuccess();

  working_.At(0).PortType = 7;  // the first port: nothing starts at all
  commands_.send.Start();
  EXPECT_THAT(world_.boxes.Take(), ElementsAre(BoxMessage{"Internal Error - Invalid PortType=7",
                                                          "Internal Error", BoxIcon::kNone}));
  EXPECT_FALSE(commands_.running.Active());
}

TEST_F(Send, UnpluggedBetweenTwoPorts_IsADownloadFailure) {
  auto& unit = world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x01});
  commands_.send.Start();
  ASSERT_TRUE(
      world_.time.AdvanceUntil([&] { return unit.polls_heard() == 2 && !link_.PollOutstanding(); }, 1000));
  world_.bench.Unplug(1);
  RunToTheEnd();
  EXPECT_EQ(world_.boxes.shown.at(0).icon, BoxIcon::kCritical);
  const auto fault = Fault("Comm Error!", "Download Failed\r\nOpen of serial port 1 has failed\r\n");
  ExpectFailure(fault);

  // Still gone: the start itself fails. Back again: it works, without choosing the port anew.
  commands_.send.Start();
  EXPECT_THAT(world_.boxes.Take(), ElementsAre(fault));
  world_.bench.Replug(1);
  commands_.send.Start();
  RunToTheEnd();
  ExpectSuccess();
}

TEST_F(Send, SecondStartWhileOneRuns_IsIgnored) {
  auto& unit = world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x01});
  commands_.send.Start();
  world_.time.Advance(700);
  commands_.send.Start();
  RunToTheEnd();
  ExpectSuccess();
  EXPECT_EQ(unit.accepted_commands(), 8u);
}

TEST_F(Send, StoppedByTheClosingWindow_SaysNothingMore) {
  world_.bench.Attach<MuteUnit>(1, std::uint8_t{0x01});
  commands_.send.Start();
  world_.time.Advance(50);
  commands_.Stop();
  world_.time.Advance(60000);
  EXPECT_THAT(world_.boxes.Take(), IsEmpty());

  auto& unit = world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x02});
  target_.unit = 0x02;
  commands_.send.Start();
  world_.time.Advance(200);  // the pause after the first port
  commands_.Stop();
  world_.time.Advance(60000);
  EXPECT_EQ(unit.accepted_commands(), 1u);
}

TEST_F(Send, RepliesOfOtherKinds_AreNotItsOwn) {
  world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x01});
  commands_.send.Start();
  commands_.running.Operation()->OnPollReply(true, 0x01, 'n', Bytes{1, 11});
  RunToTheEnd();
  ExpectSuccess();
}

}  // namespace
}  // namespace tendril::test
