#include "unitops/get_operation.h"

#include <random>
#include <vector>

#include "command_fixture.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr char kGetSuccess[] = "SUCCESS: Upload Complete";
const BoxMessage kNotAllPorts{"Error:1  Uploading Configuration, Please retry", "Send Error",
                              BoxIcon::kCritical};

class Get : public CommandTest {
 protected:
  // Something else in every port.
  static void SetUp(VirtualUnit& unit) {
    for (std::uint8_t port = 1; port <= 8; ++port) {
      const auto by = [&](int width) { return static_cast<std::uint8_t>(width + port); };
      unit.SetPortOptions(port, {159, by(50), by(220), by(90), by(190), by(100), by(180), by(140), by(150)});
    }
  }
  void ExpectUnitsRecords() {
    for (int slot = 0; slot < 8; ++slot) {
      const int by = 10 * (slot + 1);
      const ChannelConfig expected{.PortType = 2,
                                   .ActualRange = {500 + by, 2200 + by},
                                   .VirtualRange = {900 + by, 1900 + by},
                                   .VirtualStops = {1000 + by, 1800 + by},
                                   .DefaultPosition = 1400 + by,
                                   .NeutralPosition = 1500 + by,
                                   .PowerUPOpt = 1,
                                   .LostCommOption = 3};
      EXPECT_EQ(working_.At(static_cast<std::size_t>(slot)), expected) << slot;
    }
  }
};

TEST_F(Get, Units_EndAsTheyReportTheirPorts) {
  struct Case {
    std::string unit;
    std::size_t polls;  // that reach the unit
    bool success;
  };
  for (const Case& c :
       std::vector<Case>{{"", 8, true},
                         {"scrambled", 8, true},
                         {"repeating", 15, true},
                         {"rambling", 8, true},
                         {"slow", 8, true},
                         {"ninth-port", 8, true},
                         // Every third reply is a byte short: ports 3 and 6 come later.
                         {"short-reply", 14, true},
                         // Each reply is taken for the next poll's: the port is all that counts.
                         {"late", 9, true},
                         {"mute", 33, false},
                         {"flooding", 2, false},  // talks all the time
                         {"missing-port", 33, false},
                         {"stuck-port", 33, false},
                         {"too-slow", 7, false},  // deaf while it talks
                         {"wrong-address", 33, false},
                         {"unfinished", 33, false}}) {
    SCOPED_TRACE(c.unit);
    for (std::size_t slot = 0; slot < 8; ++slot) SetFromPreset(kPresets[0], working_.At(slot));
    const ChannelTable before = working_;
    VirtualUnit& unit = Attach(c.unit, 0x05);
    SetUp(unit);
    target_.unit = 0x05;
    int replaced = 0;
    on_replaced_ = [&] {
      ++replaced;
      EXPECT_TRUE(commands_.running.Active());
      ExpectUnitsRecords();
    };
    commands_.get.Start();
    EXPECT_EQ(commands_.running.What(), "Reading the configuration of unit 05");
    ASSERT_TRUE(world_.time.AdvanceUntil(
        [&] {
          // All at one moment, or not at all.
          EXPECT_TRUE(working_ == before || replaced == 1);
          return !commands_.running.Active();
        },
        12000));
    EXPECT_EQ(unit.polls_heard(), c.polls);
    EXPECT_EQ(replaced, c.success ? 1 : 0);
    if (c.success) {
      ExpectSuccess(kGetSuccess);
      ExpectUnitsRecords();
    } else {
      ExpectFailure(kNotAllPorts);
      EXPECT_EQ(working_, before);
    }
    world_.bench.Detach(1, unit);
    world_.time.Advance(3000);
  }
  EXPECT_EQ(world_.time.RunningTimers(), 0) << "nothing runs when the outcome has been shown";
}

TEST_F(Get, PortBeyondTheEighth_EndsItAtOnce) {
  const ChannelTable before = working_;
  for (const int port : {9, 255}) {
    Bytes data(port == 9 ? 10 : 12, 1);  // more than ten bytes are read as well
    data[0] = static_cast<std::uint8_t>(port);
    auto& unit = world_.bench.Attach<ScriptedUnit>(1, std::uint8_t{0x01}, data);
    commands_.get.Start();
    RunToTheEnd();
    ExpectFailure({"Upload error: Invalid Port Index Received = " + std::to_string(port - 1), "Error",
                   BoxIcon::kExclamation});
    EXPECT_EQ(unit.polls_heard(), 1u);
    world_.bench.Detach(1, unit);
  }
  // A port 0 cannot come over the line, where a zero byte ends the reply.
  commands_.get.Start();
  commands_.running.Operation()->OnPollReply(true, 0x01, 'n', Bytes(10, 0));
  ExpectFailure({"Upload error: Invalid Port Index Received = -1", "Error", BoxIcon::kExclamation});
  EXPECT_EQ(working_, before);
}

