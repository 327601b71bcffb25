// Finding units: every ID is polled in order, and what answers is listed.
#include "command_fixture.h"

namespace tendril::test {
namespace {

class Find : public CommandTest {
 protected:
  // "01 answers, 20 perhaps several units".
  std::string Found() const {
    std::string text;
    for (const FoundUnit& unit : commands_.find.Search().found)
      text += (text.empty() ? "" : ", ") + HexByte(unit.id) + " " + unit.Words();
    return text;
  }
};

// The floor: a poll and its reply on the wire, with the unit's turn-round, or the time-out while the poll's six bytes
// wait: 20 bits at 19200 for each of them, 38, and the 45 pads. The ID that two units have is polled twice.
TEST_F(Find, TakesNoLongerThanBytesAndTimeOuts) {
  target_.unit = 0x33;
  for (const int id : {0x01, 0x0A, 0x7F, 0x20, 0x20}) world_.Attach("", static_cast<std::uint8_t>(id));
  const std::uint64_t start_ms = world_.time.ElapsedMs();
  commands_.find.Start();
  world_.time.Advance(1100);
  EXPECT_EQ(progress_.title, "Finding units: 12 of 253, 2 found");
  ASSERT_TRUE(world_.time.AdvanceUntil([&] { return !commands_.running.Active(); }, 60'000));
  constexpr double kFloorMs =
      251 * (6 + 38 + 45) * 20 * 1000.0 / 19200 + 3 * ((6 + 3 + 4) * 10 * 1000.0 / 19200 + 2);
  EXPECT_LE(static_cast<double>(world_.time.ElapsedMs() - start_ms), 1.02 * kFloorMs);
  std::string polls;
  for (int id = 1; id <= 0xFD; ++id) {
    polls += HexByte(static_cast<std::uint8_t>(id)) + (id == 1 || id == 10 || id == 0x7F ? "+ " : "- ");
    if (id == 0x20) polls += "20- ";
  }
  EXPECT_EQ(noted_, polls);
  EXPECT_EQ(Found(), "01 answers, 0A answers, 20 perhaps several units, 7F answers");
  EXPECT_EQ(said_,
            "Finding units at 14:05: SUCCESS: Search Complete. 3 units found: 01, 0A and 7F; perhaps several "
            "at 20. "
            "Connect units that share an ID one at a time, and give each its own.");
  ExpectSuccess("SUCCESS: Search Complete");
}

// Nothing follows the poll that is out.
TEST_F(Find, CancelledOrUnplugged_EndsWithThePollAndKeepsWhatItHasFound) {
  world_.Attach("", 0x01);
  for (const bool unplugged : {false, true}) {
    noted_.clear();
    commands_.find.Start();
    world_.time.Advance(250);
    if (unplugged) {
      world_.bench.Unplug(1);
      world_.time.Advance(5);
      world_.bench.Replug(1);  // the search goes on at no other device
    } else {
      commands_.Cancel();
    }
    world_.time.Advance(200);
    EXPECT_EQ(noted_, "01+ 02- 03- ");
    EXPECT_EQ(said_, std::string("Finding units at 14:05: ") +
                         (unplugged ? "COMMAND FAILED! Only IDs up to 02"
                                    : "Cancelled: COMMAND FAILED! Only IDs up to 03") +
                         " were polled. 1 unit found: 01.");
    EXPECT_EQ(world_.boxes.Take().size(), unplugged ? 1u : 0u);
  }
}

TEST_F(Find, SaysWhatIsAtAnId) {
  const std::pair<const char*, const char*> cases[] = {{"mute", ""},
                                                       {"rambling", "02 answers"},
                                                       {"deaf", "02 answers"},
                                                       {"wrong-address", "02 answers something else"},
                                                       {"unfinished", "02 perhaps several units"},
                                                       {"late", "02 answers too late"}};
  for (const auto& [fault, found] : cases) {
    VirtualUnit& unit = world_.Attach(fault, 0x02);
    commands_.find.Start();
    world_.time.Advance(600);
    EXPECT_EQ(Found(), found) << fault;
    commands_.Cancel();
    world_.time.Advance(200);
    world_.bench.Detach(1, unit);
  }
}

// A damaged echo, too, is no sign of units.
TEST_F(Find, SaysWhatToDoWhenNoUnitAnswers) {
  const std::pair<VirtualLineOptions, std::string> cases[] = {
      {{}, "Check power, wiring and port. A unit fresh from the factory has FF"},
      {{.echo = false}, "Nothing comes back"},
      {{.echo_loses_every = 5}, "What the program sends comes back damaged"}};
  std::int16_t port = 5;
  for (const auto& [options, what_next] : cases) {
    world_.bench.AddPort(port, options);
    link_.SetCommPort(port++);
    commands_.find.Start();
    world_.time.Advance(25'000);
    EXPECT_THAT(said_, testing::HasSubstr("Complete. No unit answered. " + what_next));
  }
}

}  // namespace
}  // namespace tendril::test
