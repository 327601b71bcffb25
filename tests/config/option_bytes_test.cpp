#include "config/option_bytes.h"

#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

#include "platform/runtime_error.h"

namespace tendril {
namespace {

ChannelConfig Medium() {
  ChannelConfig record;
  SetFromPreset(kPresets[kStartPreset], record);
  return record;
}

OptionBytes Encoded(const ChannelConfig& record) {
  const auto result = EncodeOptions(record);
  if (const auto* invalid = std::get_if<InvalidRecord>(&result)) ADD_FAILURE() << invalid->text;
  return std::holds_alternative<OptionBytes>(result) ? std::get<OptionBytes>(result) : OptionBytes{};
}

std::string ErrorOf(const ChannelConfig& record) {
  const auto result = EncodeOptions(record);
  const auto* invalid = std::get_if<InvalidRecord>(&result);
  return invalid != nullptr ? invalid->text : "accepted";
}

TEST(OptionBytes, Presets_EncodeToTheBytesOfTheUnit) {
  const std::vector<OptionBytes> expected{
      {1, 80, 220, 125, 175, 125, 175, 150, 150},
      {1, 60, 240, 100, 200, 100, 200, 150, 150},
      {1, 50, 250, 70, 230, 70, 230, 150, 150},
  };
  for (std::size_t i = 0; i < expected.size(); ++i) {
    ChannelConfig record;
    SetFromPreset(kPresets[i], record);
    EXPECT_EQ(Encoded(record), expected[i]) << kPresets[i].name;
  }
}

TEST(OptionBytes, EveryField_HasItsOwnByteAndLosesItsLastDigit) {
  ChannelConfig record;
  record.ActualRange = {10, 2550};
  record.VirtualRange = {209, 1505};
  record.VirtualStops = {400, 500};
  record.DefaultPosition = 600;
  record.NeutralPosition = 700;
  record.PowerUPOpt = kPowerUpFirstCommand;
  record.LostCommOption = kLostCommStopPulse;
  const OptionBytes bytes{1, 1, 255, 20, 150, 40, 50, 60, 70};
  EXPECT_EQ(Encoded(record), bytes);
  record.VirtualRange = {200, 1500};
  record.Received = true;
  EXPECT_EQ(DecodeOptions(bytes), record);
}

TEST(OptionBytes, Flags_CombineKindPowerUpAndLostComm) {
  struct Case {
    std::int16_t kind;
    std::int32_t power_up, lost_comm;
    int flags;
  };
  for (const Case& c : std::vector<Case>{{0, 3, 4, 1},
                                         {0, 1, 4, 1 + 8 + 128},
                                         {1, 2, 4, 2 + 8 + 64},
                                         {1, 3, 1, 2 + 4},
                                         {2, 3, 2, 3 + 4 + 32},
                                         {2, 1, 3, 159}}) {
    ChannelConfig record = Medium();
    record.PortType = c.kind;
    record.PowerUPOpt = c.power_up;
    record.LostCommOption = c.lost_comm;
    const OptionBytes bytes = Encoded(record);
    EXPECT_EQ(bytes[0], c.flags) << c.kind << c.power_up << c.lost_comm;
    record.Received = true;
    EXPECT_EQ(DecodeOptions(bytes), record);
  }
}

TEST(OptionBytes, InvalidField_IsNamedWithItsValue) {
  struct Case {
    std::function<void(ChannelConfig&)> invalidate;
    std::string field_and_value;
  };
  const std::vector<Case> cases{
      {[](auto& r) { r.PortType = 3; }, "PortType=3"},
      {[](auto& r) { r.PortType = -1; }, "PortType=-1"},
      {[](auto& r) { r.PowerUPOpt = 7; }, "PowerUPOpt=7"},
      {[](auto& r) { r.LostCommOption = 0; }, "LostCommOption=0"},
      {[](auto& r) { r.ActualRange[0] = 9; }, "ActualRange(0)=9"},
      {[](auto& r) { r.ActualRange[1] = 2551; }, "ActualRange(1)=2551"},
      {[](auto& r) { r.VirtualRange[0] = -10; }, "VirtualRange(0)=-10"},
      {[](auto& r) { r.VirtualRange[1] = 0; }, "VirtualRange(1)=0"},
      {[](auto& r) { r.VirtualStops[0] = 9; }, "VirtualStops(0)=9"},
      {[](auto& r) { r.VirtualStops[1] = 70000; }, "VirtualStops(1)=70000"},
      {[](auto& r) { r.DefaultPosition = 2551; }, "DefaultPosition=2551"},
      {[](auto& r) { r.NeutralPosition = 9; }, "NeutralPosition=9"},
  };
  ChannelConfig all_invalid = Medium();
  for (auto c = cases.rbegin(); c != cases.rend(); ++c) {
    ChannelConfig record = Medium();
    c->invalidate(record);
    EXPECT_EQ(ErrorOf(record), "Internal Error - Invalid " + c->field_and_value);
    // Invalidated from the last check to the first: the first failed check is reported.
    c->invalidate(all_invalid);
    EXPECT_EQ(ErrorOf(all_invalid), "Internal Error - Invalid " + c->field_and_value);
  }
}

TEST(OptionBytes, FlagsOfNoExactPattern_StandForTheDefaults) {
  for (const int flags : {8, 64, 128, 192, 200, 16, 32, 48, 52}) {
    const ChannelConfig record = DecodeOptions(OptionBytes{static_cast<std::uint8_t>(flags)});
    EXPECT_EQ(record.PortType, -1) << flags;
    EXPECT_EQ(record.PowerUPOpt, kPowerUpFirstCommand) << flags;
    EXPECT_EQ(record.LostCommOption, kLostCommStopPulse) << flags;
  }
}

TEST(ChannelTable, SlotBeyondTheNinth_RaisesAnError) {
  ChannelTable table;
  EXPECT_NO_THROW(table.At(8));
  EXPECT_THROW(table.At(9), RuntimeError);
}

}  // namespace
}  // namespace tendril
