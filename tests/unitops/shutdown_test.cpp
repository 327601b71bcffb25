#include "unitops/shutdown.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "serial/hw_serial.h"
#include "support/simulated_control_panel.h"

namespace tendril::test {
namespace {

TEST(Shutdown, RequestedPort_IsClosedAndGivenBackBeforeTheWindowGoes) {
  SimulatedWorld world;
  HwSerial link(*world.device, world.time, world.time, world.log);
  link.SetCommPort(1);
  link.SetBaudRate(19200);
  link.SetPortOpen(true);
  SimulatedControlPanel panel(world);
  panel.control_panel.InitializeCommListenerInterface();
  panel.panel.AddPort(1);
  panel.panel.SetPortHandler([&](std::uint8_t, bool held) { EXPECT_FALSE(held && link.PortOpen()); });
  world.boxes.answer_yes = true;
  panel.control_panel.AskControlPanelForPort(1);
  world.time.Advance(100);
  int unloads = 0;
  Shutdown shutdown(link, world.time, panel.control_panel, [&] { ++unloads; });

  EXPECT_FALSE(shutdown.MayClose());
  EXPECT_FALSE(link.PortOpen());
  EXPECT_EQ(link.CommPort(), 0);
  EXPECT_EQ(panel.control_panel.RequestedPort(), std::nullopt);
  EXPECT_EQ(panel.PortRequests(), (std::vector<std::string>{"1:0", "1:1"}));  // it is out already
  world.time.Advance(99);
  EXPECT_EQ(unloads, 0);
  world.time.Advance(1);
  EXPECT_EQ(unloads, 1);
  EXPECT_TRUE(shutdown.MayClose());  // the unload's own request, or the person's second one
  world.time.Advance(1000);
  EXPECT_EQ(unloads, 1);
  EXPECT_EQ(panel.PortRequests().size(), 2u);
}

TEST(Shutdown, WithoutARequestedPort_ClosesAtOnce) {
  SimulatedWorld world;
  HwSerial link(*world.device, world.time, world.time, world.log);
  SimulatedControlPanel panel(world);
  Shutdown shutdown(link, world.time, panel.control_panel, [] { FAIL(); });
  EXPECT_TRUE(shutdown.MayClose());
  EXPECT_EQ(world.time.RunningTimers(), 0);
}

}  // namespace
}  // namespace tendril::test
