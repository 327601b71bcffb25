#include "ui/model/summary_editor.h"

#include <gtest/gtest.h>

#include <tuple>

namespace tendril {
namespace {

class SummaryEditorTest : public testing::Test {
 protected:
  // A spin button's value and limits, and the text beside it: "900 (0 to 1000) 600".
  std::string Shown(std::size_t index) {
    const BoundedValue& spin = summary_.Spin(index);
    return std::to_string(spin.Value()) + " (" + std::to_string(spin.Minimum()) + " to " +
           std::to_string(spin.Maximum()) + ") " + summary_.Readings()[index];
  }

  ChannelTable working_;
  ChannelConfig& record_ = working_.At(0);
  SummaryEditor summary_{working_};
};

TEST_F(SummaryEditorTest, Normalise_AppliesEveryConstraint) {
  record_.ActualRange = {1000, 2200};  // half width 600, not centred
  record_.VirtualRange = {700, 2300};  // 800: too wide
  record_.NeutralPosition = 1600;      // no room left
  record_.VirtualStops = {800, 2150};  // too wide
  record_.DefaultPosition = 2300;
  ChannelConfig expected = record_;
  expected.ActualRange = expected.VirtualRange = expected.VirtualStops = {900, 2100};
  expected.NeutralPosition = 1500;
  expected.DefaultPosition = 2100;
  summary_.Normalise(0);
  EXPECT_EQ(record_, expected);
}

TEST_F(SummaryEditorTest, NumberEntry_NarrowsItsLimitsAtTheFirstChange) {
  record_.ActualRange = {600, 2400};
  record_.VirtualRange = {1100, 2100};  // half width 500, trim 100
  record_.NeutralPosition = 1600;
  record_.VirtualStops = {1150, 2050};
  record_.DefaultPosition = 1700;
  const ChannelConfig before = record_;
  using enum SummaryField;
  for (const auto& [field, title, first, change_to, after] :
       {std::tuple(kActualRange, "Channel 1 Actual Range", "900 (0 to 1000) 600", 800, "800 (0 to 1000) 700"),
        {kVirtualRange, "Channel 1 Virtual Range", "500 (0 to 1800) +/-500", 600, "600 (0 to 900) +/-600"},
        {kDefaultPosition, "Channel 1 Default Position", "100 (-500 to 500) 100", 480,
         "450 (-500 to 500) 450"},
        {kNeutralTrim, "Channel 1 Neutral Trim", "100 (-800 to 800) 100", -750, "-400 (-400 to 400) -400"},
        {kStops, "Channel 1 Stops", "-450 (-500 to 0) -450", -550, "-500 (-500 to 0) -500"}}) {
    summary_.OpenNumberEntry(0, field);
    EXPECT_EQ(summary_.Title(), title);
    EXPECT_EQ(summary_.ShownSpins(), field == kStops ? 2u : 1u);
    EXPECT_EQ(Shown(0), first);
    EXPECT_EQ(record_, before) << "opening changes nothing";
    summary_.ChangeEntry(0, change_to);
    EXPECT_EQ(Shown(0), after);
    record_ = before;
  }
  summary_.ChangeEntry(1, 50);
  EXPECT_EQ(Shown(1), "50 (0 to 500) +50");
  EXPECT_EQ(record_.VirtualStops, (PulsePair{1100, 1650}));
  EXPECT_EQ(record_.DefaultPosition, 1650) << "moved by the stop";
}

}  // namespace
}  // namespace tendril
