#include "unitops/get_operation.h"

#include "command_fixture.h"
#include "config/option_bytes.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;

constexpr char kGetSuccess[] = "SUCCESS: Upload Complete";
const BoxMessage kNotAllPorts{"Error:1  Uploading Configuration, Please retry", "Send Error",
                              BoxIcon::kCritical};

class Get : public CommandTest {};

TEST_F(Get, Units_EndAsTheyReportTheirPorts) {
  target_.unit = 0x05;
  const auto run = [&](UnitOperation& operation, const std::string& fault, std::size_t polls, bool success) {
    SCOPED_TRACE(fault);
    const bool get = &operation == &commands_.get;
    for (std::size_t slot = 0; slot < kPortCount; ++slot) SetFromPreset(kPresets[0], working_.At(slot));
    const ChannelTable before = working_;
    ChannelTable of_the_unit = before;
    VirtualUnit& unit = world_.Attach(fault, 0x05);
    for (std::uint8_t port = 1; port <= kPortCount; ++port) {
      OptionBytes options{159, 50, 220, 90, 190, 100, 180, 140, 150};
      options[port] = port;  // another value in every port
      unit.SetPortOptions(port, options);
      ChannelConfig& record = of_the_unit.At(port - 1u);
      record = DecodeOptions(options);
      record.Received = false;
    }
    on_replaced_ = [&] { EXPECT_TRUE(commands_.running.Active()); };
    noted_.clear();
    held_ = {};
    operation.Start();
    EXPECT_EQ(commands_.running.What(), get ? "Reading unit 05" : "Comparing unit 05");
    const auto ended = [&] {
      // All at one moment, or not at all.
      EXPECT_TRUE(working_ == before || (get && working_ == of_the_unit));
      return !commands_.running.Active();
    };
    ASSERT_TRUE(world_.time.AdvanceUntil(ended, 12000));
    EXPECT_EQ(unit.polls_heard(), polls);
    if (success) {
      ExpectSuccess(get ? kGetSuccess : "SUCCESS: Compare Complete");
    } else {
      ExpectFailure({kNotAllPorts.text, get ? "Send Error" : "Compare", BoxIcon::kCritical});
    }
    EXPECT_EQ(working_, get && success ? of_the_unit : before);
    EXPECT_EQ(commands_.compare.TakeFailure(), !get && !success);
    EXPECT_EQ(noted_.ends_with(get ? "replaced 05 " : "compared 05 "), success);
    for (std::uint8_t port = 1; !get && success && port <= kPortCount; ++port)
      EXPECT_EQ(held_[port - 1u], unit.PortOptions(port));
    world_.bench.Detach(1, unit);
    world_.time.Advance(3000);
  };
  const auto expect = [&](const std::string& fault, std::size_t polls, bool success) {
    run(commands_.get, fault, polls, success);
    run(commands_.compare, fault, polls, success);
  };
  for (const char* fault : {"", "scrambled", "rambling", "slow", "ninth-port"}) expect(fault, 8, true);
  expect("repeating", 15, true);
  expect("short-reply", 14, true);  // every third reply is a byte short: ports 3 and 6 come later
  expect("late", 9, true);          // each reply is taken for the next poll's: the port is all that counts
  expect("flooding", 2, false);     // talks all the time
  expect("too-slow", 7, false);     // deaf while it talks
  for (const char* fault : {"mute", "missing-port", "stuck-port", "wrong-address", "unfinished"})
    expect(fault, 33, false);
  EXPECT_EQ(world_.time.RunningTimers(), 0) << "nothing runs when the outcome has been shown";
}

TEST_F(Get, PortBeyondTheEighth_EndsItAtOnce) {
  const ChannelTable before = working_;
  Bytes data(12, 1);  // more than ten bytes are read as well
  data[0] = 9;
  auto& unit = world_.bench.Attach<ScriptedUnit>(1, std::uint8_t{0x01}, data);
  Run(commands_.get);
  ExpectFailure({"Upload error: Invalid Port Index Received = 8", "Error", BoxIcon::kExclamation});
  EXPECT_EQ(unit.polls_heard(), 1u);
  Run(commands_.compare);
  ExpectFailure({"Upload error: Invalid Port Index Received = 8", "Compare", BoxIcon::kExclamation});
  // A port 0 cannot come over the line, where a zero byte ends the reply.
  commands_.get.Start();
  commands_.running.Operation()->OnPollReply(true, 0x01, 'n', Bytes(10, 0));
  ExpectFailure({"Upload error: Invalid Port Index Received = -1", "Error", BoxIcon::kExclamation});
  EXPECT_EQ(working_, before);
}

TEST_F(Get, RefusedPoll_IsASendError) {
  target_.unit = 0;
  commands_.get.Start();
  EXPECT_THAT(world_.boxes.Take(), ElementsAre(BoxMessage{"Error Uploading Configuration, Please retry",
                                                          "Send Error", BoxIcon::kCritical}));
  EXPECT_FALSE(progress_.shown);

  target_.unit = 1;
  world_.Attach("", 0x01);
  commands_.get.Start();
  target_.unit = 0;
  RunToTheEnd();
  ExpectFailure({"Error:2 Uploading Configuration, Please retry", "Send Error", BoxIcon::kCritical});
}

TEST_F(Get, Unplugged_IsAFaultAndChangesNothing) {
  const ChannelTable before = working_;
  world_.Attach("", 0x01);
  commands_.get.Start();
  world_.time.Advance(60);
  world_.bench.Unplug(1);
  RunToTheEnd();
  ExpectFailure(Fault("Serial Event Error",
                      "Serial Event Error (Poll Type 110)\r\n\r\nOpen of serial port 1 has failed\r\n"));

  commands_.get.Start();
  EXPECT_THAT(world_.boxes.Take(),
              ElementsAre(Fault("Comm Error!", "Upload Failed\r\nOpen of serial port 1 has failed\r\n")));
  EXPECT_EQ(said_, "Reading unit 01 at 14:05: Stopped. Nothing has changed.");
  commands_.compare.Start();
  EXPECT_THAT(world_.boxes.Take(),
              ElementsAre(Fault("Comm Error!", "Compare Failed\r\nOpen of serial port 1 has failed\r\n")));
  EXPECT_TRUE(commands_.compare.TakeFailure());
  EXPECT_EQ(working_, before);
}

}  // namespace
}  // namespace tendril::test
