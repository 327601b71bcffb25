#include "ui/model/channel_editor.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <random>

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
  EXPECT_LE(v, a);
  EXPECT_LE(std::abs(t), a - v);
  EXPECT_GE(left, -v);
  EXPECT_LE(right, v);
  EXPECT_LE(position, right);
  EXPECT_TRUE(position >= left || left > right);  // stops that came crossed over
  for (const Parameter parameter : kAllParameters) {
    EXPECT_LE(editor.Spin(parameter).Minimum(), editor.Spin(parameter).Value());
    EXPECT_GE(editor.Spin(parameter).Maximum(), editor.Spin(parameter).Value());
  }
}

TEST_F(ChannelEditorTest, TrimMovesVirtualRangeStopsAndDefault) {
  editor_.SelectChannel(0);
  editor_.Change(Parameter::kVirtualRange, 800);
  ExpectSpin(Parameter::kNeutralTrim, 0, -100, 100);
  editor_.Change(Parameter::kNeutralTrim, 100);
  const ChannelConfig& values = editor_.WorkingValues();
  EXPECT_EQ(values.NeutralPosition, 1600);
  EXPECT_EQ(values.VirtualRange, (PulsePair{800, 2400}));
  EXPECT_EQ(values.VirtualStops, (PulsePair{1100, 2100}));
  EXPECT_EQ(values.DefaultPosition, 1600);
  EXPECT_EQ(values.ActualRange, (PulsePair{600, 2400}));
  editor_.Change(Parameter::kNeutralTrim, 400);
  ExpectSpin(Parameter::kNeutralTrim, 100, -100, 100);
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
                               r.VirtualRange = {1200, 1800};
                             }},
                        Case{Parameter::kNeutralTrim, 50, FollowUp::kUpdateSimulators,
                             [](auto& r) { r.NeutralPosition = 1550; }},
                        Case{Parameter::kLeftStop, 0, FollowUp::kRefreshLivePosition,
                             [](auto& r) { r.VirtualStops[0] = 1500; }},
                        Case{Parameter::kRightStop, 0, FollowUp::kRefreshLivePosition,
                             [](auto& r) { r.VirtualStops[1] = 1500; }},
                        Case{Parameter::kDefaultPosition, 255, FollowUp::kUpdateSimulators,
                             [](auto& r) { r.DefaultPosition = 1755; }}}) {
    SCOPED_TRACE(static_cast<int>(c.parameter));
    editor_.ApplyPreset(kPresets[kStartPreset]);
    editor_.SelectChannel(2);
    editor_.ClickApplyBox(5, true);
    const ChannelConfig before = working_.At(2);
    EXPECT_EQ(editor_.Change(c.parameter, c.value), c.follow_up);
    ChannelConfig expected = before;
    c.expect(expected);
    for (std::size_t channel = 0; channel < kPortCount; ++channel) {
      EXPECT_EQ(working_.At(channel), channel == 2 || channel == 5 ? expected : before) << channel;
    }
    // Leaving the channel stores the rest, in its own record alone.
    const ChannelConfig values = editor_.WorkingValues();
    editor_.SelectChannel(3);
    EXPECT_EQ(working_.At(5), expected);
    CopyPulseFields(values, expected);
    EXPECT_EQ(working_.At(2), expected);
    EXPECT_EQ(working_.At(3), before);
  }
}

TEST_F(ChannelEditorTest, ApplyBoxes_CopyThePulsesAndKeepTheEditedChannelTicked) {
  editor_.ClickAllBox(true);  // without a channel: boxes only
  EXPECT_TRUE(editor_.Ticked(7));
  editor_.SelectChannel(1);
  EXPECT_FALSE(editor_.AllTicked());
  EXPECT_FALSE(editor_.Ticked(7));
  editor_.Change(Parameter::kDefaultPosition, 100);
  editor_.SetPortType(kPortPwm);
  editor_.SetPowerUpOption(kPowerUpNeutral);

  editor_.ClickApplyBox(1, false);
  EXPECT_TRUE(editor_.Ticked(1));
  editor_.ClickAllBox(true);
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    EXPECT_TRUE(editor_.Ticked(channel));
    EXPECT_EQ(working_.At(channel).DefaultPosition, 1600);
    EXPECT_EQ(working_.At(channel).PortType, channel == 1 ? kPortPwm : kPortServo);
    EXPECT_EQ(working_.At(channel).PowerUPOpt, channel == 1 ? kPowerUpNeutral : kPowerUpFirstCommand);
  }
  EXPECT_FALSE(working_.At(8).DefaultPosition == 1600);
  editor_.SetLostCommOption(kLostCommHold);
  EXPECT_EQ(working_.At(6).LostCommOption, kLostCommHold);
  editor_.ClickAllBox(false);
  for (std::size_t channel = 0; channel < kPortCount; ++channel)
    EXPECT_EQ(editor_.Ticked(channel), channel == 1);
}

