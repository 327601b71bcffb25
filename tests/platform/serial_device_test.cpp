// The serial port of this system, on a pseudo-terminal that behaves like an adapter.
#include <gmock/gmock.h>
#include <sys/file.h>
#include <sys/ioctl.h>
#include <termios.h>

#include <cerrno>
#include <cstring>
#include <ctime>
#include <numeric>

#include "platform/posix/serial_terminal.h"
#include "platform/pseudo_terminal.h"
#include "platform/qt/qt_serial_device.h"
#include "platform/wait_for.h"
#include "support/emulated_adapter.h"
#include "support/failure_of.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr int kComm = 3;

Bytes EveryByteValue() {
  Bytes bytes(256);
  std::iota(bytes.begin(), bytes.end(), std::uint8_t{0});
  return bytes;
}

class SerialDeviceTest : public testing::Test {
 protected:
  SerialDeviceTest() {
    LinkPort(kComm, line_.path());
    device_->SetEventHandler([this](SerialEvent event) {
      EXPECT_FALSE(inside_call_) << "the owner was called from inside its own call";
      events_.push_back(event);
    });
    Adapter() = {};
    Adapter().empty_read_every = 3;
  }

  void Open(std::int32_t receive_threshold = 1) {
    device_->SetReceiveThreshold(receive_threshold);
    device_->Open(kComm, 19200);
  }
  // The number of the failure of opening; 0 when it does not fail.
  std::int32_t FailureOfOpening(std::int32_t number = kComm) {
    return FailureOf([&] { device_->Open(number, 19200); }).number();
  }
  // What the device has sent, once it is `count` bytes.
  Bytes TakeFromLine(std::size_t count) {
    Bytes all;
    EXPECT_TRUE(WaitFor([&] {
      const Bytes more = line_.Take();
      all.insert(all.end(), more.begin(), more.end());
      return all.size() >= count;
    }));
    return all;
  }

  PseudoTerminal line_;
  std::vector<std::string> faults_;
  std::vector<std::string> trace_;
  std::unique_ptr<SerialDevice> device_ =
      std::make_unique<QtSerialDevice>([this](const std::string& fault) { faults_.push_back(fault); },
                                       [this](const std::string& line) { trace_.push_back(line); });
  std::vector<SerialEvent> events_;
  bool inside_call_ = false;
};

TEST_F(SerialDeviceTest, Opening_SetsTheLineUpAndClosingRestoresIt) {
  const int other = line_.OpenAsAnother();
  const auto local_flags = [&] {
    termios settings = {};
    ::tcgetattr(other, &settings);
    return settings.c_lflag;
  };
  const auto exclusive = [&] {
    int mode = 0;
    ::ioctl(other, TIOCGEXCL, &mode);
    return mode != 0;
  };
  const tcflag_t before = local_flags();
  for (const std::uint32_t baud : {19200u, 56000u, 1000000u}) {
    Adapter() = {};
    device_->Open(kComm, static_cast<std::int32_t>(baud));
    EXPECT_EQ(LineSpeed(other), baud);
    EXPECT_THAT(Adapter().settings, ElementsAre(EmulatedAdapter::LineSettings{.baud = baud}));
    EXPECT_TRUE(Adapter().low_latency);
    EXPECT_TRUE(exclusive());
    device_->Close();
    EXPECT_THAT(Adapter().flushes, ElementsAre(TCIOFLUSH, TCIOFLUSH)) << "at opening and at closing";
    EXPECT_EQ(local_flags(), before);
    EXPECT_FALSE(exclusive());
    EXPECT_EQ(::flock(other, LOCK_EX | LOCK_NB), 0) << "closing releases the lock";
    ::flock(other, LOCK_UN);
  }
  ::close(other);
  Adapter().fixed_baud = 115200;
  for (const std::int32_t baud : {19200, 1000000}) {
    const RuntimeError refused = FailureOf([&] { device_->Open(kComm, baud); });
    EXPECT_EQ(refused.number(), kErrSettingsRefused);
    EXPECT_THAT(refused.description(), HasSubstr("the nearest that it does is 115200"));
  }
}

TEST_F(SerialDeviceTest, EveryByteValue_PassesUnchangedBothWays) {
  Open();
  device_->SetRts(true);
  device_->Write(EveryByteValue());
  device_->SetRts(false);
  EXPECT_THAT(Adapter().rts, ElementsAre(true, false));
  EXPECT_EQ(TakeFromLine(256), EveryByteValue());
  EXPECT_TRUE(line_.SendAndSettle(EveryByteValue()));
  EXPECT_EQ(device_->ReadAll(), EveryByteValue());
  EXPECT_THAT(trace_, IsEmpty());
}

