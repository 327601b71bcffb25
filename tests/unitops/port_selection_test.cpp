#include "unitops/port_selection.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "serial/hw_serial.h"
#include "support/simulated_world.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;

class PortSelectionTest : public testing::Test {
 protected:
  SimulatedWorld world_;
  HwSerial link_{*world_.device, world_.time, world_.time, world_.log};
  PortSelection selection_{link_, world_.boxes};
};

TEST_F(PortSelectionTest, List_HoldsThePortsThatExistUpTo25) {
  world_.bench.AddPort(25);
  world_.bench.AddPort(26);
  EXPECT_THAT(selection_.ListCommPorts(),
              ElementsAre("Select", "Comm 1", "Comm 2", "Comm 3", "Comm 4", "Comm 25"));
  selection_.Choose(5);
  EXPECT_EQ(link_.CommPort(), 25);
  EXPECT_TRUE(link_.PortOpen());
}

TEST_F(PortSelectionTest, Select_LeavesThePortAsItIs) {
  selection_.ListCommPorts();
  selection_.Choose(2);
  selection_.Choose(0);
  EXPECT_EQ(link_.CommPort(), 2);
  EXPECT_TRUE(link_.PortOpen());
}

TEST_F(PortSelectionTest, FailedOpening_IsToldAndTheSameLineTriesAgain) {
  selection_.ListCommPorts();
  world_.bench.SetHeldByAnother(3, true);
  selection_.Choose(3);
  EXPECT_THAT(world_.boxes.Take(),
              ElementsAre(BoxMessage{
                  "The serial port (Comm3) is in use.\r\nClose other programs that may have it open.",
                  "Tendril Configuration", BoxIcon::kExclamation}));
  EXPECT_FALSE(link_.PortOpen());
  world_.bench.SetHeldByAnother(3, false);
  selection_.Choose(3);
  EXPECT_TRUE(link_.PortOpen());
  EXPECT_THAT(world_.boxes.Take(), ElementsAre());
}

TEST_F(PortSelectionTest, OtherProblems_CarryTheirDescription) {
  selection_.ListCommPorts();
  world_.bench.Unplug(2);
  selection_.Choose(2);
  world_.bench.SetAllowed(1, false);
  selection_.Choose(1);
  ASSERT_EQ(world_.boxes.shown.size(), 2u);
  EXPECT_THAT(world_.boxes.shown[0].text,
              testing::MatchesRegex(
                  "The serial port \\(Comm2\\) has a problem.\r\nYou may need to select another port."
                  "\r\n\r\nOpen of serial port 2 has failed\r\n\r\nError: \\(8002\\) .+"));
  EXPECT_THAT(world_.boxes.shown[1].text, testing::HasSubstr("Error: (70) "));
  EXPECT_EQ(world_.boxes.shown[1].icon, BoxIcon::kExclamation);
}

}  // namespace
}  // namespace tendril::test
