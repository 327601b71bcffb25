#include "ui/model/summary_editor.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace tendril {
namespace {

class SummaryEditorTest : public testing::Test {
 protected:
  SummaryEditorTest() {
    for (std::size_t slot = 0; slot < kPortCount; ++slot)
      SetFromPreset(kPresets[kStartPreset], working_.At(slot));
  }
  void ExpectSpin(std::size_t index, int value, int minimum, int maximum) {
    EXPECT_EQ(summary_.Spin(index).Value(), value);
    EXPECT_EQ(summary_.Spin(index).Minimum(), minimum);
    EXPECT_EQ(summary_.Spin(index).Maximum(), maximum);
  }
  using Readings = std::array<std::string, 2>;

  ChannelTable working_;
  SummaryEditor summary_{working_};
};

TEST_F(SummaryEditorTest, Showing_BringsEveryRecordIntoItsBounds) {
  ChannelConfig& record = working_.At(3);
  record.ActualRange = {1000, 2200};  // half width 600, put about the centre
  record.VirtualRange = {700, 2300};  // 800: too wide
  record.NeutralPosition = 1600;      // no room left
  record.VirtualStops = {800, 2150};  // -700, 650: too wide
  record.DefaultPosition = 2300;
  const ChannelConfig before = record;
  summary_.Normalise(3);
  ChannelConfig expected = before;
  expected.ActualRange = {900, 2100};
  expected.VirtualRange = {900, 2100};
  expected.NeutralPosition = 1500;
  expected.VirtualStops = {900, 2100};
  expected.DefaultPosition = 2100;
  EXPECT_EQ(record, expected);
  summary_.Normalise(3);
  EXPECT_EQ(record, expected);
  ChannelConfig untouched = working_.At(2);
  summary_.Normalise(2);
  EXPECT_EQ(working_.At(2), untouched);
}

TEST_F(SummaryEditorTest, Entries_OpenWithTheFirstLimitsAndNarrowAtTheFirstChange) {
  ChannelConfig& record = working_.At(0);
  record.VirtualRange = {1100, 2100};  // trim 100, room 400
  record.NeutralPosition = 1600;
  record.VirtualStops = {1150, 2050};
  record.DefaultPosition = 1700;
  struct Case {
    SummaryField field;
    const char* title;
    std::array<int, 3> first;  // value, minimum, maximum
    int change_to;
    std::array<int, 3> after;
    Readings readings;
  };
  for (const Case& c : {Case{SummaryField::kActualRange,
                             "Channel 1 Actual Range",
                             {900, 0, 1000},
                             800,
                             {800, 0, 1000},
                             {"700", "2300"}},
                        Case{SummaryField::kVirtualRange,
                             "Channel 1 Virtual Range",
                             {500, 0, 1800},
                             600,
                             {600, 0, 900},
                             {"+/-600", ""}},
                        Case{SummaryField::kDefaultPosition,
                             "Channel 1 Default Position",
                             {100, -500, 500},
                             480,
                             {450, -500, 500},
                             {"450", ""}},
                        Case{SummaryField::kNeutralTrim,
                             "Channel 1 Neutral Trim",
                             {100, -800, 800},
                             -750,
                             {-400, -400, 400},
                             {"-400", "1100"}}}) {
    SCOPED_TRACE(c.title);
    const ChannelConfig before = record;
    summary_.OpenNumberEntry(0, c.field);
    EXPECT_EQ(summary_.Title(), c.title);
    EXPECT_EQ(summary_.ShownSpins(), 1u);
    ExpectSpin(0, c.first[0], c.first[1], c.first[2]);
    EXPECT_EQ(record, before) << "opening changes nothing";
    summary_.ChangeEntry(0, c.change_to);
    ExpectSpin(0, c.after[0], c.after[1], c.after[2]);
    EXPECT_EQ(summary_.Readings(), c.readings);
    record = before;
  }

  summary_.OpenNumberEntry(0, SummaryField::kStops);
  EXPECT_EQ(summary_.Title(), "Channel 1 Stops");
  EXPECT_EQ(summary_.ShownSpins(), 2u);
  ExpectSpin(0, -450, -500, 0);
  ExpectSpin(1, 450, 0, 500);
  summary_.ChangeEntry(1, 50);
  EXPECT_EQ(summary_.Readings(), (Readings{"-450", "+50"}));
  EXPECT_EQ(record.VirtualStops, (PulsePair{1150, 1650}));
  EXPECT_EQ(record.DefaultPosition, 1650) << "pushed in by the stop";
}

}  // namespace
}  // namespace tendril
