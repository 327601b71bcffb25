#include <array>
#include <utility>

#include "serial/link_fixture.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::EndsWith;
using testing::IsEmpty;

class HwSerialCommands : public LinkFixture {};

const Bytes kUnlock5{0, 5, 0x8A, 0x56, 0};

TEST_F(HwSerialCommands, ConfigurationCommands_FollowAnUnlock) {
  link_.cmdSetoption(5, 0, 17, 137, 1, 150, 255);
  EXPECT_THAT(device_.TakeWrites(), ElementsAre(kUnlock5, Bytes{0, 5, 0x0A, 17, 137, 1, 150, 255, 0x26, 0}));

  link_.cmdSetManyOptions(5, 0, 17, 1, 1, 60, 240, std::array<std::uint8_t, 4>{3, 4, 0, 9});
  EXPECT_THAT(device_.TakeWrites(),
              ElementsAre(kUnlock5, Bytes{0, 5, 0x0A, 17, 1, 1, 60, 240, 3, 4, 0x10, 0}));
  EXPECT_THAT(log_.lines, ElementsAre("Command-0-5-8A-56-0", "Command-0-5-8A-56-0"));

  link_.cmdSetAddress(5, 7, true);
  EXPECT_THAT(device_.TakeWrites(),
              ElementsAre(kUnlock5, Bytes{0, 5, 0x0F, 7, 7, 7, 0x41, 0}, Bytes{0, 7, 0x88, 2, 45, 0}));
  EXPECT_EQ(log_.lines.back(), "Command-0-5-F-7-7-7-41-0");
  EXPECT_THROW(link_.cmdSetManyOptions(5, 0, 1, 1, 1, 1, 1, Bytes(26, 1)), RuntimeError);
}

TEST_F(HwSerialCommands, LightCommands_GoOutAtOnceWhileBufferingIsOff) {
  link_.cmdSetIntensity(5, 1, 50);
  link_.CmdSetDMXIntensity(5, 1, 0);
  link_.CmdSetDMXIntensity(5, 1, 9);
  link_.cmdSetTwinkle(5, 70);
  link_.cmdSetShimmer(5, 2);
  link_.cmdFade(5, 1, 1, 0, 100);
  EXPECT_THAT(device_.TakeWrites(),
              ElementsAre(Bytes{0, 5, 3, 0x80, 0x81, 0}, Bytes{0, 5, 3, 0xF0, 0x81, 0},
                          Bytes{0, 5, 8, 9, 0x81, 0}, Bytes{0, 5, 6, 0xC6, 0x81, 0}, Bytes{0, 5, 7, 0x82, 0},
                          Bytes{0, 5, 4, 0xF0, 0x01, 0x13, 0xEB, 0x81, 0}));
  EXPECT_THAT(log_.lines, IsEmpty());
  link_.SetCommPort(0);  // without a port: nothing, and no failure
  link_.cmdSetTwinkle(5, 1);
  link_.SetBlockCollection(true);
  link_.cmdSetTwinkle(5, 1);
  link_.cmdSetShimmer(5, 1);
  EXPECT_THAT(device_.TakeWrites(), IsEmpty());
  EXPECT_EQ(link_.TakeBlock(), (Bytes{0, 5, 6, 0x81, 0, 0, 5, 7, 0x81, 0}));
}

