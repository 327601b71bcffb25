#include <array>

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

  link_.cmdSetAddress(5, 7, true);
  EXPECT_THAT(device_.TakeWrites(),
              ElementsAre(kUnlock5, Bytes{0, 5, 0x0F, 7, 7, 7, 0x41, 0}, Bytes{0, 7, 0x88, 2, 45, 0}));
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
}

TEST_F(HwSerialCommands, Failures_CarryTheirTraceLines) {
  EXPECT_THAT(FailureOf([&] { link_.cmdFade(5, 1, 0, 0, 100); }).description(), EndsWith("\r\nTrace: Fade"));
  EXPECT_THAT(FailureOf([&] { link_.cmdSetTwinkleSpecial(1, 1, 1, 1, 1); }).description(),
              EndsWith("not supported\r\nTrace: SetTwinkleSpecial"));
  EXPECT_EQ(FailureOf([&] { link_.cmdSetShimmerSpecial(1, 1, 1, 1, 1); }).number(), kErrUnsupported);
  EXPECT_EQ(FailureOf([&] { link_.FlushCB(); }).number(), kErrUnsupported);

  device_.write_failure = RuntimeError(kErrReadFault, "broken");
  EXPECT_EQ(FailureOf([&] { link_.cmdSetAddress(5, 7, false); }).description(),
            "broken\r\nTrace: SendCommand\r\nTrace: SendUnlockCmd\r\nTrace: SetAddress");
  EXPECT_EQ(FailureOf([&] { link_.cmdSetManyOptions(5, 0, 1, 1, 1, 1, 1, {}); }).description(),
            "broken\r\nTrace: SendCommand\r\nTrace: SendUnlockCmd\r\nTrace: Fade");
  EXPECT_EQ(FailureOf([&] { link_.CmdSetDMXIntensity(5, 1, 0); }).description(),
            "broken\r\nTrace: SendCommand\r\nTrace: SetIntensity\r\nTrace: SetIntensity");
  EXPECT_THAT(FailureOf([&] { link_.cmdSetoption(5, 0, 1, 1, 1, 1, 1); }).description(),
              EndsWith("\r\nTrace: Fade"));
  EXPECT_THAT(FailureOf([&] { link_.cmdSetTwinkle(5, 1); }).description(), EndsWith("\r\nTrace: SetTwinkle"));
  EXPECT_THAT(FailureOf([&] { link_.cmdSetShimmer(5, 1); }).description(), EndsWith("\r\nTrace: SetShimmer"));
}

TEST_F(HwSerialCommands, WithoutAPort_CommandsSendNothingAndDoNotFail) {
  link_.SetCommPort(0);
  link_.cmdSetTwinkle(5, 1);
  link_.SendUnlockCmd(5);
  EXPECT_THAT(device_.TakeWrites(), IsEmpty());
}

TEST_F(HwSerialCommands, FaultOfAnotherType_BecomesOneWithATrace) {
  log_.on_append = [] { throw 7; };
  const RuntimeError error = FailureOf([&] { link_.SendUnlockCmd(5); });
  EXPECT_EQ(error.number(), kErrInternal);
  EXPECT_EQ(error.description(), "Unknown error\r\nTrace: SendCommand\r\nTrace: SendUnlockCmd");
}

TEST_F(HwSerialCommands, UnitWideCommands_AreLoggedAfterTheyWentOut) {
  link_.cmdSetAddress(5, 7, false);
  EXPECT_THAT(log_.lines, ElementsAre("Command-0-5-8A-56-0", "Command-0-5-F-7-7-7-41-0"));
  device_.TakeWrites();
  log_.broken = true;
  EXPECT_THAT(FailureOf([&] { link_.SendUnlockCmd(5); }).description(),
              EndsWith("Trace: SendCommand\r\nTrace: SendUnlockCmd"));
  EXPECT_THAT(device_.TakeWrites(), ElementsAre(kUnlock5));
}

