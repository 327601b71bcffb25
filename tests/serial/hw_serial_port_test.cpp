#include "serial/link_fixture.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;

class HwSerialPort : public LinkFixture {};

TEST_F(HwSerialPort, Opening_HappensOnceAndAgainOnlyForOtherSettings) {
  link_.SetPortOpen(true);
  link_.SetPortOpen(true);
  EXPECT_THAT(device_.TakeActions(), ElementsAre("open 3 at 19200", "rts on"));
  EXPECT_EQ(device_.receive_threshold, 4000);

  link_.SetBaudRate(115200);
  EXPECT_THAT(device_.TakeActions(), ElementsAre("close", "open 3 at 115200", "rts on"));

  link_.SetCommPort(0);
  EXPECT_THAT(device_.TakeActions(), ElementsAre("close"));
  EXPECT_FALSE(link_.PortOpen());
  link_.SetPortOpen(true);  // no port chosen: nothing, and no failure
  EXPECT_FALSE(link_.PortOpen());
  EXPECT_THAT(device_.TakeActions(), ElementsAre());
}

TEST_F(HwSerialPort, FailedOpening_TellsPortErrorAndStep) {
  device_.open_failure = RuntimeError(kErrPortAlreadyOpen, "Another program uses it");
  const RuntimeError busy = FailureOf([&] { link_.SetPortOpen(true); });
  EXPECT_EQ(busy.number(), kErrPortAlreadyOpen);
  EXPECT_EQ(busy.description(),
            "Open of serial port 3 has failed\r\n\r\nError: (8005) Another program uses it\r\n"
            "While: Executing Port Open Property");
  EXPECT_FALSE(link_.PortOpen());
  device_.open_failure.reset();

  link_.SetBaudRate(9600);  // no speed of this link
  const RuntimeError speed = FailureOf([&] { link_.SetPortOpen(true); });
  EXPECT_EQ(speed.number(), kErrInvalidPropertyValue);
  EXPECT_THAT(speed.description(), testing::EndsWith("\r\nWhile: Setting(,N,8,1)"));

  link_.SetCommPort(-1);
  link_.SetBaudRate(1000000);
  EXPECT_THAT(FailureOf([&] { link_.SetPortOpen(true); }).description(),
              testing::EndsWith("\r\nWhile: Setting Port = -1"));
  link_.SetCommPort(3);
  link_.SetBaudRate(9600);

  // Through two levels: the open failure, then a line for each operation on the way.
  const RuntimeError command = FailureOf([&] { link_.SendUnlockCmd(5); });
  EXPECT_THAT(command.description(), testing::EndsWith("While: Setting(,N,8,1)\r\nTrace: SendUnlockCmd"));
  EXPECT_THAT(FailureOf([&] { link_.SetRTS(true); }).description(), testing::EndsWith("\r\nTrace: Let RTS"));
  EXPECT_THAT(FailureOf([&] { link_.RawOutput(u"x"); }).description(),
              testing::EndsWith("\r\nTrace: In Rawoutput"));

  link_.SetBaudRate(19200);
  link_.SetPortOpen(true);
  EXPECT_THAT(FailureOf([&] { link_.SetBaudRate(1); }).description(),
              testing::EndsWith("\r\nTrace: Let BaudRate"));
  EXPECT_FALSE(link_.PortOpen());
  EXPECT_FALSE(device_.open);

  link_.SetBaudRate(19200);
  device_.rts_failure = RuntimeError(kErrReadFault, "broken");
  EXPECT_THAT(FailureOf([&] { link_.SetPortOpen(true); }).description(),
              testing::EndsWith("\r\nWhile: Setting RTS on"));
  EXPECT_FALSE(link_.PortOpen());
  EXPECT_FALSE(device_.open);
}

TEST_F(HwSerialPort, RawOutput_SendsTextAndBytesAndIgnoresNothing) {
  link_.RawOutput(u"");
  link_.RawOutput(Bytes{});
  EXPECT_FALSE(link_.PortOpen());
  link_.RawOutput(u"ab\u20AC\u4E2D");
  link_.RawOutput(Bytes{1, 0, 2});
  EXPECT_THAT(device_.TakeWrites(), ElementsAre(Bytes{'a', 'b', 0x80, '?'}, Bytes{1, 0, 2}));
  EXPECT_EQ(link_.SentByteCount(true), 5);  // one less than its length for each
  EXPECT_EQ(link_.SentByteCount(), 0);
}

TEST_F(HwSerialPort, Properties_ClampAndMirror) {
  EXPECT_EQ(link_.PollPad(), 45);
  link_.SetPollPad(1);
  EXPECT_EQ(link_.PollPad(), 2);
  link_.SetPollPad(255);
  EXPECT_EQ(link_.PollPad(), 200);
  EXPECT_TRUE(link_.LongMsgs());
  link_.SetLongMsgs(false);
  EXPECT_TRUE(link_.ShortMsgs());
  EXPECT_TRUE(link_.NewCards());
}

TEST_F(HwSerialPort, LostDevice_DropsTheOpenFlagAndTheNextOperationOpensAgain) {
  link_.SetPortOpen(true);
  device_.open = false;
  device_.Raise(SerialEvent::kDeviceLost);
  EXPECT_FALSE(link_.PortOpen());
  link_.SendUnlockCmd(5);
  EXPECT_TRUE(link_.PortOpen());
  EXPECT_EQ(device_.TakeWrites().size(), 1u);
}

TEST(HwSerial, Destruction_ClosesThePortAndReleasesTheTimerPeriod) {
  SimulatedTime time;
  RecordingDevice device;
  MemoryLog log;
  {
    HwSerial link(device, time, time, log);
    link.SetCommPort(1);
    link.SetBaudRate(19200);
    link.SetPortOpen(true);
    EXPECT_EQ(time.OpenPeriodRequests(), 1);
    EXPECT_EQ(time.RunningTimers(), 0);
  }
  EXPECT_FALSE(device.open);
  EXPECT_EQ(time.OpenPeriodRequests(), 0);
}

}  // namespace
}  // namespace tendril::test
