#include "unitops/change_id_operation.h"

#include <vector>

#include "command_fixture.h"

namespace tendril::test {
namespace {

using testing::IsEmpty;

const BoxMessage kCannotFind{"Unable to locate unit to change address. Check connections and power.",
                             "Cannot Find Unit", BoxIcon::kExclamation};
const BoxMessage kCannotChange{"Unable to change Unit ID. Please retry.", "Cannot Change Unit ID",
                               BoxIcon::kExclamation};

// A packet that the program sent, by the bytes between its zeros, and when it began.
struct SentPacket {
  std::uint64_t ms;
  Bytes bytes;
};

class ChangeId : public CommandTest {
 protected:
  ChangeId() {
    world_.bench.Line(1).SetTap([this](const LineByte& byte) {
      if (byte.from != LineSide::kProgram) return;
      if (byte.value != 0) {
        if (packet_.empty()) packet_start_ms_ = world_.time.ElapsedMs();
        packet_.push_back(byte.value);
      } else if (!packet_.empty()) {
        sent_.push_back({packet_start_ms_, std::exchange(packet_, {})});
      }
    });
  }
  std::size_t Sent(std::uint8_t kind) const {
    return static_cast<std::size_t>(std::count_if(sent_.begin(), sent_.end(), [&](const SentPacket& packet) {
      return packet.bytes.size() == 4 && packet.bytes[1] == 0x88 && packet.bytes[2] == kind;
    }));
  }

  std::vector<SentPacket> sent_;

 private:
  Bytes packet_;
  std::uint64_t packet_start_ms_ = 0;
};

TEST_F(ChangeId, UnitFromTheFactory_IsFoundGivenItsIdAndConfirmed) {
  auto& unit = Attach("", 0xFF);
  target_.unit = 0x0A;
  commands_.change_id.Start();
  EXPECT_EQ(commands_.running.What(), "Giving the unit the ID 0A");
  RunToTheEnd();
  ExpectSuccess("SUCCESS: UnitID set to '0A'");
  EXPECT_EQ(unit.id(), 0x0A);
  EXPECT_EQ(unit.rejected_commands(), 0u);

  const std::vector<Bytes> expected{
      {0xFF, 0x88, '*', 45}, {0xFF, 0x8A, 0x56}, {0xFF, 0x0F, 0x0A, 0x0A, 0x0A, 0x38}, {0x0A, 0x88, '+', 45}};
  ASSERT_EQ(sent_.size(), expected.size());
  for (std::size_t i = 0; i < expected.size(); ++i) EXPECT_EQ(sent_[i].bytes, expected[i]) << i;
  // One step every 200 ms; a byte is heard a millisecond or two after it was written.
  for (const auto& [packet, ms] : {std::pair<std::size_t, std::uint64_t>{0, 200}, {1, 400}, {3, 600}}) {
    EXPECT_GE(sent_[packet].ms, ms);
    EXPECT_LE(sent_[packet].ms, ms + 2);
  }
  EXPECT_EQ(world_.time.ElapsedMs(), 800u);
}

TEST_F(ChangeId, EveryUnit_EndsAsStated) {
  struct Case {
    std::string unit;
    std::uint8_t id, new_id;
    std::size_t find_polls, confirm_polls;
    std::string success;  // empty: see box
    BoxMessage box;
  };
  for (const Case& c : std::vector<Case>{
           {"", 0xFF, 0x05, 1, 1, "SUCCESS: UnitID set to '05'", {}},
           {"", 0xFF, 0xFF, 1, 1, "SUCCESS: UnitID set to 'FF'", {}},
           {"", 0x01, 0xFD, 1, 1, "SUCCESS: UnitID set to 'FD'", {}},            // any unit answers at FF
           {"restarting", 0xFF, 0x0A, 1, 6, "SUCCESS: UnitID set to '0A'", {}},  // takes it, answers late
           {"deaf", 0xFF, 0x0A, 1, 2, "SUCCESS: UnitID set to '0A'", {}},
           {"stubborn", 0xFF, 0x0A, 1, 15, "", kCannotChange},
           {"mute", 0xFF, 0x0A, 15, 0, "", kCannotFind},
           {"late", 0xFF, 0x0A, 15, 0, "", kCannotFind}}) {
    SCOPED_TRACE(c.unit + " " + std::to_string(c.new_id));
    sent_.clear();
    VirtualUnit& unit = Attach(c.unit, c.id);
    target_.unit = c.new_id;
    commands_.change_id.Start();
    RunToTheEnd();
    if (c.success.empty()) {
      ExpectFailure(c.box);
    } else {
      ExpectSuccess(c.success);
      EXPECT_EQ(unit.id(), c.new_id);
    }
    EXPECT_EQ(Sent('*'), c.find_polls);
    EXPECT_EQ(Sent('+'), c.confirm_polls);
    world_.bench.Detach(1, unit);
    world_.time.Advance(1000);
  }
}

TEST_F(ChangeId, RepliesOfOtherKinds_FindNoUnit) {
  target_.unit = 0x0A;
  commands_.change_id.Start();
  world_.time.Advance(399);  // the first poll has timed out, and the next tick is about to come
  commands_.running.Operation()->OnPollReply(true, 0xFF, 'n', Bytes(10, 1));
  commands_.running.Operation()->OnPollReply(true, 0xFF, '0', Bytes{1, 10});
  RunToTheEnd();
  ExpectFailure(kCannotFind);
  EXPECT_EQ(Sent('*'), 15u);
}

TEST_F(ChangeId, IdChosenMeanwhile_DoesNotCount) {
  auto& unit = Attach("", 0xFF);
  target_.unit = 0x0A;
  commands_.change_id.Start();
  target_.unit = 0x0B;
  RunToTheEnd();
  EXPECT_EQ(unit.id(), 0x0A);
}

TEST_F(ChangeId, Faults_StopItAndAreToldOnce) {
  // At the start: the port cannot be opened.
  world_.bench.Unplug(1);
  commands_.change_id.Start();
  EXPECT_THAT(world_.boxes.Take(),
              testing::ElementsAre(Fault("Comm Error!", "Open of serial port 1 has failed\r\n")));
  EXPECT_FALSE(progress_.shown);
  world_.bench.Replug(1);

  // At the step that sends the new ID, and unplugged between two steps.
  Attach("", 0xFF);
  for (const bool unplug : {false, true}) {
    target_.unit = 0x0A;
    commands_.change_id.Start();
    EXPECT_TRUE(link_.PortOpen());
    world_.time.Advance(390);
    if (unplug) {
      world_.bench.Unplug(1);
    } else {
      world_.log.broken = true;
    }
    RunToTheEnd();
    ExpectFailure(Fault("Comm Error!", unplug ? "Open of serial port 1 has failed\r\n"
                                              : "The command log cannot be written\r\n"));
    world_.log.broken = false;
  }

  world_.bench.Replug(1);
  target_.unit = 0x0C;
  commands_.change_id.Start();
  RunToTheEnd();
  ExpectSuccess("SUCCESS: UnitID set to '0C'");
}

TEST_F(ChangeId, RefusedOrStopped_LeavesTheLineAlone) {
  target_.port_chosen = false;
  commands_.change_id.Start();
  EXPECT_EQ(world_.boxes.Take().at(0).title, "No Port Selected");
  target_.port_chosen = true;
  commands_.change_id.Start();
  commands_.Stop();  // the window closes
  world_.time.Advance(10000);
  EXPECT_THAT(sent_, IsEmpty());
  EXPECT_THAT(world_.boxes.Take(), IsEmpty());
}

}  // namespace
}  // namespace tendril::test
