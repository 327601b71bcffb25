#include "platform/qt/qt_serial_device.h"

#include <gmock/gmock.h>
#include <sys/file.h>
#include <sys/ioctl.h>
#include <sys/wait.h>
#include <termios.h>

#include <csignal>
#include <ctime>
#include <numeric>

#include "platform/pseudo_terminal.h"
#include "platform/runtime_error.h"
#include "platform/wait_for.h"

namespace tendril::test {
namespace {

using testing::Each;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr int kComm = 3;

Bytes EveryByteValue() {
  Bytes bytes(256);
  std::iota(bytes.begin(), bytes.end(), std::uint8_t{0});
  return bytes;
}

// The number of the failure that `operation` ends in; 0 when it does not fail.
std::int32_t FailureOf(const std::function<void()>& operation) {
  try {
    operation();
    return 0;
  } catch (const RuntimeError& error) {
    return error.number();
  }
}

class QtSerialDeviceTest : public testing::Test {
 protected:
  QtSerialDeviceTest() {
    line_.PlugInAs(kComm);
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
  std::int32_t FailureOfOpening() {
    return FailureOf([&] { device_->Open(); });
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

TEST_F(QtSerialDeviceTest, SettingsText_DecidesSpeedOrIsRefused) {
  for (const char* no_speed : {"", ",N,8,1"}) {
    EXPECT_EQ(FailureOf([&] { device_->SetSettings(no_speed); }), kErrInvalidPropertyValue) << no_speed;
  }
  for (const char* refused :
       {"19200", "19200,E,8,1", "19200,N,7,1", "19200,N,8,2", "fast,N,8,1", "-5,N,8,1", "19200x,N,8,1"}) {
    EXPECT_EQ(FailureOf([&] { device_->SetSettings(refused); }), kErrSettingsRefused) << refused;
  }
  for (const char* speed : {"56000", "115200", "500000", "750000", "1000000"}) {
    device_->SetSettings(std::string(speed) + ",N,8,1");
    EXPECT_EQ(FailureOfOpening(), 0) << speed;
    device_->Close();
  }
}

TEST_F(QtSerialDeviceTest, ReceiveThreshold_SaysHowManyBytesBringAnEvent) {
  std::vector<std::size_t> taken;
  device_->SetEventHandler([&](SerialEvent) { taken.push_back(device_->ReadAll().size()); });
  Open(3);
  for (const std::size_t events : {1u, 2u}) {
    line_.Send({0, 0});
    RunFor(30);
    line_.Send({0});
    EXPECT_TRUE(WaitFor([&] { return taken.size() == events; }));
  }
  device_->SetReceiveThreshold(0);
  line_.Send({1, 2, 3, 4});
  RunFor(50);
  EXPECT_EQ(taken.size(), 2u);
  device_->SetReceiveThreshold(4);  // enough waits already
  EXPECT_TRUE(WaitFor([&] { return taken.size() == 3; }));
  EXPECT_THAT(taken, ElementsAre(3, 3, 4));
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
  LineOptions options;
  options.input_buffer_size = 200;
  device_->SetLineOptions(options);
  device_->Open();
  std::size_t taken = 0;
  EXPECT_TRUE(WaitFor([&] { return (taken += line_.Send(EveryByteValue())) > 100'000; }));
  EXPECT_TRUE(WaitFor([&] { return !events_.empty(); }));
  EXPECT_THAT(events_, Each(SerialEvent::kReceiveOverflow));
  const Bytes all = EveryByteValue();
  EXPECT_EQ(device_->ReadAll(), Bytes(all.begin(), all.begin() + 200));
}

TEST_F(QtSerialDeviceTest, PendingOutput_CountsUntilTheFarEndTakesIt) {
  Open();
  device_->Write(Bytes(100'000, 0x55));
  EXPECT_GT(device_->PendingOutput(), 50'000u);
  std::size_t sent = 0;
  EXPECT_TRUE(WaitFor([&] {
    sent += line_.Take().size();
    return device_->PendingOutput() == 0 && sent == 100'000;
  }));
}

// Takes the device from everybody who has it open, as the kernel does when a USB adapter is pulled. Root
// only.
void HangUp(const PseudoTerminal& line) {
  const pid_t child = ::fork();
  if (child == 0) {
    ::setsid();
    std::signal(SIGHUP, SIG_IGN);
    ::_exit(::ioctl(line.OpenAsAnother(), TIOCSCTTY, 1) == 0 && ::vhangup() == 0 ? 0 : 1);
  }
  int status = -1;
  ::waitpid(child, &status, 0);
  EXPECT_EQ(status, 0);
}

TEST_F(QtSerialDeviceTest, Unplugged_IsToldOnceQuietlyAndThePortOpensAgain) {
  for (const bool hung_up : {false, true}) {
    if (hung_up && ::geteuid() != 0) continue;
    for (const bool sending : {false, true}) {
      SCOPED_TRACE(testing::Message() << "hung up " << hung_up << ", sending " << sending);
      PseudoTerminal line;
      line.PlugInAs(kComm);
      events_.clear();
      Open();
      EXPECT_TRUE(line.SendAndSettle({7}));
      EXPECT_THAT(device_->ReadAll(), ElementsAre(7)) << "the port does not work";

      if (sending) device_->Write(Bytes(50'000, 0x55));
      hung_up ? HangUp(line) : line.Unplug();
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
      EXPECT_EQ(FailureOf([&] { device_->Write(Bytes{1}); }), kErrPortNotOpen);
    }
  }
}

TEST_F(QtSerialDeviceTest, PortInUse_IsToldFromOtherFailuresAndLeftAlone) {
  const struct {
    const char* how;
    std::function<void(int)> take;
    std::function<void(int)> give_back;
  } holders[] = {
      {"lock", [](int fd) { ::flock(fd, LOCK_EX); }, [](int fd) { ::flock(fd, LOCK_UN); }},
      {"exclusive mode", [](int fd) { ::ioctl(fd, TIOCEXCL); }, [](int fd) { ::ioctl(fd, TIOCNXCL); }},
  };
  for (const auto& holder : holders) {
    const int other = line_.OpenAsAnother();
    termios before = {};
    termios after = {};
    ::tcgetattr(other, &before);
    holder.take(other);
    EXPECT_EQ(FailureOfOpening(), kErrPortAlreadyOpen) << holder.how;
    EXPECT_FALSE(device_->IsOpen());
    ::tcgetattr(other, &after);
    EXPECT_EQ(cfgetospeed(&before), cfgetospeed(&after)) << holder.how << ": the holder's line was touched";
    holder.give_back(other);
    ::close(other);
    EXPECT_EQ(FailureOfOpening(), 0) << holder.how;
    EXPECT_EQ(FailureOfOpening(), kErrPortAlreadyOpen) << "by itself";
    device_->Close();
  }
}

TEST_F(QtSerialDeviceTest, NothingBehindThePort_IsNoSuchDevice) {
  LinkPort(31, "/dev/pts/none");
  LinkPort(32, "/dev");
  LinkPort(1, "/dev/pts/none");
  EXPECT_FALSE(device_->Exists(1)) << "a link whose device is gone hides the built-in port";
  EXPECT_TRUE(device_->Exists(kComm));
  for (const int number : {30, 31, 32}) {
    EXPECT_FALSE(device_->Exists(number)) << number;
    device_->SetPortNumber(number);
    EXPECT_EQ(FailureOfOpening(), kErrInvalidPort) << number;
  }
  LinkPort(33, "/dev/null");
  device_->SetPortNumber(33);
  EXPECT_EQ(FailureOfOpening(), kErrInvalidPort) << "a device that is no serial port";
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

TEST_F(QtSerialDeviceTest, EventHandler_MayFailOrEndTheDevice) {
  device_->SetEventHandler([](SerialEvent) { throw RuntimeError(kErrInternal, "parser broke"); });
  Open();
  line_.Send({1});
  EXPECT_TRUE(WaitFor([&] { return !faults_.empty(); }));
  EXPECT_THAT(faults_, ElementsAre("parser broke"));

  device_->SetEventHandler([&](SerialEvent) { device_.reset(); });
  line_.Send({2});
  EXPECT_TRUE(WaitFor([&] { return device_ == nullptr; }));
}

}  // namespace
}  // namespace tendril::test
