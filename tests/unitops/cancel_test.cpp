// Commands that the user cancels, and what is said of commands that end.
#include "command_fixture.h"

namespace tendril::test {
namespace {

constexpr int kNever = -1;

class Outcomes : public CommandTest {
 protected:
  // Runs `operation` against the unit called `fault`, cancels it after `cancel_ms`, and returns what is said.
  std::string Said(UnitOperation& operation, const std::string& fault, int cancel_ms) {
    const bool change = &operation == &commands_.change_id;
    target_.unit = change ? 0x0A : 0x01;
    VirtualUnit& unit = world_.Attach(fault, change ? 0xFF : 0x01);
    operation.Start();
    if (cancel_ms != kNever) {
      world_.time.Advance(static_cast<std::uint64_t>(cancel_ms));
      const bool poll_out = link_.PollOutstanding();
      commands_.Cancel();
      EXPECT_EQ(commands_.running.Active(), poll_out) << "until the outstanding poll has ended";
    }
    const auto heard = unit.polls_heard();
    RunToTheEnd();
    EXPECT_TRUE(cancel_ms == kNever || unit.polls_heard() <= heard + 1) << "nothing follows";
    world_.time.Advance(5000);
    EXPECT_EQ(world_.time.RunningTimers(), 0);
    EXPECT_EQ(world_.boxes.Take().empty(), cancel_ms != kNever || progress_.colour == ProgressColour::kGreen);
    world_.bench.Detach(1, unit);
    return said_;
  }
};

TEST_F(Outcomes, SayHowTheUnitIsLeft) {
  struct Case {
    UnitOperation& operation;
    const char* fault;
    int cancel_ms;
    const char* said;
  };
  UnitOperation &send = commands_.send, &get = commands_.get, &compare = commands_.compare,
                &change = commands_.change_id;
  const ChannelTable before = working_;
  for (const Case& c :
       {Case{send, "", kNever, "SUCCESS: Send Complete! Ports 1 to 8 are written."},
        {send, "mute", kNever, "COMMAND FAILED! Port 1 is perhaps written, 2 to 8 are not."},
        {send, "mute", 20, "Cancelled: COMMAND FAILED! Port 1 is perhaps written, 2 to 8 are not."},
        {send, "", 20, "Cancelled: COMMAND FAILED! Port 1 is written, 2 to 8 are not."},
        {send, "", 200, "Cancelled: COMMAND FAILED! Port 1 is written, 2 to 8 are not."},
        {send, "", 2050, "Cancelled: COMMAND FAILED! Ports 1 to 7 are written, 8 is not."},
        {get, "mute", kNever, "COMMAND FAILED! Nothing has changed."},
        {get, "", 100, "Cancelled: COMMAND FAILED! Nothing has changed."},
        {compare, "", 100, "Cancelled: COMMAND FAILED! No record has changed."},
        {change, "mute", kNever, "COMMAND FAILED! No ID has changed."},
        {change, "stubborn", kNever, "COMMAND FAILED! The unit may be at 0A already."},
        {change, "", 410, "Cancelled: COMMAND FAILED! The unit may be at 0A already."},
        {change, "", 700, "Cancelled: COMMAND FAILED! The unit answers at 0A."},
        {change, "", kNever, "SUCCESS: UnitID set to '0A'. The unit answers at 0A."}}) {
    const std::string what = &c.operation == &send      ? "Sending to unit 01"
                             : &c.operation == &get     ? "Reading unit 01"
                             : &c.operation == &compare ? "Comparing unit 01"
                                                        : "Giving the unit the ID 0A";
    EXPECT_EQ(Said(c.operation, c.fault, c.cancel_ms), what + " at 14:05: " + c.said);
    EXPECT_EQ(working_, before);
  }
  EXPECT_EQ(Said(get, "", kNever),
            "Reading unit 01 at 14:05: SUCCESS: Upload Complete. Ports 1 to 8 are read.");
}

}  // namespace
}  // namespace tendril::test