TEST_F(Get, RepliesOfOtherKinds_AreNotItsOwn) {
  Attach("", 0x01);
  for (const std::uint8_t kind : {'0', '*', '+', 'x'}) {
    commands_.get.Start();
    commands_.running.Operation()->OnPollReply(true, 0x01, kind, Bytes(10, 9));
    commands_.running.Operation()->OnPollReply(false, 0x01, kind, {});
    RunToTheEnd();
    ExpectSuccess(kGetSuccess);
  }
}

TEST_F(Get, Refusals_AreToldInTheStatedWords) {
  const ChannelTable before = working_;
  target_.port_chosen = false;
  commands_.get.Start();
  EXPECT_EQ(world_.boxes.Take().at(0).title, "No Port Selected");
  target_.port_chosen = true;

  target_.unit = 0;
  commands_.get.Start();
  EXPECT_THAT(world_.boxes.Take(), ElementsAre(BoxMessage{"Error Uploading Configuration, Please retry",
                                                          "Send Error", BoxIcon::kCritical}));
  EXPECT_FALSE(progress_.shown);

  target_.unit = 1;
  Attach("", 0x01);
  commands_.get.Start();
  target_.unit = 0;
  RunToTheEnd();
  ExpectFailure({"Error:2 Uploading Configuration, Please retry", "Send Error", BoxIcon::kCritical});
  EXPECT_EQ(working_, before);
}

TEST_F(Get, Unplugged_IsTheStatedFaultAndChangesNothing) {
  const ChannelTable before = working_;
  Attach("", 0x01);
  commands_.get.Start();
  world_.time.Advance(60);
  world_.bench.Unplug(1);
  RunToTheEnd();
  ExpectFailure(Fault("Serial Event Error",
                      "Serial Event Error (Poll Type 110)\r\n\r\nOpen of serial port 1 has failed\r\n"));

  commands_.get.Start();
  EXPECT_THAT(world_.boxes.Take(),
              ElementsAre(Fault("Comm Error!", "Upload Failed\r\nOpen of serial port 1 has failed\r\n")));
  EXPECT_EQ(working_, before);

  world_.bench.Replug(1);
  commands_.get.Start();
  RunToTheEnd();
  ExpectSuccess(kGetSuccess);
}

TEST_F(Get, WhatWasSent_IsWhatIsReadBack) {
  Attach("", 0x01);
  std::mt19937 random(20261121);
  const auto between = [&](int low, int high) {
    return std::uniform_int_distribution<int>(low, high)(random);
  };
  const auto width = [&] { return between(kMinPulseWidth, kMaxPulseWidth); };
  for (int round = 0; round < 1000; ++round) {
    ChannelTable expected;
    for (std::size_t slot = 0; slot < kPortCount; ++slot) {
      ChannelConfig& record = working_.At(slot);
      record = {.PortType = static_cast<std::int16_t>(between(0, 2)),
                .ActualRange = {width(), width()},
                .VirtualRange = {width(), width()},
                .VirtualStops = {width(), width()},
                .DefaultPosition = width(),
                .NeutralPosition = width(),
                .PowerUPOpt = between(1, 3),
                .LostCommOption = between(1, 4)};
      ChannelConfig& kept = expected.At(slot);
      kept = record;
      for (Microseconds* field :
           {&kept.ActualRange[0], &kept.ActualRange[1], &kept.VirtualRange[0], &kept.VirtualRange[1],
            &kept.VirtualStops[0], &kept.VirtualStops[1], &kept.DefaultPosition, &kept.NeutralPosition}) {
        *field -= *field % 10;
      }
    }
    commands_.send.Start();
    RunToTheEnd();
    working_ = ChannelTable();
    commands_.get.Start();
    RunToTheEnd();
    ASSERT_EQ(working_, expected) << "round " << round;
  }
  EXPECT_THAT(world_.boxes.shown, IsEmpty());
}

}  // namespace
}  // namespace tendril::test
