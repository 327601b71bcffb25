#include "unitops/shutdown.h"

#include <gtest/gtest.h>

#include <vector>

#include "serial/hw_serial.h"
#include "support/simulated_world.h"

namespace tendril::test {
namespace {

TEST(Shutdown, TakenPort_IsClosedAndGivenBackBeforeTheWindowGoes) {
  SimulatedWorld world;
  HwSerial link(*world.device, world.time, world.time, world.log);
  link.SetCommPort(1);
  link.SetBaudRate(19200);
  link.SetPortOpen(true);
  std::vector<int> given_back;
  int unloads = 0;
  Shutdown shutdown(
      link, world.time, [&](std::int16_t port) { given_back.push_back(port); }, [&] { ++unloads; });
  shutdown.SetTakenPort(1);

  EXPECT_FALSE(shutdown.MayClose());
  EXPECT_FALSE(link.PortOpen());
  EXPECT_EQ(given_back, std::vector<int>{1});
  world.time.Advance(99);
  EXPECT_EQ(unloads, 0);
  world.time.Advance(1);
  EXPECT_EQ(unloads, 1);
  EXPECT_TRUE(shutdown.MayClose());  // the unload's own request, or the person's second one
  world.time.Advance(1000);
  EXPECT_EQ(unloads, 1);
  EXPECT_EQ(given_back.size(), 1u);
}

TEST(Shutdown, WithoutATakenPort_ClosesAtOnce) {
  SimulatedWorld world;
  HwSerial link(*world.device, world.time, world.time, world.log);
  Shutdown shutdown(
      link, world.time, [](std::int16_t) { FAIL(); }, [] { FAIL(); });
  EXPECT_TRUE(shutdown.MayClose());
  EXPECT_EQ(world.time.RunningTimers(), 0);
}

}  // namespace
}  // namespace tendril::test