TEST_F(SerialDeviceTest, RtsThatFails_IsRaisedAndAMissingLineIsNot) {
  for (const int error : {ENOTTY, EINVAL, EPROTO, EIO}) {
    trace_.clear();
    Open();
    Adapter().rts_error = [error](bool) { return error; };
    const bool missing = error == ENOTTY || error == EINVAL;
    for (const bool asserted : {true, false}) {
      const RuntimeError fault = FailureOf([&] { device_->SetRts(asserted); });
      EXPECT_EQ(fault.number(), missing ? 0 : kErrDeviceIo) << error;
      EXPECT_THAT(fault.description(), HasSubstr(missing ? "none" : std::strerror(error)));
    }
    EXPECT_EQ(trace_.size(), 1u) << "once each opening: " << error;
    EXPECT_TRUE(line_.SendAndSettle({7}));
    RunFor(20);
    EXPECT_THAT(device_->ReadAll(), ElementsAre(7)) << "the port does not work any more";
    device_->Close();
  }
  EXPECT_THAT(events_, testing::Each(SerialEvent::kDataReceived)) << "a failure of RTS is no loss";
}

TEST_F(SerialDeviceTest, ReceiveThreshold_SaysHowManyBytesBringAnEvent) {
  Open(3);
  line_.Send({0, 0});
  RunFor(30);
  EXPECT_THAT(events_, IsEmpty());
  line_.Send({0});
  EXPECT_TRUE(WaitFor([&] { return events_.size() == 1; }));
  device_->SetReceiveThreshold(0);
  line_.Send({1, 2, 3, 4});
  RunFor(50);
  device_->SetReceiveThreshold(4);  // enough waits already
  EXPECT_TRUE(WaitFor([&] { return events_.size() > 1; }));
  EXPECT_THAT(events_, ElementsAre(SerialEvent::kDataReceived, SerialEvent::kDataReceived));
  EXPECT_EQ(FailureOf([&] { device_->SetReceiveThreshold(-1); }).number(), kErrInvalidPropertyValue);
}

TEST_F(SerialDeviceTest, ReadAllAndClearInput_ReachWhatTheEventLoopHasNotSeen) {
  Adapter().empty_read_every = 0;
  Open();
  ASSERT_TRUE(line_.SendAndSettle({0xFE, 0x0A, 0x00}));
  EXPECT_THAT(device_->ReadAll(), ElementsAre(0xFE, 0x0A, 0x00));
  line_.Send({4, 5});
  device_->SetReceiveThreshold(0);
  RunFor(20);  // the event loop has seen these
  device_->SetReceiveThreshold(1);
  ASSERT_TRUE(line_.SendAndSettle({1, 2, 3}));
  device_->ClearInput();
  EXPECT_THAT(device_->ReadAll(), IsEmpty());
  RunFor(20);
  EXPECT_THAT(events_, IsEmpty()) << "an event came for bytes that were gone";
}

