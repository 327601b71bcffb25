#include "ui/model/channel_editor.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <random>
#include <variant>

#include "config/option_bytes.h"

namespace tendril {
namespace {

constexpr Parameter kAllParameters[] = {Parameter::kActualRange, Parameter::kVirtualRange,
                                        Parameter::kNeutralTrim, Parameter::kLeftStop,
                                        Parameter::kRightStop,   Parameter::kDefaultPosition};

class ChannelEditorTest : public testing::Test {
 protected:
  ChannelEditorTest() {
    for (std::size_t slot = 0; slot < kPortCount; ++slot)
      SetFromPreset(kPresets[kStartPreset], working_.At(slot));
  }
  void ExpectSpin(Parameter parameter, int value, int minimum, int maximum) {
    const BoundedValue& spin = editor_.Spin(parameter);
    EXPECT_EQ(spin.Value(), value);
    EXPECT_EQ(spin.Minimum(), minimum);
    EXPECT_EQ(spin.Maximum(), maximum);
  }

  ChannelTable working_;
  ChannelEditor editor_{working_};
};

// The relations that hold after every recalculation, from the working values and spin buttons alone.
void ExpectConsistent(const ChannelEditor& editor) {
  const ChannelConfig& values = editor.WorkingValues();
  const int a = editor.Spin(Parameter::kActualRange).Value();
  const int v = editor.Spin(Parameter::kVirtualRange).Value();
  const int t = editor.Spin(Parameter::kNeutralTrim).Value();
  const int left = editor.Spin(Parameter::kLeftStop).Value();
  const int right = editor.Spin(Parameter::kRightStop).Value();
  const int position = editor.Spin(Parameter::kDefaultPosition).Value();
  EXPECT_EQ(values.ActualRange, (PulsePair{1500 - a, 1500 + a}));
  EXPECT_EQ(values.NeutralPosition, 1500 + t);
  EXPECT_EQ(values.VirtualRange, (PulsePair{1500 - v + t, 1500 + v + t}));
  EXPECT_EQ(values.VirtualStops, (PulsePair{1500 + left + t, 1500 + right + t}));
  EXPECT_EQ(values.DefaultPosition, 1500 + position + t);
  const int reach = std::abs(v);  // of a reversed range too
  EXPECT_LE(reach, a);
  EXPECT_LE(std::abs(t), a - reach);
  EXPECT_LE(std::max(std::abs(left), std::abs(right)), reach);
  EXPECT_LE(position, right);
  EXPECT_TRUE(position >= left || left > right);  // stops that came crossed over
  for (const Parameter parameter : kAllParameters) {
    EXPECT_LE(editor.Spin(parameter).Minimum(), editor.Spin(parameter).Value());
    EXPECT_GE(editor.Spin(parameter).Maximum(), editor.Spin(parameter).Value());
  }
}

TEST_F(ChannelEditorTest, NarrowingTheActualRange_PullsEverythingIn) {
  editor_.SelectChannel(0);
  editor_.Change(Parameter::kNeutralTrim, 300);
  editor_.Change(Parameter::kDefaultPosition, -480);
  editor_.Change(Parameter::kActualRange, 200);
  ExpectSpin(Parameter::kVirtualRange, 200, 0, 200);
  ExpectSpin(Parameter::kNeutralTrim, 0, 0, 0);
  ExpectSpin(Parameter::kLeftStop, -200, -200, 0);
  ExpectSpin(Parameter::kRightStop, 200, 0, 200);
  ExpectSpin(Parameter::kDefaultPosition, -200, -200, 200);
  editor_.Change(Parameter::kRightStop, 0);
  ExpectSpin(Parameter::kDefaultPosition, -200, -200, 0);
}

TEST_F(ChannelEditorTest, Edit_StoresItsOwnFieldsAloneInTheTickedChannels) {
  struct Case {
    Parameter parameter;
    int value;
    FollowUp follow_up;
    void (*expect)(ChannelConfig&);  // what the edit makes of a record of the start
  };
  // Each edit changes other working values too, which are stored later.
  for (const Case& c : {Case{Parameter::kActualRange, 400, FollowUp::kUpdateSimulators,
                             [](auto& r) {
                               r.ActualRange = {1100, 1900};
                             }},
                        Case{Parameter::kVirtualRange, 300, FollowUp::kRefreshLivePosition,
                             [](auto& r) {
                               r.VirtualRange = {1220, 1820};
                             }},
                        Case{Parameter::kNeutralTrim, 50, FollowUp::kUpdateSimulators,
                             [](auto& r) { r.NeutralPosition = 1550; }},
                        Case{Parameter::kLeftStop, 0, FollowUp::kRefreshLivePosition,
                             [](auto& r) { r.VirtualStops[0] = 1520; }},
                        Case{Parameter::kRightStop, 0, FollowUp::kRefreshLivePosition,
                             [](auto& r) { r.VirtualStops[1] = 1520; }},
                        Case{Parameter::kDefaultPosition, 255, FollowUp::kUpdateSimulators,
                             [](auto& r) { r.DefaultPosition = 1775; }}}) {
    SCOPED_TRACE(static_cast<int>(c.parameter));
    editor_.ApplyPreset(kPresets[kStartPreset]);
    editor_.SelectChannel(2);
    editor_.ClickApplyBox(5, true);
    const ChannelConfig untouched = working_.At(2);
    editor_.Change(Parameter::kNeutralTrim, 20);
    const ChannelConfig before = working_.At(2);
    EXPECT_EQ(editor_.Change(c.parameter, c.value), c.follow_up);
    ChannelConfig expected = before;
    c.expect(expected);
    for (std::size_t channel = 0; channel < kPortCount; ++channel) {
      EXPECT_EQ(working_.At(channel), channel == 2 || channel == 5 ? expected : untouched) << channel;
    }
    // Leaving the channel stores the rest, in its own record alone.
    const ChannelConfig values = editor_.WorkingValues();
    editor_.SelectChannel(3);
    EXPECT_EQ(working_.At(5), expected);
    CopyPulseFields(values, expected);
    EXPECT_EQ(working_.At(2), expected);
    EXPECT_EQ(working_.At(3), untouched);
  }
}

TEST_F(ChannelEditorTest, LookingAtReversedAndOneSidedRecords_KeepsThem) {
  working_.At(0).NeutralPosition = 1600;
  working_.At(0).VirtualRange = working_.At(0).VirtualStops = {2100, 1100};
  working_.At(0).DefaultPosition = 1100;
  working_.At(1).VirtualStops = {1700, 1800};
  working_.At(1).DefaultPosition = 1750;
  working_.At(2).VirtualStops = {1200, 1300};
  working_.At(2).DefaultPosition = 1250;
  const ChannelTable before = working_;
  for (const std::size_t channel : {0u, 1u, 2u, 3u}) editor_.SelectChannel(channel);
  EXPECT_EQ(working_, before);
  working_.At(4).ActualRange = {10, 2400};
  editor_.SelectChannel(4);
  ExpectSpin(Parameter::kActualRange, 1000, 0, 1000);
}

// Of all that a unit can hold: looking at it and editing it leaves what a unit can hold.
TEST_F(ChannelEditorTest, AnyRecordAndAnyEdits_KeepTheRelationsAndStaySendable) {
  std::mt19937 random(7);
  const auto between = [&](int low, int high) {
    return std::uniform_int_distribution<int>(low, high)(random);
  };
  constexpr int kCorners[] = {1, 2, 149, 150, 151, 254, 255};
  ChannelConfig& record = working_.At(0);
  for (int start = 0; start < 2000; ++start) {
    const bool corners = start % 2 == 0;
    editor_.SelectChannel(1);  // leaving a channel would store over its new record
    for (Microseconds* field : {&record.ActualRange[0], &record.ActualRange[1], &record.VirtualRange[0],
                                &record.VirtualRange[1], &record.VirtualStops[0], &record.VirtualStops[1],
                                &record.NeutralPosition, &record.DefaultPosition}) {
      *field = 10 * (corners ? kCorners[between(0, 6)] : between(1, 255));
    }
    editor_.SelectChannel(0);
    ExpectConsistent(editor_);
    for (int edit = 0; edit < 20 && !HasFailure(); ++edit) {
      editor_.SelectChannel(1);
      EXPECT_TRUE(std::holds_alternative<OptionBytes>(EncodeOptions(record)));
      editor_.SelectChannel(0);
      editor_.Change(kAllParameters[between(0, 5)], between(-1100, 1100));
      ExpectConsistent(editor_);
    }
    ASSERT_FALSE(HasFailure()) << "start " << start;
  }
}

}  // namespace
}  // namespace tendril
