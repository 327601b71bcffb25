#include "ui/model/channel_editor.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <random>
#include <string>
#include <tuple>
#include <variant>

#include "config/option_bytes.h"

namespace tendril {
namespace {

using enum Parameter;

class ChannelEditorTest : public testing::Test {
 protected:
  ChannelEditorTest() { editor_.ApplyPreset(kPresets[kStartPreset]); }
  int Value(Parameter parameter) { return editor_.Spin(parameter).Value(); }
  // Each spin button's limits follow the others, also those of a reversed virtual range and of crossed stops.
  void ExpectConsistent() {
    const int a = Value(kActualRange);
    const int reach = std::abs(Value(kVirtualRange));
    EXPECT_LE(a, kMaxHalfWidth);
    EXPECT_LE(reach, a);
    EXPECT_LE(std::max(std::abs(Value(kLeftStop)), std::abs(Value(kRightStop))), reach);
    EXPECT_EQ(editor_.Spin(kVirtualRange).Maximum(), a);
    EXPECT_EQ(editor_.Spin(kNeutralTrim).Minimum(), reach - a);
    EXPECT_EQ(editor_.Spin(kNeutralTrim).Maximum(), a - reach);
    EXPECT_EQ(editor_.Spin(kLeftStop).Minimum(), -reach);
    EXPECT_EQ(editor_.Spin(kRightStop).Maximum(), reach);
    EXPECT_EQ(editor_.Spin(kDefaultPosition).Minimum(), std::min(Value(kLeftStop), Value(kRightStop)));
    EXPECT_EQ(editor_.Spin(kDefaultPosition).Maximum(), Value(kRightStop));
  }

  ChannelTable working_;
  ChannelEditor editor_{working_};
};

std::string Pulses(const ChannelConfig& record) {
  std::string text;
  for (const PulseFieldText& field : PulseFieldTexts(record)) text += field.value + ", ";
  return text;
}

TEST_F(ChannelEditorTest, Edit_StoresItsOwnFieldsAloneInTheTickedChannels) {
  using enum FollowUp;
  for (const auto& [parameter, value, follow_up, stored] :
       {std::tuple(kActualRange, 400, kUpdateSimulators,
                   "1100 to 1900, 1000 to 2000, 1000 to 2000, 1500, 1520, "),
        {kVirtualRange, 300, kRefreshLivePosition, "600 to 2400, 1220 to 1820, 1000 to 2000, 1500, 1520, "},
        {kNeutralTrim, 50, kUpdateSimulators, "600 to 2400, 1000 to 2000, 1000 to 2000, 1500, 1550, "},
        {kLeftStop, 0, kRefreshLivePosition, "600 to 2400, 1000 to 2000, 1520 to 2000, 1500, 1520, "},
        {kRightStop, 0, kRefreshLivePosition, "600 to 2400, 1000 to 2000, 1000 to 1520, 1500, 1520, "},
        {kDefaultPosition, 255, kUpdateSimulators,
         "600 to 2400, 1000 to 2000, 1000 to 2000, 1775, 1520, "}}) {
    editor_.ApplyPreset(kPresets[kStartPreset]);
    editor_.SelectChannel(2);
    editor_.ClickApplyBox(5, true);
    const ChannelConfig untouched = working_.At(3);
    editor_.Change(kNeutralTrim, 20);
    EXPECT_EQ(editor_.Change(parameter, value), follow_up);
    for (const std::size_t channel : {2u, 5u}) EXPECT_EQ(Pulses(working_.At(channel)), stored);
    // Selecting another channel stores the rest.
    const ChannelConfig values = editor_.WorkingValues();
    editor_.SelectChannel(3);
    EXPECT_EQ(Pulses(working_.At(2)), Pulses(values));
    EXPECT_EQ(Pulses(working_.At(5)), stored);
    for (const std::size_t channel : {3u, 4u}) EXPECT_EQ(working_.At(channel), untouched);
  }
}

TEST_F(ChannelEditorTest, SelectingReversedAndOneSidedRecords_KeepsThem) {
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
}

TEST_F(ChannelEditorTest, AnyRecordAndAnyEdits_StayConsistentAndSendable) {
  std::mt19937 random(7);
  const auto between = [&](int low, int high) {
    return std::uniform_int_distribution<int>(low, high)(random);
  };
  constexpr int kCorners[] = {1, 2, 149, 150, 151, 254, 255};
  ChannelConfig& record = working_.At(0);
  for (int start = 0; start < 2000; ++start) {
    const bool corners = start % 2 == 0;
    editor_.SelectChannel(1);  // stores the previous record
    OptionBytes any = {1};
    for (std::size_t i = 1; i < any.size(); ++i)
      any[i] = static_cast<std::uint8_t>(corners ? kCorners[between(0, 6)] : between(1, 255));
    record = DecodeOptions(any);
    for (int edit = 0; edit < 20; ++edit) {
      editor_.SelectChannel(0);
      ExpectConsistent();
      editor_.Change(static_cast<Parameter>(between(0, 5)), between(-1100, 1100));
      ExpectConsistent();
      editor_.SelectChannel(1);
      EXPECT_TRUE(std::holds_alternative<OptionBytes>(EncodeOptions(record)));
    }
    ASSERT_FALSE(HasFailure()) << "start " << start;
  }
}

}  // namespace
}  // namespace tendril
