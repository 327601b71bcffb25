// The session's own part: when a command ends, and why it did.
#include "ctl/unit_session.h"

#include <csignal>
#include <string>

#include "config/option_bytes.h"
#include "ctl/ctl_fixture.h"

namespace tendril::test {
namespace {

using ctl::CommandResult;

class UnitSessionTest : public CtlTest {
 protected:
  UnitSessionTest() {
    units_.Link().SetCommPort(1);
    units_.Link().SetBaudRate(19200);
    units_.Link().SetPortOpen(true);
    for (std::size_t slot = 0; slot < kPortCount; ++slot) SetFromPreset(kPresets[1], records_.At(slot));
  }

  ctl::UnitSession units_{environment_};
  ChannelTable records_;
  OptionTable held_{};
};

TEST_F(UnitSessionTest, StopRequest_EndsTheCommandAndLetsNoneBegin) {
  world_.Attach("", 0x05);
  units_.SetStepHandler([&](const std::string& step, double part) {
    if (step != "port 4 of 8" || stop_.Made()) return;
    EXPECT_EQ(part, 3 / 8.0);
    In(10, [this] { stop_.Make(SIGINT); });
  });
  CommandResult result = units_.Send(0x05, records_);
  EXPECT_EQ(result.kind, CommandResult::Kind::kCancelled);
  EXPECT_EQ(result.aftermath, "Ports 1 to 4 are written, 5 to 8 are not.");
  const std::uint32_t sent = static_cast<std::uint32_t>(units_.Link().SentByteCount());
  EXPECT_EQ(units_.Read(0x05, held_).kind, CommandResult::Kind::kCancelled);
  EXPECT_EQ(static_cast<std::uint32_t>(units_.Link().SentByteCount()), sent);
}

TEST_F(UnitSessionTest, PortThatIsBackAtOnce_IsNotOpenedAgain) {
  world_.Attach("", 0x05);
  bool unplugged = false;
  units_.SetStepHandler([&](const std::string& step, double /*part*/) {
    if ((step != "3 of 8 ports" && step != "port 3 of 8") || std::exchange(unplugged, true)) return;
    world_.bench.Unplug(1);
    In(1, [this] { world_.bench.Replug(1); });
  });
  for (const bool send : {false, true}) {
    world_.time.Advance(10);
    unplugged = false;
    units_.Link().SetCommPort(1);
    units_.Link().SetPortOpen(true);
    const CommandResult result = send ? units_.Send(0x05, records_) : units_.Read(0x05, held_);
    EXPECT_EQ(result.kind, CommandResult::Kind::kFailed);
    EXPECT_EQ(result.reason, "The port went away: plug the adapter in again.");
    EXPECT_EQ(result.aftermath, send ? "Ports 1 to 2 are written, 3 perhaps, 4 to 8 are not." : "");
    EXPECT_EQ(held_, OptionTable{});
    EXPECT_FALSE(units_.Read(0x05, held_).Done());
    EXPECT_FALSE(units_.Link().PortOpen());
  }
}

TEST_F(UnitSessionTest, NoiseOfAUnit_HasPassedBeforeTheNextOne) {
  world_.Attach("flooding", 0x05);
  world_.Attach("", 0x06);
  EXPECT_FALSE(units_.Send(0x05, records_).Done());
  EXPECT_TRUE(units_.LookFor(0x06).Done());
  EXPECT_TRUE(units_.Send(0x06, records_).Done());
}

// Does not answer its first poll.
class DrowsyUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  std::optional<Bytes> ReplyData(std::uint8_t kind) override {
    return polls_heard() == 1 ? std::nullopt : VirtualUnit::ReplyData(kind);
  }
};

TEST_F(UnitSessionTest, ReadingWithAMissedReply_IsDoneTwice) {
  auto* unit = &world_.bench.Attach<DrowsyUnit>(1, std::uint8_t{0x05});
  ASSERT_TRUE(units_.Read(0x05, held_).Done());
  EXPECT_EQ(unit->polls_heard(), 17u);
  world_.bench.Detach(1, *unit);
  unit = &world_.bench.Attach<DrowsyUnit>(1, std::uint8_t{0x05});
  units_.SetStepHandler([&](const std::string& step, double /*part*/) {
    if (step == "7 of 8 ports") unit->SetPortOptions(1, {1, 50, 250, 70, 230, 70, 230, 150, 150});
  });
  held_ = {};
  const CommandResult result = units_.Read(0x05, held_);
  EXPECT_EQ(result.reason, "Two readings of unit 05 differ: check the wiring and the adapter.");
  EXPECT_EQ(held_, OptionTable{});
}

TEST_F(UnitSessionTest, LateReplies_AreNoneOfTheNextUnit) {
  VirtualUnit& next = world_.Attach("", 0x06);
  for (int port = 1; port <= kUnitPorts; ++port)
    next.SetPortOptions(port, {1, 50, 250, 70, 230, 70, 230, 150, 150});
  for (std::uint64_t late_us = 100'000; late_us <= 160'000; late_us += 15'000) {
    auto& late =
        world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x05}, ReplyTiming{.turn_round_us = late_us});
    units_.Read(0x05, held_);
    held_ = {};
    ASSERT_TRUE(units_.Read(0x06, held_).Done());
    for (const OptionBytes& held : held_) EXPECT_EQ(held, next.PortOptions(1)) << late_us;
    world_.bench.Detach(1, late);
  }
}

}  // namespace
}  // namespace tendril::test
