#include "bench/virtual_serial_device.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "bench/virtual_unit.h"
#include "platform/runtime_error.h"
#include "support/simulated_time.h"

namespace tendril {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

const Bytes kPoll = {0x00, 0x05, 0x88, 0x2A, 0x2D, 0x00};
const Bytes kReply = {0, 0, 0, 0xFE, 0x2A, 0x05, 0};

std::int32_t ErrorOf(const std::function<void()>& operation) {
  try {
    operation();
  } catch (const RuntimeError& error) {
    EXPECT_FALSE(error.description().empty());
    return error.number();
  }
  return 0;
}

class VirtualPortsTest : public testing::Test {
 protected:
  explicit VirtualPortsTest(std::uint32_t start_ms = 1000) : time(start_ms) {
    ports.AddPort(1);
    unit = &ports.Attach<VirtualUnit>(1, std::uint8_t{0x05});
    device = ports.CreateDevice();
    device->SetEventHandler([this](SerialEvent event) {
      events.push_back(event);
      if (on_event) on_event(event);
    });
  }
  void Open(std::int32_t number = 1) {
    device->SetSettings("19200,N,8,1");
    device->SetPortNumber(number);
    device->SetLineOptions({.receive_threshold = 1});
    device->Open();
    device->SetRts(true);
  }
  // Polls as a program does: lets go of the line when the echo is back.
  Bytes PollAndListen() {
    device->Write(kPoll);
    time.Advance(4);
    device->SetRts(false);
    EXPECT_EQ(device->ReadAll(), kPoll);
    time.Advance(20);
    device->SetRts(true);
    return device->ReadAll();
  }

