#include "serial/link_fixture.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::EndsWith;

class HwSerialPort : public LinkFixture {};

TEST_F(HwSerialPort, Opening_HappensOnceAndAgainOnlyForOtherSettings) {
  link_.SetPortOpen(true);
  link_.SetPortOpen(true);
  EXPECT_THAT(device_.TakeActions(), ElementsAre("open 3 at 19200", "rts on"));
  EXPECT_EQ(device_.receive_threshold, 4000);

  link_.SetBaudRate(115200);
  EXPECT_THAT(device_.TakeActions(), ElementsAre("close", "open 3 at 115200", "rts on"));

  device_.open = false;
  device_.Raise(SerialEvent::kDeviceLost);
  EXPECT_FALSE(link_.PortOpen());
  link_.SendUnlockCmd(5);
  EXPECT_THAT(device_.TakeActions(), ElementsAre("open 3 at 115200", "rts on"));

  link_.SetCommPort(0);
  EXPECT_THAT(device_.TakeActions(), ElementsAre("close"));
  link_.SetPortOpen(true);  // no port chosen: nothing, and no failure
  EXPECT_FALSE(link_.PortOpen());
}

TEST_F(HwSerialPort, FailedOpening_DescribesPortErrorAndStep) {
  const auto failure = [&] { return FailureOf([&] { link_.SetPortOpen(true); }).description(); };
  device_.open_failure = RuntimeError(kErrPortAlreadyOpen, "Another program uses it");
  EXPECT_EQ(failure(),
            "Open of serial port 3 has failed\r\n\r\nError: (8005) Another program uses it\r\n"
            "While: Executing Port Open Property");
  device_.open_failure.reset();

  device_.rts_failure = RuntimeError(kErrReadFault, "broken");
  EXPECT_THAT(failure(), EndsWith("\r\nWhile: Setting RTS on"));
  EXPECT_FALSE(device_.open);
  device_.rts_failure.reset();

  link_.SetCommPort(-1);
  EXPECT_THAT(failure(), EndsWith("\r\nWhile: Setting Port = -1"));
  link_.SetCommPort(3);

  link_.SetPortOpen(true);
  // No speed of this link. Each operation on the way adds its line.
  EXPECT_THAT(FailureOf([&] { link_.SetBaudRate(9600); }).description(),
              EndsWith("(380) Invalid property value\r\nWhile: Setting(,N,8,1)\r\nTrace: Let BaudRate"));
  EXPECT_FALSE(link_.PortOpen());
  EXPECT_THAT(FailureOf([&] { link_.SendUnlockCmd(5); }).description(),
              EndsWith("While: Setting(,N,8,1)\r\nTrace: SendUnlockCmd"));
  EXPECT_THAT(FailureOf([&] { link_.SetRTS(true); }).description(), EndsWith("\r\nTrace: Let RTS"));
  EXPECT_THAT(FailureOf([&] { link_.RawOutput(u"x"); }).description(), EndsWith("\r\nTrace: In Rawoutput"));
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

TEST_F(HwSerialPort, Destruction_ClosesThePortAndReleasesTheTimerPeriod) {
  {
    HwSerial link(device_, time_, time_, log_);
    link.SetCommPort(1);
    link.SetBaudRate(19200);
    link.SetPortOpen(true);
    EXPECT_EQ(time_.OpenPeriodRequests(), 2);
  }
  EXPECT_FALSE(device_.open);
  EXPECT_EQ(time_.OpenPeriodRequests(), 1);
}

}  // namespace
}  // namespace tendril::test
