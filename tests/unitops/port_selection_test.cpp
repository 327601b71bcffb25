#include "unitops/port_selection.h"

#include <gmock/gmock.h>

#include "serial/hw_serial.h"
#include "support/recording_device.h"
#include "support/scripted_socket.h"
#include "support/simulated_control_panel.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;

BoxMessage InUse(int port) {
  return {"The serial port (Comm" + std::to_string(port) +
              ") is in use.\r\nClose other programs that may have it open.",
          "Tendril Configuration", BoxIcon::kExclamation};
}

BoxMessage Question(int port) {
  return {
      "This serial port (Comm" + std::to_string(port) +
          ") is in use by the Control Panel.\r\n\r\nThe Tendril Utility can tell the Control Panel to stop "
          "using the port, but this would cause your shows to be unable to control the lights on the port "
          "(until the Tendril Utility stops using the port).\r\n\r\nWould you like the Tendril Utility to "
          "tell the Control Panel to stop using the port?",
      "Port In Use", BoxIcon::kNone};
}

const BoxMessage kAsked{
    "The Tendril Utility has asked the Control Panel to stop using the port.\r\n\r\nTry selecting the port "
    "again.",
    "Port Control Requested", BoxIcon::kNone};

class PortSelectionTest : public testing::Test {
 protected:
  PortSelectionTest() {
    panel_.control_panel.ReadPreferences();
    panel_.control_panel.InitializeCommListenerInterface();
    world_.time.Advance(100);
    selection_.ListCommPorts();
  }

  SimulatedWorld world_;
  SimulatedControlPanel panel_{world_};
  HwSerial link_{*world_.device, world_.time, world_.time, world_.log};
  PortSelection selection_{link_, world_.boxes, panel_.control_panel};
};

TEST_F(PortSelectionTest, List_HoldsThePortsThatExistUpTo25) {
  world_.bench.AddPort(25);
  world_.bench.AddPort(26);
  EXPECT_THAT(selection_.ListCommPorts(),
              ElementsAre("Select", "Comm 1", "Comm 2", "Comm 3", "Comm 4", "Comm 25"));
  selection_.Choose(5);
  EXPECT_EQ(link_.CommPort(), 25);
  selection_.Choose(0);  // leaves the port as it is
  EXPECT_TRUE(link_.PortOpen());
}

TEST_F(PortSelectionTest, DevicesOfTheLines_AreDescribed) {
  EXPECT_EQ(selection_.DescribePort(2), "Virtual serial line 2");
  world_.bench.Unplug(3);
  EXPECT_EQ(selection_.DescribePort(3), "The device is not there at the moment.");
  for (const std::size_t none : {0u, 5u}) EXPECT_EQ(selection_.DescribePort(none), "");
}

TEST_F(PortSelectionTest, FailedOpening_IsShownAndTheSameLineTriesAgain) {
  panel_.processes.running = "NyxTray2.exe";
  world_.bench.SetHeldByAnother(3, true);
  selection_.Choose(3);
  EXPECT_THAT(world_.boxes.Take(), ElementsAre(InUse(3)));
  EXPECT_FALSE(link_.PortOpen());
  world_.bench.SetHeldByAnother(3, false);
  selection_.Choose(3);
  EXPECT_TRUE(link_.PortOpen());

  world_.bench.Unplug(2);
  selection_.Choose(2);
  ASSERT_EQ(world_.boxes.shown.size(), 1u);
  EXPECT_THAT(
      world_.boxes.shown[0].text,
      testing::StartsWith("The serial port (Comm2) has a problem.\r\nYou may need to select another port."
                          "\r\n\r\nOpen of serial port 2 has failed\r\n\r\nError: (8002) Comm 2 "));
  EXPECT_EQ(world_.boxes.shown[0].icon, BoxIcon::kExclamation);
}

