// Commands that the user cancels, and what is said of every command that ends or cannot begin.
#include "command_fixture.h"

namespace tendril::test {
namespace {

constexpr int kNever = -1;

class Outcomes : public CommandTest {
 protected:
  // Runs `operation` against the unit called `fault`, cancels it after `cancel_ms`, and returns what is said.
  std::string Said(UnitOperation& operation, const std::string& fault, std::uint8_t id, int cancel_ms) {
    VirtualUnit& unit = Attach(fault, id);
    operation.Start();
    if (cancel_ms != kNever) Cancel(cancel_ms, unit);
    RunToTheEnd();
    world_.time.Advance(5000);
    EXPECT_EQ(world_.time.RunningTimers(), 0);
    EXPECT_EQ(world_.boxes.Take().empty(), cancel_ms != kNever || progress_.colour == ProgressColour::kGreen);
    world_.bench.Detach(1, unit);
    return said_;
  }
  void Cancel(int after_ms, const VirtualUnit& unit) {
    world_.time.Advance(static_cast<std::uint64_t>(after_ms));
    const bool poll_out = link_.PollOutstanding();
    commands_.Cancel();
    EXPECT_EQ(commands_.running.Active(), poll_out) << "until the outstanding poll has ended";
    const auto heard = unit.polls_heard();
    RunToTheEnd();
    EXPECT_LE(unit.polls_heard(), heard + 1) << "nothing follows";
    EXPECT_EQ(progress_.text, "COMMAND FAILED!");
  }
  // Starts `operation`, which cannot begin, and returns what is said behind its box.
  std::string SaidAtTheStart(UnitOperation& operation) {
    said_.clear();
    operation.Start();
    EXPECT_EQ(world_.boxes.Take().size(), 1u);
    EXPECT_FALSE(commands_.running.Active());
    return said_;
  }
};

TEST_F(Outcomes, SayHowTheUnitIsLeft) {
  struct Case {
    UnitOperation& operation;
    const char* fault;
    std::uint8_t chosen, id;
    int cancel_ms;
    const char* said;
  };
  UnitOperation& send = commands_.send;
  UnitOperation& get = commands_.get;
  UnitOperation& change = commands_.change_id;
  const ChannelTable before = working_;
  for (const Case& c :
       {Case{send, "", 1, 1, kNever,
             "Sending to unit 01 at 14:05: SUCCESS: Send Complete! Ports 1 to 8 are written."},
        {send, "mute", 1, 1, kNever,
         "Sending to unit 01 at 14:05: COMMAND FAILED! Port 1 is perhaps written, 2 to 8 are not."},
        {send, "wrong-answer", 1, 1, kNever,
         "Sending to unit 01 at 14:05: COMMAND FAILED! Port 1 is perhaps written, 2 to 8 are not."},
        {send, "mute", 1, 1, 20,
         "Sending to unit 01 at 14:05: Cancelled: COMMAND FAILED! Port 1 is perhaps written, 2 to 8 are "
         "not."},
        {send, "", 1, 1, 20,
         "Sending to unit 01 at 14:05: Cancelled: COMMAND FAILED! Port 1 is written, 2 to 8 are not."},
        {send, "", 1, 1, 200,
         "Sending to unit 01 at 14:05: Cancelled: COMMAND FAILED! Port 1 is written, 2 to 8 are not."},
        {send, "", 1, 1, 2050,
         "Sending to unit 01 at 14:05: Cancelled: COMMAND FAILED! Ports 1 to 7 are written, 8 is not."},
        {send, "", 1, 1, 2300,
         "Sending to unit 01 at 14:05: Cancelled: COMMAND FAILED! Ports 1 to 8 are written."},
        {get, "mute", 1, 1, kNever, "Reading unit 01 at 14:05: COMMAND FAILED! Nothing has changed."},
        {get, "", 1, 1, 100, "Reading unit 01 at 14:05: Cancelled: COMMAND FAILED! Nothing has changed."},
        {change, "mute", 10, 255, kNever,
         "Giving the unit the ID 0A at 14:05: COMMAND FAILED! No ID has changed."},
        {change, "stubborn", 10, 255, kNever,
         "Giving the unit the ID 0A at 14:05: COMMAND FAILED! The unit may be at 0A already."},
        {change, "mute", 10, 255, 500,
         "Giving the unit the ID 0A at 14:05: Cancelled: COMMAND FAILED! No ID has changed."},
        {change, "", 10, 255, 410,
         "Giving the unit the ID 0A at 14:05: Cancelled: COMMAND FAILED! The unit may be at 0A already."},
        {change, "", 10, 255, 700,
         "Giving the unit the ID 0A at 14:05: Cancelled: COMMAND FAILED! The unit answers at 0A."},
        {change, "", 10, 255, kNever,
         "Giving the unit the ID 0A at 14:05: SUCCESS: UnitID set to '0A'. The unit answers at 0A."}}) {
    target_.unit = c.chosen;
    EXPECT_EQ(Said(c.operation, c.fault, c.id, c.cancel_ms), c.said);
    EXPECT_EQ(working_, before);
  }
  target_.unit = 1;
  EXPECT_EQ(Said(get, "", 1, kNever),
            "Reading unit 01 at 14:05: SUCCESS: Upload Complete. Ports 1 to 8 are read.");
}

TEST_F(Outcomes, FaultsInTheMiddle_SayHowTheUnitIsLeft) {
  auto& unit = Attach("", 0x01);
  commands_.send.Start();
  EXPECT_EQ(said_, "Sending to unit 01");
  EXPECT_EQ(progress_.title, "Sending to unit 01: port 1 of 8");
  world_.time.Advance(700);
  EXPECT_EQ(progress_.title, "Sending to unit 01: port 3 of 8");
  world_.bench.Detach(1, unit);
  RunToTheEnd();
  EXPECT_EQ(
      said_,
      "Sending to unit 01 at 14:05: COMMAND FAILED! Ports 1 to 3 are written, 4 perhaps, 5 to 8 are not.");

  Attach("", 0x01);
  commands_.send.Start();
  world_.time.Advance(200);
  world_.bench.Unplug(1);
  RunToTheEnd();
  EXPECT_EQ(said_, "Sending to unit 01 at 14:05: COMMAND FAILED! Port 1 is written, 2 to 8 are not.");
  world_.bench.Replug(1);
  working_.At(1).ActualRange[0] = 9;
  Run(commands_.send);
  EXPECT_EQ(progress_.title, "Stopped: channel 2: 9 to 2400 cannot be sent");
  EXPECT_EQ(said_,
            "Sending to unit 01 at 14:05: " + progress_.title + ". Port 1 is written, 2 to 8 are not.");

  // The log is written after each packet: the unit was unlocked, and got no ID.
  commands_.change_id.Start();
  world_.time.Advance(300);
  world_.log.broken = true;
  RunToTheEnd();
  EXPECT_EQ(said_, "Giving the unit the ID 01 at 14:05: COMMAND FAILED! No ID has changed.");
}

TEST_F(Outcomes, CommandsThatCannotBegin_SaySo) {
  target_.unit = 0;  // is never polled: the options go out before
  EXPECT_EQ(SaidAtTheStart(commands_.send),
            "Sending to unit 00 at 14:05: Stopped. Port 1 is perhaps written, 2 to 8 are not.");
  target_.unit = 1;
  working_.At(0).ActualRange[0] = 9;
  EXPECT_EQ(SaidAtTheStart(commands_.send),
            "Sending to unit 01 at 14:05: Stopped: channel 1: 9 to 2400 cannot be sent. Nothing is written.");
  working_.At(0).ActualRange[0] = 600;
  world_.bench.Unplug(1);
  link_.SetPortOpen(false);
  EXPECT_EQ(SaidAtTheStart(commands_.send), "Sending to unit 01 at 14:05: Stopped. Nothing is written.");
  EXPECT_EQ(SaidAtTheStart(commands_.get), "Reading unit 01 at 14:05: Stopped. Nothing has changed.");
  EXPECT_EQ(SaidAtTheStart(commands_.change_id),
            "Giving the unit the ID 01 at 14:05: Stopped. No ID has changed.");
}

}  // namespace
}  // namespace tendril::test