TEST_F(SerialDeviceTest, Flood_FillsTheBufferAndNoMore) {
  Open(0);
  std::size_t taken = 0;
  EXPECT_TRUE(WaitFor([&] { return (taken += line_.Send(EveryByteValue())) > 100'000; }));
  EXPECT_TRUE(WaitFor([&] { return !events_.empty(); }));
  EXPECT_THAT(events_, testing::Each(SerialEvent::kReceiveOverflow));
  const Bytes input = device_->ReadAll();
  EXPECT_EQ(input.size(), kSerialInputBufferBytes);
  EXPECT_TRUE(std::equal(input.begin(), input.begin() + 256, EveryByteValue().begin()));

  device_->ClearInput();
  Adapter().empty_read_every = 0;
  RunFor(20);
  events_.clear();
  ASSERT_TRUE(line_.SendAndSettle(Bytes(3000, 1)));
  RunFor(20);  // into the buffer
  ASSERT_TRUE(line_.SendAndSettle(Bytes(3000, 2)));
  EXPECT_EQ(device_->ReadAll().size(), kSerialInputBufferBytes);
  EXPECT_EQ(device_->ReadAll().size(), 6000 - kSerialInputBufferBytes) << "the rest waits in the system";
  RunFor(20);
  EXPECT_THAT(events_, IsEmpty());
}

TEST_F(SerialDeviceTest, FarEndThatTakesNothing_GetsAllInOrderLater) {
  Open();
  std::size_t written = 0;
  std::int32_t failure = 0;
  const std::clock_t cpu_before = std::clock();
  for (; failure == 0; written += failure == 0 ? 256 : 0) {
    failure = FailureOf([&] { device_->Write(EveryByteValue()); }).number();
    ASSERT_LT(written, 1'000'000u) << "no bound";
  }
  EXPECT_EQ(failure, kErrDeviceIo);
  EXPECT_GE(device_->PendingOutput(), 65'000u);
  RunFor(100);
  EXPECT_LT(std::clock() - cpu_before, CLOCKS_PER_SEC / 20) << "waiting takes no CPU";
  const Bytes arrived = TakeFromLine(written);
  for (std::size_t at = 0; at < arrived.size(); ++at) ASSERT_EQ(arrived[at], at % 256);
  EXPECT_EQ(device_->PendingOutput(), 0u);
  Adapter().queued_output = 17;
  EXPECT_EQ(device_->PendingOutput(), 17u) << "in the driver";
  const std::clock_t drained = std::clock();
  RunFor(200);
  EXPECT_LT(std::clock() - drained, CLOCKS_PER_SEC / 10) << "nor does an empty queue";
}

TEST_F(SerialDeviceTest, WriteThatFails_IsRaisedAndIsNoLoss) {
  Open();
  Adapter().write_error = EIO;
  const RuntimeError fault = FailureOf([&] { device_->Write(Bytes{1, 2}); });
  EXPECT_EQ(fault.number(), kErrDeviceIo);
  EXPECT_THAT(fault.description(), HasSubstr("Input/output error"));
  Adapter().write_error = 0;
  device_->Write(Bytes{3});
  EXPECT_EQ(TakeFromLine(1), Bytes{3}) << "a rest of the packet that failed";
  EXPECT_THAT(events_, IsEmpty());
}

TEST_F(SerialDeviceTest, Unplugged_IsReportedOnceQuietlyAndThePortOpensAgain) {
  for (const bool sending : {false, true}) {
    SCOPED_TRACE(sending);
    PseudoTerminal line;
    LinkPort(kComm, line.path());
    events_.clear();
    Open(2);
    EXPECT_TRUE(line.SendAndSettle({7}));
    RunFor(20);
    EXPECT_THAT(device_->ReadAll(), ElementsAre(7)) << "the port does not work";

    if (sending) device_->Write(Bytes(50'000, 0x55));
    line.Unplug();
    inside_call_ = true;
    for (int i = 0; sending && i < 2; ++i) {
      device_->Write(EveryByteValue());
      device_->SetRts(i == 0);
      device_->ReadAll();
      device_->ClearInput();
      device_->PendingOutput();
    }
    inside_call_ = false;
    EXPECT_TRUE(WaitFor([&] { return !events_.empty(); }, 500)) << "by the slow check only";
    const std::clock_t cpu_before = std::clock();
    RunFor(1200);  // past the check for dead devices
    EXPECT_LT(std::clock() - cpu_before, CLOCKS_PER_SEC / 5);
    EXPECT_THAT(events_, ElementsAre(SerialEvent::kDeviceLost));
    EXPECT_EQ(FailureOf([&] { device_->Write(Bytes{1}); }).number(), kErrPortNotOpen);
  }
}

TEST_F(SerialDeviceTest, DeviceThatGoesUnreported_IsNoticedWithinASecond) {
  Open();
  Adapter().gone_silently = true;
  EXPECT_TRUE(WaitFor([&] { return !events_.empty(); }, 1500));
  EXPECT_THAT(events_, ElementsAre(SerialEvent::kDeviceLost));
}

TEST_F(SerialDeviceTest, PortInUse_IsBusy) {
  const int other = line_.OpenAsAnother();
  ::flock(other, LOCK_EX);
  EXPECT_EQ(FailureOfOpening(), kErrPortAlreadyOpen);
  ::close(other);
  EXPECT_EQ(FailureOfOpening(), 0);
  EXPECT_EQ(FailureOfOpening(), kErrPortAlreadyOpen) << "by itself";
}

TEST_F(SerialDeviceTest, NothingBehindThePort_IsNoSuchDevice) {
  LinkPort(1, "/dev/pts/none");
  LinkPort(33, "/dev/null");
  EXPECT_TRUE(device_->Exists(kComm));
  EXPECT_EQ(device_->Describe(kComm).Text(), line_.path());
  EXPECT_FALSE(device_->Exists(1)) << "a link whose device is gone hides the built-in port";
  EXPECT_FALSE(device_->Exists(30));
  for (const int number : {1, 30, 33}) EXPECT_EQ(FailureOfOpening(number), kErrInvalidPort) << number;
}

TEST_F(SerialDeviceTest, EventHandler_MayDestroyTheDeviceAndFail) {
  device_->SetEventHandler([&](SerialEvent) {
    device_.reset();
    throw RuntimeError(kErrInternal, "parser broke");
  });
  Open();
  line_.Send({1});
  EXPECT_TRUE(WaitFor([&] { return !faults_.empty(); }));
  EXPECT_THAT(faults_, ElementsAre("parser broke"));
}

// A burst of changes is one report.
TEST_F(SerialDeviceTest, WatchedPorts_AreReportedWhenOneComes) {
  int reports = 0;
  bool there = false;
  device_->WatchPorts([&] {
    ++reports;
    there = device_->Exists(8);
  });
  for (const int number : {6, 7, 8}) LinkPort(number, line_.path());
  EXPECT_TRUE(WaitFor([&] { return reports > 0; }));
  RunFor(100);
  EXPECT_EQ(reports, 1);
  EXPECT_TRUE(there);
}

}  // namespace
}  // namespace tendril::test