TEST_F(ChannelEditorTest, WithoutAChannel_NothingIsStored) {
  const ChannelTable before = working_;
  ExpectSpin(Parameter::kActualRange, 900, 0, 1000);
  ExpectSpin(Parameter::kDefaultPosition, 0, -750, 750);
  editor_.Change(Parameter::kActualRange, 300);
  editor_.ClickApplyBox(3, true);
  editor_.SetPortType(kPortDigital);
  editor_.SetPowerUpOption(kPowerUpDefault);
  editor_.SetLostCommOption(kLostCommHold);
  EXPECT_EQ(working_, before);
  ExpectConsistent(editor_);
  editor_.ApplyPreset(kPresets[0]);
  ExpectSpin(Parameter::kActualRange, 700, 0, 1000);
}

TEST_F(ChannelEditorTest, Preset_GoesToAllRecordsWhateverIsTicked) {
  editor_.SelectChannel(6);
  editor_.SetPortType(kPortDigital);
  editor_.SetLostCommOption(kLostCommHold);
  editor_.Change(Parameter::kActualRange, 300);
  editor_.ApplyPreset(kPresets[2]);
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    ChannelConfig expected;
    SetFromPreset(kPresets[2], expected);
    expected.PortType = channel == 6 ? kPortDigital : kPortServo;
    EXPECT_EQ(working_.At(channel), expected);
  }
  ExpectSpin(Parameter::kActualRange, 1000, 0, 1000);
  ExpectSpin(Parameter::kVirtualRange, 800, 0, 1000);
  EXPECT_EQ(working_.At(8), ChannelConfig());
}

TEST_F(ChannelEditorTest, LoadingAndLeaving_ChangesNoConsistentRecord) {
  ChannelConfig& record = working_.At(0);
  record.ActualRange = {600, 2400};
  record.VirtualRange = {1100, 2300};
  record.NeutralPosition = 1700;
  record.VirtualStops = {1205, 2295};
  record.DefaultPosition = 1235;
  const ChannelConfig before = record;
  for (const std::size_t channel : {0u, 1u, 0u, 1u}) editor_.SelectChannel(channel);
  EXPECT_EQ(record, before);
}

TEST_F(ChannelEditorTest, AnyRecordAndAnyEdits_KeepTheRelations) {
  std::mt19937 random(7);
  const auto between = [&](int low, int high) {
    return std::uniform_int_distribution<int>(low, high)(random);
  };
  for (int start = 0; start < 200; ++start) {
    ChannelConfig& record = working_.At(0);
    for (Microseconds* field : {&record.ActualRange[0], &record.ActualRange[1], &record.VirtualRange[0],
                                &record.VirtualRange[1], &record.VirtualStops[0], &record.VirtualStops[1],
                                &record.NeutralPosition, &record.DefaultPosition}) {
      *field = between(0, 255) * 10;
    }
    if (record.ActualRange[0] > record.ActualRange[1])
      std::swap(record.ActualRange[0], record.ActualRange[1]);
    if (start == 0) {
      editor_.SelectChannel(0);
    } else {
      editor_.ReloadChannel();
    }
    ExpectConsistent(editor_);
    for (int edit = 0; edit < 200 && !HasFailure(); ++edit) {
      editor_.Change(kAllParameters[between(0, 5)], between(-1100, 1100));
      ExpectConsistent(editor_);
    }
    ASSERT_FALSE(HasFailure()) << "start " << start;
  }
}

}  // namespace
}  // namespace tendril