  test::SimulatedTime time;
  VirtualPorts ports{time, time};
  VirtualUnit* unit = nullptr;
  std::unique_ptr<SerialDevice> device;
  std::vector<SerialEvent> events;
  std::function<void(SerialEvent)> on_event;
};

TEST_F(VirtualPortsTest, Poll_IsEchoedAndAnsweredInTime) {
  Open();
  device->Write(kPoll);
  EXPECT_EQ(device->PendingOutput(), 5u);
  EXPECT_THAT(events, IsEmpty());
  time.Advance(3);
  EXPECT_EQ(device->ReadAll(), Bytes(kPoll.begin(), kPoll.begin() + 5));  // 5 * 0.521 ms
  EXPECT_EQ(device->PendingOutput(), 0u);
  time.Advance(1);
  EXPECT_EQ(device->ReadAll(), Bytes{0});
  device->SetRts(false);
  // 3.125 ms for the poll, 2 ms turn-round, 7 bytes of 0.521 ms: 8.77 ms in all.
  time.Advance(4);
  Bytes reply = device->ReadAll();
  EXPECT_EQ(reply, Bytes(kReply.begin(), kReply.end() - 2));
  time.Advance(1);
  const Bytes rest = device->ReadAll();
  reply.insert(reply.end(), rest.begin(), rest.end());
  EXPECT_EQ(reply, kReply);
}

TEST_F(VirtualPortsTest, SilentLine_RunsNoTimer) {
  EXPECT_EQ(time.RunningTimers(), 0);
  Open();
  EXPECT_EQ(time.RunningTimers(), 0);
  EXPECT_EQ(PollAndListen(), kReply);
  time.Advance(2);
  EXPECT_EQ(time.RunningTimers(), 0);
  const std::size_t told = events.size();
  time.Advance(10'000);
  EXPECT_EQ(events.size(), told);
}

TEST_F(VirtualPortsTest, ReadAll_TakesWhatNoTickHasBroughtYet) {
  Open();
  Bytes read;
  // This timer's period began first, so that it ticks before the line's own of the same moment.
  auto early = time.CreateTimer([&] { read = device->ReadAll(); });
  early->SetInterval(4);
  early->SetEnabled(true);
  device->Write(kPoll);
  time.Advance(4);
  EXPECT_EQ(read, kPoll);
}

TEST_F(VirtualPortsTest, ReceiveThreshold_DecidesWhenTheOwnerIsTold) {
  const struct {
    std::int32_t threshold;
    std::size_t told;
  } cases[] = {{1, 4}, {6, 1}, {7, 0}, {0, 0}};  // ticks at 1, 2, 3 and 4 ms each bring a byte or two
  Open();
  for (const auto& each : cases) {
    time.Advance(100);
    device->ClearInput();
    events.clear();
    device->SetReceiveThreshold(each.threshold);
    device->Write(Bytes(6, 0x11));
    EXPECT_THAT(events, IsEmpty());  // never from inside a call
    time.Advance(20);
    EXPECT_THAT(events,
                testing::AllOf(testing::SizeIs(each.told), testing::Each(SerialEvent::kDataReceived)));
  }
  device->SetReceiveThreshold(3);  // six bytes still wait, of which the owner was never told
  EXPECT_THAT(events, IsEmpty());
  time.Advance(2);
  EXPECT_THAT(events, ElementsAre(SerialEvent::kDataReceived));
}

TEST_F(VirtualPortsTest, FullInputBuffer_DropsTheSurplusAndSaysSo) {
  Open();
  device->SetLineOptions({.input_buffer_size = 10, .receive_threshold = 0});
  device->Write(Bytes{1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12});
  time.Advance(5);
  EXPECT_THAT(events, IsEmpty());
  time.Advance(10);
  EXPECT_THAT(events, testing::Each(SerialEvent::kReceiveOverflow));
  EXPECT_THAT(events, testing::Not(IsEmpty()));
  EXPECT_EQ(device->ReadAll(), (Bytes{1, 2, 3, 4, 5, 6, 7, 8, 9, 10}));
  device->Write(Bytes{13});
  time.Advance(2);
  EXPECT_EQ(device->ReadAll(), Bytes{13});
}

TEST_F(VirtualPortsTest, OpenFailures_HaveTheirNumbers) {
  ports.AddPort(3);
  ports.AddPort(4);
  ports.SetHeldByAnother(3, true);
  ports.SetAllowed(4, false);
  auto other = ports.CreateDevice();
  const auto open = [&](SerialDevice& opener, std::int32_t number) {
    return ErrorOf([&] {
      opener.SetPortNumber(number);
      opener.Open();
    });
  };
  EXPECT_EQ(open(*device, 2), kErrInvalidPort);
  EXPECT_EQ(open(*device, 3), kErrPortAlreadyOpen);
  EXPECT_EQ(open(*device, 4), kErrNotAllowed);
  EXPECT_FALSE(device->IsOpen());
  EXPECT_EQ(open(*device, 1), 0);
  EXPECT_EQ(open(*device, 1), kErrPortAlreadyOpen);
  EXPECT_EQ(open(*other, 1), kErrPortAlreadyOpen);
  EXPECT_TRUE(device->IsOpen());
  device->Close();
  EXPECT_EQ(open(*other, 1), 0);
  ports.SetHeldByAnother(3, false);
  EXPECT_EQ(open(*device, 3), 0);
  EXPECT_TRUE(device->Exists(4));
  EXPECT_FALSE(device->Exists(2));
}

TEST_F(VirtualPortsTest, Settings_AreCheckedAndFollowed) {
  const struct {
    std::string settings;
    std::int32_t error;
  } cases[] = {
      {"19200,N,8,1", 0},
      {",N,8,1", kErrInvalidPropertyValue},
      {"", kErrInvalidPropertyValue},
      {"fast,N,8,1", kErrSettingsRefused},
      {"0,N,8,1", kErrSettingsRefused},
      {"19200", kErrSettingsRefused},
      {"19200,E,7,2", kErrSettingsRefused},
  };
  for (const auto& each : cases) {
    EXPECT_EQ(ErrorOf([&] { device->SetSettings(each.settings); }), each.error) << each.settings;
  }
  EXPECT_EQ(ErrorOf([&] { device->SetLineOptions({.discard_nul = true}); }), kErrSettingsRefused);
  EXPECT_EQ(ErrorOf([&] { device->SetPortNumber(0); }), kErrInvalidPropertyValue);

  Open();
  device->SetSettings("115200,N,8,1");  // the units run at 19200
  device->Write(kPoll);
  time.Advance(50);
  EXPECT_EQ(unit->polls_heard(), 0u);
}

TEST_F(VirtualPortsTest, Close_DropsWhatWaitsAndRefusesWhatNeedsAnOpenPort) {
  const std::function<void()> operations[] = {
      [&] { device->SetRts(true); }, [&] { device->Write(kPoll); },    [&] { device->ReadAll(); },
      [&] { device->ClearInput(); }, [&] { device->PendingOutput(); },
  };
  Open();
  for (const auto& operation : operations) EXPECT_EQ(ErrorOf(operation), 0);
  time.Advance(2);
  device->Close();
  device->Close();
  events.clear();
  time.Advance(100);
  EXPECT_THAT(events, IsEmpty());
  EXPECT_EQ(unit->polls_heard(), 0u);  // the rest of the poll never left
  EXPECT_EQ(time.RunningTimers(), 0);
  for (const auto& operation : operations) EXPECT_EQ(ErrorOf(operation), kErrPortNotOpen);
  Open();
  EXPECT_THAT(device->ReadAll(), IsEmpty());
  EXPECT_EQ(PollAndListen(), kReply);
}

TEST_F(VirtualPortsTest, Unplugged_ClosesItselfAndSaysSoOnce) {
  Open();
  device->Write(kPoll);
  time.Advance(2);
  events.clear();
  ports.Unplug(1);
  EXPECT_FALSE(device->Exists(1));
  EXPECT_THAT(events, IsEmpty());
  device->Write(kPoll);  // the owner does not know yet
  EXPECT_EQ(device->PendingOutput(), 0u);
  EXPECT_EQ(device->ReadAll(), (Bytes{0x00, 0x05, 0x88}));
  time.Advance(100);
  EXPECT_THAT(events, ElementsAre(SerialEvent::kDeviceLost));
  EXPECT_FALSE(device->IsOpen());
  EXPECT_EQ(ErrorOf([&] { device->Open(); }), kErrInvalidPort);
  EXPECT_EQ(time.RunningTimers(), 0);

  ports.Replug(1);
  Open();
  EXPECT_EQ(PollAndListen(), kReply);
  events.clear();
  ports.Unplug(1);
  device->Close();  // who has closed the port need not be told that it is gone
  time.Advance(100);
  EXPECT_THAT(events, IsEmpty());
}

// A message box in an event handler runs the event loop: the line goes on meanwhile, and other events come.
TEST_F(VirtualPortsTest, MessageBoxInAnEvent_DoesNotStopTheLine) {
  Open();
  on_event = [&](SerialEvent) {
    on_event = nullptr;
    device->SetRts(true);
    device->Write(kPoll);
    time.Advance(4);
    device->SetRts(false);
    time.Advance(50);
    ports.Unplug(1);
    time.Advance(50);
  };
  device->Write(Bytes{0});
  time.Advance(1);
  EXPECT_EQ(unit->polls_heard(), 1u);
  EXPECT_THAT(events, testing::Contains(SerialEvent::kDeviceLost));
  EXPECT_GT(events.size(), 5u);
  EXPECT_EQ(time.RunningTimers(), 0);
}

TEST_F(VirtualPortsTest, OwnerDestroysItsDeviceInAnEvent) {
  Open();
  on_event = [&](SerialEvent) { device.reset(); };
  device->Write(kPoll);
  time.Advance(50);
  EXPECT_EQ(events.size(), 1u);
}

class VirtualPortsAtWrapTest : public VirtualPortsTest {
 protected:
  VirtualPortsAtWrapTest() : VirtualPortsTest(0xFFFFFFFEu) {}
};

TEST_F(VirtualPortsAtWrapTest, ClockWraps_LineGoesOn) {
  Open();
  for (int i = 0; i < 3; ++i) EXPECT_EQ(PollAndListen(), kReply);
  EXPECT_LT(time.NowMs(), 1000u);
}

}  // namespace
}  // namespace tendril
