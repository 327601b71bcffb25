// What the window says to users who cannot see it, and what they can copy. The events are tested with a real reader's
// bus: this platform has none.

#include "ui/status_line.h"
#include "window_fixture.h"

namespace tendril::test {
namespace {

TEST_F(Window, StatusLine_SaysTheOutcomeAndCanBeCopied) {
  ConnectUnit();
  Click("Command3_0");
  EXPECT_EQ(Text("lblStatus"), "Sending to unit 01");
  RunToTheEnd();
  window_->findChild<StatusLine*>()->Copy();
  const std::string outcome = Accessible("lblStatus").text(QAccessible::Name).toStdString();
  EXPECT_THAT(outcome,
              testing::MatchesRegex("Sending to unit 01 at ..:..: SUCCESS: Send Complete! Ports 1 to 8 are "
                                    "written. What it held before is not known: it was not read."));
  EXPECT_THAT(Copied(), testing::StartsWith(outcome + "\nNothing moves\n"));
  EXPECT_THAT(Copied(), testing::ContainsRegex("\nUnit 01 answered at .+\nSent to 01 at"));
  EXPECT_EQ(Accessible("lblStatus").role(), QAccessible::Notification);
}

TEST_F(Window, OutputButton_IsSelectedAsAServoIs) {
  Click("ServoSimulator2_2");
  Press("optChannelType_2");
  EXPECT_TRUE(Accessible("cmdDigitalOutput_2").state().selected);
  Click("ServoSimulator2_3");
  EXPECT_FALSE(Accessible("cmdDigitalOutput_2").state().selected);
  EXPECT_TRUE(Accessible("ServoSimulator2_3").state().selected);
}

}  // namespace
}  // namespace tendril::test
