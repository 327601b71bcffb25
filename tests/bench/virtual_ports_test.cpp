#include "bench/virtual_ports.h"

#include <gmock/gmock.h>

#include <vector>

#include "bench/virtual_unit.h"
#include "support/simulated_time.h"

namespace tendril {
namespace {

using testing::IsEmpty;

const Bytes kPoll = {0x00, 0x05, 0x88, 0x2A, 0x2D, 0x00};
const Bytes kReply = {0, 0, 0, 0xFE, 0x2A, 0x05, 0};

class VirtualPortsTest : public testing::Test {
 protected:
  VirtualPortsTest() {
    ports.AddPort(1);
    ports.Attach<VirtualUnit>(1, std::uint8_t{0x05});
    device = ports.CreateDevice();
    device->SetEventHandler([this](SerialEvent event) { events.push_back(event); });
  }
  void Open() {
    device->SetReceiveThreshold(1);
    device->Open(1, 19200);
    device->SetRts(true);
  }

  test::SimulatedTime time{0xFFFFFFFEu};  // wraps in every test
  VirtualPorts ports{time, time};
  std::unique_ptr<SerialDevice> device;
  std::vector<SerialEvent> events;
};

TEST_F(VirtualPortsTest, Poll_IsEchoedAndAnsweredInTime) {
  EXPECT_EQ(time.RunningTimers(), 0);
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
  EXPECT_EQ(device->ReadAll(), Bytes(kReply.begin(), kReply.end() - 2));
  time.Advance(1);
  EXPECT_EQ(device->ReadAll(), Bytes(kReply.end() - 2, kReply.end()));
  time.Advance(2);
  EXPECT_EQ(time.RunningTimers(), 0) << "a silent line runs no timer";
}

TEST_F(VirtualPortsTest, FullInputBuffer_DropsTheSurplusAndReportsIt) {
  Open();
  device->SetReceiveThreshold(0);
  device->Write(Bytes(kSerialInputBufferBytes, 1));
  device->Write(Bytes{2, 2});
  time.Advance(3000);
  EXPECT_THAT(events, testing::AllOf(testing::Not(IsEmpty()), testing::Each(SerialEvent::kReceiveOverflow)));
  EXPECT_EQ(device->ReadAll(), Bytes(kSerialInputBufferBytes, 1));
}

}  // namespace
}  // namespace tendril