TEST_F(HwSerialCommands, Failures_CarryTheirTraceLines) {
  const auto failure = [&](const std::function<void()>& command) { return FailureOf(command).description(); };
  EXPECT_THAT(failure([&] { link_.cmdFade(5, 1, 0, 0, 100); }), EndsWith("\r\nTrace: Fade"));
  EXPECT_THAT(failure([&] { link_.cmdSetShimmerSpecial(1, 1, 1, 1, 1); }),
              EndsWith("not supported\r\nTrace: SetShimmerSpecial"));
  EXPECT_EQ(FailureOf([&] { link_.FlushCB(); }).number(), kErrUnsupported);

  device_.write_failure = RuntimeError(kErrReadFault, "broken");
  const std::string unlock = "broken\r\nTrace: SendCommand\r\nTrace: SendUnlockCmd";
  EXPECT_EQ(failure([&] { link_.cmdSetAddress(5, 7, false); }), unlock + "\r\nTrace: SetAddress");
  EXPECT_EQ(failure([&] { link_.cmdSetManyOptions(5, 0, 1, 1, 1, 1, 1, {}); }), unlock + "\r\nTrace: Fade");
  EXPECT_EQ(failure([&] { link_.CmdSetDMXIntensity(5, 1, 0); }),
            "broken\r\nTrace: SendCommand\r\nTrace: SetIntensity\r\nTrace: SetIntensity");
  device_.write_failure.reset();

  // The command log fails after the packet went out; a fault of another type becomes one with a trace.
  log_.on_append = [] { throw 7; };
  EXPECT_EQ(failure([&] { link_.SendUnlockCmd(5); }),
            "Unknown error\r\nTrace: SendCommand\r\nTrace: SendUnlockCmd");
  EXPECT_THAT(device_.TakeWrites(), ElementsAre(kUnlock5));
}

TEST_F(HwSerialCommands, Buffering_KeepsTheNewestLightCommandOfACircuit) {
  link_.SetCommandBuffering(true);
  link_.cmdSetIntensity(5, 17, 50);
  link_.cmdFade(5, 17, 1, 0, 100);
  link_.cmdSetIntensity(5, 100, 25);
  EXPECT_THAT(device_.TakeWrites(), IsEmpty());
  const auto& slots = link_.Buffer().Slots();
  EXPECT_EQ(slots.at({5, 1}).at(17).code, 4);
  EXPECT_EQ(slots.at({5, 1}).at(17).intensity, 255);
  EXPECT_EQ(slots.at({5, 6}).at(100).intensity, 25);
  EXPECT_FALSE(slots.at({5, 1}).at(17).two_byte_circuit);
  EXPECT_TRUE(slots.at({5, 6}).at(100).two_byte_circuit);

  // Another code clears the circuit's entry, if it has one, and goes out.
  for (const int circuit : {-1, 18, 900, 17}) {
    EXPECT_EQ(slots.at({5, 1}).count(17), 1u);
    link_.cmdSetoption(5, static_cast<std::int16_t>(circuit), 1, 2, 3, 4, 5);
  }
  EXPECT_EQ(slots.at({5, 1}).count(17), 0u);
  EXPECT_EQ(device_.TakeWrites().size(), 8u);

  link_.cmdSetIntensity(5, 1024, 50);  // no light circuit: at once, and noted
  EXPECT_EQ(device_.TakeWrites().size(), 1u);
  EXPECT_EQ(log_.lines.back(), "Command-0-5-3-80-C0-90-0");

  // A full slot table drops only what needs a new slot.
  for (int unit = 1; unit <= 17; ++unit) {
    for (std::int16_t circuit = 0; circuit < 1024; circuit += 16) {
      link_.cmdSetIntensity(static_cast<std::uint8_t>(unit), circuit, 50);
    }
  }
  EXPECT_EQ(slots.size(), 1024u);
  link_.cmdSetIntensity(16, 1023, 50);
  EXPECT_EQ(slots.at({16, 63}).count(1023), 1u);
  EXPECT_THAT(device_.TakeWrites(), IsEmpty());
}

TEST_F(HwSerialCommands, Heartbeat_GoesOutWhileOnAndWhileThePortIsOpen) {
  link_.SetHeartBeat(true);
  time_.Advance(1000);
  EXPECT_FALSE(link_.PortOpen());
  link_.SetPortOpen(true);
  time_.Advance(500);
  EXPECT_THAT(device_.TakeWrites(), ElementsAre(Bytes{0, 0xFF, 0x81, 0x56, 0}));
  device_.write_failure = RuntimeError(kErrReadFault, "broken");
  EXPECT_NO_THROW(time_.Advance(500));
}

}  // namespace
}  // namespace tendril::test