TEST_F(PortSelectionTest, ReasonOfAnyOtherFailure_IsKeptWithoutWhatTheLinkAdds) {
  RecordingDevice device;
  device.open_failure = RuntimeError(kErrSettingsRefused, "It does not do 19200 bit/s.");
  HwSerial link(device, world_.time, world_.time, world_.log);
  PortSelection selection(link, world_.boxes, panel_.control_panel);
  selection.ListCommPorts();
  selection.Choose(2);
  EXPECT_EQ(selection.Facts().fault, PortFault::kOther);
  EXPECT_EQ(selection.Facts().reason, "It does not do 19200 bit/s");
}

TEST_F(PortSelectionTest, PortOfTheControlPanel_IsAskedForAndOpensWhenItIsChosenAgain) {
  panel_.Take(3);
  selection_.Choose(3);  // the answer is No
  EXPECT_THAT(world_.boxes.Take(), ElementsAre(Question(3)));
  EXPECT_EQ(panel_.control_panel.RequestedPort(), std::nullopt);

  world_.boxes.answer_yes = true;
  selection_.Choose(3);
  EXPECT_THAT(world_.boxes.Take(), ElementsAre(Question(3), kAsked));
  world_.time.Advance(100);
  EXPECT_FALSE(link_.PortOpen());  // that is for the user to do
  selection_.Choose(3);
  EXPECT_TRUE(link_.PortOpen());

  // A port that is free changes nothing; the next one that is asked for does.
  selection_.Choose(1);
  EXPECT_TRUE(link_.PortOpen());
  world_.time.Advance(1000);
  EXPECT_THAT(panel_.PortRequests(), ElementsAre("3:0"));
  EXPECT_EQ(panel_.control_panel.RequestedPort(), 3);
  panel_.Take(4);
  selection_.Choose(4);
  world_.time.Advance(100);
  EXPECT_THAT(panel_.PortRequests(), ElementsAre("3:0", "3:1", "4:0"));
  EXPECT_EQ(panel_.control_panel.RequestedPort(), 4);

  // A port that is asked for again is not given back first.
  world_.bench.SetHeldByAnother(4, true);
  selection_.Choose(4);
  world_.time.Advance(1000);
  EXPECT_THAT(panel_.PortRequests(), ElementsAre("3:0", "3:1", "4:0", "4:0"));
}

TEST_F(PortSelectionTest, ListenerPort_IsThatOfThePreferencesAndMayBeNone) {
  const RegistryBranch network = RegistryBranch::Shared(panel_.registry).Below("Network");
  network.CreateKey();
  panel_.Take(3);
  network.SetNumber("DMXListenerPort", 0);
  ControlPanel none(world_.time, world_.boxes, panel_.wsCLI, panel_.registry, panel_.processes);
  none.ReadPreferences();
  PortSelection selection(link_, world_.boxes, none);
  selection.ListCommPorts();
  selection.Choose(3);
  EXPECT_THAT(world_.boxes.Take(), ElementsAre(InUse(3)));

  network.SetNumber("DMXListenerPort", 4321);  // any other one is where the client connects
  VirtualTcpSocket socket(panel_.panel, 4321, world_.time);
  ControlPanel elsewhere(world_.time, world_.boxes, socket, panel_.registry, panel_.processes);
  elsewhere.ReadPreferences();
  elsewhere.InitializeCommListenerInterface();
  world_.time.Advance(100);
  EXPECT_EQ(socket.State(), TcpState::kConnected);
}

TEST_F(PortSelectionTest, FaultOfTheClientAtTheStart_IsShown) {
  struct BrokenSocket final : public ScriptedSocket {
    void SetLocalPort(std::uint16_t /*port*/) override { throw RuntimeError(10050, "The network is down"); }
  };
  BrokenSocket broken;
  ControlPanel control_panel(world_.time, world_.boxes, broken, panel_.registry, panel_.processes);
  control_panel.InitializeCommListenerInterface();
  EXPECT_THAT(world_.boxes.Take(),
              ElementsAre(BoxMessage{"Error in InitializeCommListenerInterface (10050): The network is down",
                                     "Tendril Configuration", BoxIcon::kNone}));
}

}  // namespace
}  // namespace tendril::test
