// Commands that the user ends, and how they and failed ones leave the unit.
#include <tuple>

#include "command_fixture.h"

namespace tendril::test {
namespace {

class Cancel : public CommandTest {
 protected:
  // Runs `operation` against the unit called `fault`, cancels it after `ms`, and returns how the unit is left.
  std::string Aftermath(UnitOperation& operation, const std::string& fault, std::uint8_t id,
                        std::uint64_t ms) {
    VirtualUnit& unit = Attach(fault, id);
    operation.Start();
    world_.time.Advance(ms);
    const bool poll_out = link_.PollOutstanding();
    commands_.Cancel();
    EXPECT_EQ(commands_.running.Active(), poll_out) << "until the outstanding poll has ended";
    const auto heard = unit.polls_heard();
    world_.time.Advance(5000);
    EXPECT_LE(unit.polls_heard(), heard + 1) << "nothing follows";
    EXPECT_FALSE(commands_.running.Active());
    EXPECT_EQ(progress_.text, "COMMAND FAILED!");
    EXPECT_TRUE(world_.boxes.Take().empty());
    EXPECT_EQ(world_.time.RunningTimers(), 0);
    world_.bench.Detach(1, unit);
    return commands_.running.Aftermath();
  }
};

TEST_F(Cancel, EndsTheCommandAfterItsPoll_AndSaysHowTheUnitIsLeft) {
  const ChannelTable before = working_;
  for (const auto& [fault, ms, left] : {std::tuple("", 20u, "Unit 01: port 1 is written, 2 to 8 are not."),
                                        {"mute", 20u, "Unit 01: port 1 is perhaps written, 2 to 8 are not."},
                                        {"", 200u, "Unit 01: port 1 is written, 2 to 8 are not."},
                                        {"", 1000u, "Unit 01: ports 1 to 4 are written, 5 to 8 are not."},
                                        {"", 2050u, "Unit 01: ports 1 to 7 are written, 8 is not."},
                                        {"", 2300u, "Unit 01: ports 1 to 8 are written."}})
    EXPECT_EQ(Aftermath(commands_.send, fault, 0x01, ms), left) << ms;
  EXPECT_EQ(Aftermath(commands_.get, "", 0x01, 100),
            "Nothing has changed: the configuration shown here is the one from before.");
  EXPECT_EQ(working_, before);
  target_.unit = 0x0A;
  for (const auto& [fault, ms, left] : {std::tuple("mute", 500u, "No ID has changed."),
                                        {"", 410u, "The unit may be at 0A already."},
                                        {"", 700u, "The unit answers at 0A."}})
    EXPECT_EQ(Aftermath(commands_.change_id, fault, 0xFF, ms), left) << ms;
}

TEST_F(Cancel, FailedCommands_SayTheSame) {
  auto& unit = Attach("", 0x01);
  commands_.send.Start();
  EXPECT_EQ(progress_.title, "Sending to unit 01: port 1 of 8");
  world_.time.Advance(700);
  EXPECT_EQ(progress_.title, "Sending to unit 01: port 3 of 8");
  world_.bench.Detach(1, unit);
  RunToTheEnd();
  EXPECT_EQ(commands_.running.Aftermath(), "Unit 01: ports 1 to 3 are written, 4 perhaps, 5 to 8 are not.");
  auto& whole = Attach("", 0x01);
  working_.At(1).ActualRange[0] = 9;
  Run(commands_.send);
  EXPECT_EQ(progress_.title, "Stopped: channel 2: 9 to 2400 cannot be sent");
  EXPECT_EQ(commands_.running.Aftermath(), "Unit 01: port 1 is written, 2 to 8 are not.");
  Run(commands_.get);
  EXPECT_EQ(commands_.running.Aftermath(), "") << "success";
  EXPECT_GT(whole.polls_heard(), 1u);
}

}  // namespace
}  // namespace tendril::test
