#include "unitops/change_id_operation.h"

#include "command_fixture.h"

namespace tendril::test {
namespace {

using ChangeId = CommandTest;

TEST_F(ChangeId, UnitFromTheFactory_IsFoundGivenItsIdAndConfirmed) {
  auto& unit = world_.Attach("", 0xFF);
  target_.unit = 0x0A;
  const Bytes sent = Sent([&] {
    commands_.change_id.Start();
    EXPECT_EQ(commands_.running.What(), "Giving the unit the ID 0A");
    target_.unit = 0x0B;  // does not count any more
    RunToTheEnd();
  });
  ExpectSuccess("SUCCESS: UnitID set to '0A'");
  EXPECT_EQ(unit.id(), 0x0A);
  EXPECT_EQ(unit.rejected_commands(), 0u);

  EXPECT_EQ(sent, (Bytes{0, 0xFF, 0x88, '*',  45, 0, 0,    0,                                //
                         0, 0xFF, 0x8A, 0x56, 0,  0, 0xFF, 0x0F, 0x0A, 0x0A, 0x0A, 0x38, 0,  //
                         0, 0x0A, 0x88, '+',  45, 0, 0,    0}));
  EXPECT_EQ(world_.time.ElapsedMs(), 800u) << "one step every 200 ms";
}

TEST_F(ChangeId, EveryUnit_EndsWithItsOutcome) {
  const auto run = [&](const std::string& fault, std::uint8_t id, std::uint8_t new_id, std::size_t find_polls,
                       std::size_t confirm_polls) {
    SCOPED_TRACE(fault);
    VirtualUnit& unit = world_.Attach(fault, id);
    target_.unit = new_id;
    const Bytes sent = Sent([&] { Run(commands_.change_id); });
    const auto polls = [&sent](std::uint8_t kind) {
      std::size_t count = 0;
      for (std::size_t i = 1; i < sent.size(); ++i) count += sent[i - 1] == 0x88 && sent[i] == kind ? 1 : 0;
      return count;
    };
    EXPECT_EQ(polls('*'), find_polls);
    EXPECT_EQ(polls('+'), confirm_polls);
    const std::uint8_t last_id = unit.id();
    world_.bench.Detach(1, unit);
    return last_id;
  };
  EXPECT_EQ(run("", 0xFF, 0xFF, 1, 1), 0xFF);
  ExpectSuccess("SUCCESS: UnitID set to 'FF'");
  EXPECT_EQ(run("", 0x01, 0xFD, 1, 1), 0xFD);  // any unit answers at FF
  ExpectSuccess("SUCCESS: UnitID set to 'FD'");
  EXPECT_EQ(run("restarting", 0xFF, 0x0A, 1, 6), 0x0A);  // takes it, answers late
  ExpectSuccess("SUCCESS: UnitID set to '0A'");
  run("stubborn", 0xFF, 0x0A, 1, 15);
  ExpectFailure({"Unable to change Unit ID. Please retry.", "Cannot Change Unit ID", BoxIcon::kExclamation});
  for (const char* fault : {"mute", "late"}) {
    run(fault, 0xFF, 0x0A, 15, 0);
    ExpectFailure({"Unable to locate unit to change address. Check connections and power.",
                   "Cannot Find Unit", BoxIcon::kExclamation});
  }
}

TEST_F(ChangeId, Faults_StopItAndAreShownOnce) {
  // At the start: the port cannot be opened.
  world_.bench.Unplug(1);
  commands_.change_id.Start();
  EXPECT_THAT(world_.boxes.Take(),
              testing::ElementsAre(Fault("Comm Error!", "Open of serial port 1 has failed\r\n")));
  EXPECT_FALSE(progress_.shown);
  world_.bench.Replug(1);

  // At the step that sends the new ID.
  world_.Attach("", 0xFF);
  commands_.change_id.Start();
  EXPECT_TRUE(link_.PortOpen());
  world_.log.broken = true;
  RunToTheEnd();
  EXPECT_EQ(said_, "Giving the unit the ID 01 at 14:05: COMMAND FAILED! No ID has changed.")
      << "only unlocked";
  ExpectFailure(Fault("Comm Error!", "The command log cannot be written\r\n"));
  world_.log.broken = false;
  Run(commands_.change_id);
  ExpectSuccess("SUCCESS: UnitID set to '01'");
}

}  // namespace
}  // namespace tendril::test
