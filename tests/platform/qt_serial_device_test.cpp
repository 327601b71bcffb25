#include "platform/qt/qt_serial_device.h"

#include <gmock/gmock.h>
#include <sys/file.h>

#include <ctime>
#include <numeric>

#include "platform/pseudo_terminal.h"
#include "platform/runtime_error.h"
#include "platform/wait_for.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr int kComm = 3;

Bytes EveryByteValue() {
  Bytes bytes(256);
  std::iota(bytes.begin(), bytes.end(), std::uint8_t{0});
  return bytes;
}

class QtSerialDeviceTest : public testing::Test {
 protected:
  QtSerialDeviceTest() {
    LinkPort(kComm, line_.path());
    device_->SetSettings("19200,N,8,1");
    device_->SetPortNumber(kComm);
    device_->SetEventHandler([this](SerialEvent event) {
      EXPECT_FALSE(inside_call_) << "the owner was called from inside its own call";
      events_.push_back(event);
    });
  }

  void Open(std::int32_t receive_threshold = 1) {
    device_->Open();
    device_->SetReceiveThreshold(receive_threshold);
  }
  // The number of the failure that opening ends in; 0 when it does not fail.
  std::int32_t FailureOfOpening() {
    try {
      device_->Open();
      return 0;
    } catch (const RuntimeError& error) {
      return error.number();
    }
  }

  PseudoTerminal line_;
  std::vector<std::string> faults_;
  std::vector<std::string> trace_;
  std::unique_ptr<QtSerialDevice> device_ =
      std::make_unique<QtSerialDevice>([this](const std::string& fault) { faults_.push_back(fault); },
                                       [this](const std::string& line) { trace_.push_back(line); });
  std::vector<SerialEvent> events_;
  bool inside_call_ = false;
};

TEST_F(QtSerialDeviceTest, EveryByteValue_PassesUnchangedBothWaysWithoutRts) {
  Open();
  device_->SetRts(true);  // a pseudo-terminal has no such line
  device_->Write(EveryByteValue());
  device_->SetRts(false);
  Bytes sent;
  EXPECT_TRUE(WaitFor([&] {
    const Bytes more = line_.Take();
    sent.insert(sent.end(), more.begin(), more.end());
    return sent.size() >= 256;
  }));
  EXPECT_EQ(sent, EveryByteValue());

  EXPECT_TRUE(line_.SendAndSettle(EveryByteValue()));
  EXPECT_EQ(device_->ReadAll(), EveryByteValue());
  EXPECT_EQ(trace_.size(), 1u) << "the missing line is noted once";
}

TEST_F(QtSerialDeviceTest, ReceiveThreshold_SaysHowManyBytesBringAnEvent) {
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
}

TEST_F(QtSerialDeviceTest, ReadAllAndClearInput_ReachWhatTheEventLoopHasNotSeen) {
  Open();
  ASSERT_TRUE(line_.SendAndSettle({0xFE, 0x0A, 0x00}));
  EXPECT_THAT(device_->ReadAll(), ElementsAre(0xFE, 0x0A, 0x00));
  ASSERT_TRUE(line_.SendAndSettle({1, 2, 3}));
  device_->ClearInput();
  EXPECT_THAT(device_->ReadAll(), IsEmpty());
  RunFor(20);
  EXPECT_THAT(events_, IsEmpty()) << "an event came for bytes that were gone";
}

TEST_F(QtSerialDeviceTest, Flood_FillsTheBufferAndNoMore) {
  device_->SetLineOptions({.input_buffer_size = 200});
  device_->Open();
  std::size_t taken = 0;
  EXPECT_TRUE(WaitFor([&] { return (taken += line_.Send(EveryByteValue())) > 100'000; }));
  EXPECT_TRUE(WaitFor([&] { return !events_.empty(); }));
  EXPECT_THAT(events_, testing::Each(SerialEvent::kReceiveOverflow));
  const Bytes all = EveryByteValue();
  EXPECT_EQ(device_->ReadAll(), Bytes(all.begin(), all.begin() + 200));
}

TEST_F(QtSerialDeviceTest, Unplugged_IsToldOnceQuietlyAndThePortOpensAgain) {
  for (const bool sending : {false, true}) {
    SCOPED_TRACE(sending);
    PseudoTerminal line;
    LinkPort(kComm, line.path());
    events_.clear();
    Open();
    EXPECT_TRUE(line.SendAndSettle({7}));
    EXPECT_THAT(device_->ReadAll(), ElementsAre(7)) << "the port does not work";

    if (sending) device_->Write(Bytes(50'000, 0x55));
    line.Unplug();
    inside_call_ = true;
    for (int i = 0; sending && i < 3; ++i) {
      device_->Write(EveryByteValue());
      device_->SetRts(i == 0);
      device_->ReadAll();
      device_->ClearInput();
      device_->PendingOutput();
      EXPECT_TRUE(device_->IsOpen()) << "until the owner is told";
    }
    inside_call_ = false;
    EXPECT_TRUE(WaitFor([&] { return !events_.empty(); }));
    const std::clock_t cpu_before = std::clock();
    RunFor(1200);  // the check for dead devices has been by
    EXPECT_LT(std::clock() - cpu_before, CLOCKS_PER_SEC / 5);
    EXPECT_THAT(events_, ElementsAre(SerialEvent::kDeviceLost));
    EXPECT_THROW(device_->Write(Bytes{1}), RuntimeError);
  }
}

TEST_F(QtSerialDeviceTest, PortLockedByAnother_IsBusy) {
  const int other = line_.OpenAsAnother();
  ::flock(other, LOCK_EX);
  EXPECT_EQ(FailureOfOpening(), kErrPortAlreadyOpen);
  ::close(other);
  EXPECT_EQ(FailureOfOpening(), 0);
  EXPECT_EQ(FailureOfOpening(), kErrPortAlreadyOpen) << "by itself";
}

TEST_F(QtSerialDeviceTest, NothingBehindThePort_IsNoSuchDevice) {
  LinkPort(1, "/dev/pts/none");
  LinkPort(33, "/dev/null");
  EXPECT_TRUE(device_->Exists(kComm));
  EXPECT_FALSE(device_->Exists(1)) << "a link whose device is gone hides the built-in port";
  EXPECT_FALSE(device_->Exists(30));
  for (const int number : {1, 30, 33}) {
    device_->SetPortNumber(number);
    EXPECT_EQ(FailureOfOpening(), kErrInvalidPort) << number;
  }
}

TEST_F(QtSerialDeviceTest, BoxOpenInsideAnEvent_ReceptionGoesOn) {
  Bytes inside;
  device_->SetEventHandler([&](SerialEvent) {
    const Bytes bytes = device_->ReadAll();
    inside.insert(inside.end(), bytes.begin(), bytes.end());
    if (inside.size() > 1) return;
    line_.Send({2});
    EXPECT_TRUE(WaitFor([&] { return inside.size() == 2; }));
  });
  Open();
  line_.Send({1});
  EXPECT_TRUE(WaitFor([&] { return inside.size() == 2; }));
}

TEST_F(QtSerialDeviceTest, EventHandler_MayEndTheDeviceAndFail) {
  device_->SetEventHandler([&](SerialEvent) {
    device_.reset();
    throw RuntimeError(kErrInternal, "parser broke");
  });
  Open();
  line_.Send({1});
  EXPECT_TRUE(WaitFor([&] { return !faults_.empty(); }));
  EXPECT_THAT(faults_, ElementsAre("parser broke"));
}

}  // namespace
}  // namespace tendril::test
