// The window as a screen reader knows it: every command by accessible actions alone.
#include "support/screen_reader.h"

#include <gmock/gmock.h>

namespace tendril::test {
namespace {

constexpr char kTitle[] = "Kelvane Tendril Utility v" TENDRIL_VERSION;
constexpr char kSending[] = "notification Sending to unit 01";
constexpr char kSent[] = "SUCCESS: Send Complete! Ports 1 to 8 are written.";

// From the start to the outcome of a send. Returns what was heard from the send on.
std::vector<std::string> Send() {
  ScreenReader reader(QStringLiteral(TENDRIL_DEMO_PROGRAM));
  const ScreenReader::Object window = reader.Find(reader.Program(), "frame", kTitle);

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
  EXPECT_TRUE(reader.Hears("focused SEND(write) Configuration"));
  reader.heard.clear();
  reader.Act(send);
  EXPECT_TRUE(reader.Hears(std::string(kSending) + " at "));
  return reader.heard;
}

TEST(ScreenReader, Configuration_IsSentByActionsAlone) {
  std::vector<std::string> heard = Send();
  // Units and window share a thread: on a slow computer the line may be released too late for a reply.
  for (int again = 0; again < 6 && !HasFailure() && heard.back().find(kSent) == std::string::npos; ++again)
    heard = Send();
  // The focus rests on the window meanwhile.
  EXPECT_THAT(heard, testing::ElementsAre(std::string("focused ") + kTitle, kSending,
                                          "focused SEND(write) Configuration", testing::HasSubstr(kSent)));
}

}  // namespace
}  // namespace tendril::test