TEST_F(HwSerialCommands, Buffering_KeepsTheNewestLightCommandOfACircuit) {
  link_.SetCommandBuffering(true);
  link_.cmdSetIntensity(5, 17, 50);
  link_.cmdFade(5, 17, 1, 0, 100);
  link_.cmdSetIntensity(5, 100, 25);
  EXPECT_THAT(device_.TakeWrites(), IsEmpty());
  ASSERT_NE(link_.Buffer().Find(5, 17), nullptr);
  EXPECT_EQ(link_.Buffer().Find(5, 17)->code, 4);
  EXPECT_EQ(link_.Buffer().Find(5, 17)->intensity, 255);
  EXPECT_TRUE(link_.Buffer().Find(5, 100)->two_byte_circuit);
  EXPECT_EQ(link_.Buffer().Find(5, 100)->intensity, 25);

  for (const int without_entry : {-1, 18, 900}) {
    link_.cmdSetoption(5, static_cast<std::int16_t>(without_entry), 1, 2, 3, 4, 5);
  }
  EXPECT_NE(link_.Buffer().Find(5, 17), nullptr);
  EXPECT_EQ(link_.Buffer().Find(5, -1), nullptr);
  device_.TakeWrites();
  link_.cmdSetoption(5, 17, 1, 2, 3, 4, 5);  // another code: clears the circuit's entry and goes out
  EXPECT_EQ(link_.Buffer().Find(5, 17), nullptr);
  EXPECT_NE(link_.Buffer().Find(5, 100), nullptr);
  EXPECT_EQ(device_.TakeWrites().size(), 2u);

  link_.cmdSetIntensity(5, 1024, 50);  // no light circuit: at once, and noted
  EXPECT_EQ(device_.TakeWrites().size(), 1u);
  EXPECT_EQ(log_.lines.back(), "Command-0-5-3-80-C0-90-0");
}

TEST_F(HwSerialCommands, FullSlotTable_DropsOnlyCommandsThatNeedANewSlot) {
  link_.SetCommandBuffering(true);
  for (int unit = 1; unit <= 16; ++unit) {
    for (int block = 0; block < 64; ++block) {
      link_.cmdSetIntensity(static_cast<std::uint8_t>(unit), static_cast<std::int16_t>(block * 16), 50);
    }
  }
  link_.cmdSetIntensity(17, 0, 50);
  EXPECT_EQ(link_.Buffer().Find(17, 0), nullptr);
  link_.cmdSetIntensity(16, 1008 + 15, 50);
  EXPECT_NE(link_.Buffer().Find(16, 1023), nullptr);
  EXPECT_THAT(device_.TakeWrites(), IsEmpty());
}

TEST_F(HwSerialCommands, BlockCollection_GathersInsteadOfSending) {
  link_.SetBlockCollection(true);
  link_.SendUnlockCmd(5);
  link_.cmdSetTwinkle(5, 1);
  EXPECT_THAT(device_.TakeWrites(), IsEmpty());
  EXPECT_EQ(link_.TakeBlock(), (Bytes{0, 5, 0x8A, 0x56, 0, 0, 5, 6, 0x81, 0}));
  EXPECT_EQ(link_.SentByteCount(), 8);
}

TEST_F(HwSerialCommands, Heartbeat_GoesOutWhileOnAndWhileThePortIsOpen) {
  link_.SetHeartBeat(true);
  time_.Advance(1000);
  EXPECT_FALSE(link_.PortOpen());
  link_.SetPortOpen(true);
  time_.Advance(1000);
  EXPECT_THAT(device_.TakeWrites(),
              ElementsAre(Bytes{0, 0xFF, 0x81, 0x56, 0}, Bytes{0, 0xFF, 0x81, 0x56, 0}));
  device_.write_failure = RuntimeError(kErrReadFault, "broken");
  EXPECT_NO_THROW(time_.Advance(500));
}

}  // namespace
}  // namespace tendril::test
