// The window as a screen reader knows it: every command by accessible actions alone.
#include "support/screen_reader.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace tendril::test {
namespace {

TEST(ScreenReader, Configuration_IsSentByActionsAlone) {
  ScreenReader reader(QStringLiteral(TENDRIL_DEMO_PROGRAM));
  const ScreenReader::Object window = reader.Window();
  EXPECT_EQ(reader.Role(window), "frame");
  EXPECT_EQ(reader.Name(window).substr(0, 23), "Kelvane Tendril Utility");

  const ScreenReader::Object ports = reader.Find(window, "combo box", "Comm Port");
  reader.Act(ports);
  reader.Act(reader.Find(ports, "list item", "Comm 1"));
  EXPECT_EQ(reader.Text(ports), "Comm 1");
  EXPECT_EQ(reader.Text(reader.Find(window, "combo box", "Unit ID, first digit")), "0");
  EXPECT_EQ(reader.Text(reader.Find(window, "combo box", "Unit ID, second digit")), "1");

  reader.Act(reader.Find(window, "push button", "Channel 3"));
  EXPECT_TRUE(reader.Hears("selected Channel 3"));

  const ScreenReader::Object send = reader.Find(window, "push button", "SEND(write) Configuration");
  reader.Act(send, 1);
  ASSERT_TRUE(reader.Hears("focused SEND(write) Configuration"));
  reader.heard.clear();
  reader.Act(send);
  const std::string sending = "notification Sending the configuration to unit 01";
  EXPECT_TRUE(reader.Hears(sending + ": SUCCESS: Send Complete!"));
  // The focus rests on the window meanwhile.
  EXPECT_THAT(reader.heard, testing::ElementsAre("focused " + reader.Name(window), sending,
                                                 "focused SEND(write) Configuration",
                                                 sending + ": SUCCESS: Send Complete!"));
}

}  // namespace
}  // namespace tendril::test
