#include "ui/model/channel_editor.h"

#include <algorithm>
#include <cstdlib>

namespace tendril {
namespace {

// Sets only the fields that belong to `parameter`.
void StoreOwnFields(Parameter parameter, const ChannelConfig& from, ChannelConfig& to) {
  switch (parameter) {
    case Parameter::kActualRange:
      to.ActualRange = from.ActualRange;
      break;
    case Parameter::kVirtualRange:
      to.VirtualRange = from.VirtualRange;
      break;
    case Parameter::kNeutralTrim:
      to.NeutralPosition = from.NeutralPosition;
      break;
    case Parameter::kLeftStop:
      to.VirtualStops[0] = from.VirtualStops[0];
      break;
    case Parameter::kRightStop:
      to.VirtualStops[1] = from.VirtualStops[1];
      break;
    case Parameter::kDefaultPosition:
      to.DefaultPosition = from.DefaultPosition;
      break;
  }
}

FollowUp FollowUpOf(Parameter parameter) {
  const bool bounds_live_position = parameter == Parameter::kVirtualRange ||
                                    parameter == Parameter::kLeftStop || parameter == Parameter::kRightStop;
  return bounds_live_position ? FollowUp::kRefreshLivePosition : FollowUp::kUpdateSimulators;
}

}  // namespace

ChannelEditor::ChannelEditor(ChannelTable& working) : working_(working) {
  const auto start = [this](Parameter parameter, int minimum, int maximum, int value) {
    SpinOf(parameter).SetLimits(minimum, maximum);
    SpinOf(parameter).SetValue(value);
  };
  start(Parameter::kActualRange, 0, kMaxHalfWidth, 900);
  start(Parameter::kVirtualRange, 0, kMaxHalfWidth, 800);
  start(Parameter::kLeftStop, -800, 0, -750);
  start(Parameter::kRightStop, 0, 800, 750);
  start(Parameter::kNeutralTrim, -200, 200, 0);
  start(Parameter::kDefaultPosition, -750, 750, 0);
}

ChannelConfig ChannelEditor::WorkingValues() const {
  ChannelConfig values;
  StoreMotion({.actual_half_width = Spin(Parameter::kActualRange).Value(),
               .virtual_half_width = Spin(Parameter::kVirtualRange).Value(),
               .trim = Spin(Parameter::kNeutralTrim).Value(),
               .left_stop = Spin(Parameter::kLeftStop).Value(),
               .right_stop = Spin(Parameter::kRightStop).Value(),
               .default_position = Spin(Parameter::kDefaultPosition).Value()},
              values);
  return values;
}

void ChannelEditor::RecalcParameters() {
  const int actual_half_width = Spin(Parameter::kActualRange).Value();
  BoundedValue& virtual_range = SpinOf(Parameter::kVirtualRange);
  virtual_range.SetMaximum(actual_half_width);
  virtual_range.SetValue(std::max(virtual_range.Value(), -actual_half_width));

  // A reversed virtual range has a negative half width. It reaches as far to each side.
  const int reach = std::abs(virtual_range.Value());
  const int max_trim = actual_half_width - reach;
  SpinOf(Parameter::kNeutralTrim).SetLimits(-max_trim, max_trim);

  BoundedValue& left_stop = SpinOf(Parameter::kLeftStop);
  left_stop.SetMinimum(-reach);
  left_stop.SetValue(std::min(left_stop.Value(), reach));
  BoundedValue& right_stop = SpinOf(Parameter::kRightStop);
  right_stop.SetMaximum(reach);
  right_stop.SetValue(std::max(right_stop.Value(), -reach));

  // In this order: when a record's stops are crossed, the right one decides.
  BoundedValue& default_position = SpinOf(Parameter::kDefaultPosition);
  default_position.SetMinimum(left_stop.Value());
  default_position.SetMaximum(right_stop.Value());
}

FollowUp ChannelEditor::Change(Parameter parameter, int value) {
  SpinOf(parameter).SetValue(value);
  RecalcParameters();
  const ChannelConfig values = WorkingValues();
  ForEachTarget([&](ChannelConfig& record) { StoreOwnFields(parameter, values, record); });
  return FollowUpOf(parameter);
}

template <typename Store>
void ChannelEditor::ForEachTarget(Store&& store) {
  if (!state_.channel) return;
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    if (channel == state_.channel || state_.ticked[channel]) store(working_.At(channel));
  }
}

void ChannelEditor::ClickApplyBox(std::size_t channel, bool ticked) {
  state_.ticked.at(channel) = ticked;
  StoreInTicked();
}

void ChannelEditor::ClickAllBox(bool ticked) {
  state_.all_ticked = ticked;
  state_.ticked.fill(ticked);
  StoreInTicked();
}

void ChannelEditor::StoreInTicked() {
  if (!state_.channel) return;
  state_.ticked[*state_.channel] = true;
  const ChannelConfig values = WorkingValues();
  ForEachTarget([&](ChannelConfig& record) { CopyPulseFields(values, record); });
}

void ChannelEditor::SelectChannel(std::size_t channel) {
  if (state_.channel) CopyPulseFields(WorkingValues(), working_.At(*state_.channel));
  state_.all_ticked = false;
  state_.ticked.fill(false);
  state_.channel = channel;
  state_.ticked.at(channel) = true;
  ReloadChannel();
}

void ChannelEditor::ReloadChannel() {
  if (state_.channel) Load(working_.At(*state_.channel));
}

void ChannelEditor::Load(const ChannelConfig& record) {
  const Motion motion = MotionOf(record);
  state_.spins.fill({});
  // Whatever the record holds: this limit and those that follow from it keep the working values sendable.
  SpinOf(Parameter::kActualRange).SetLimits(0, kMaxHalfWidth);
  SpinOf(Parameter::kActualRange).SetValue(motion.actual_half_width);
  SpinOf(Parameter::kVirtualRange).SetValue(motion.virtual_half_width);
  SpinOf(Parameter::kNeutralTrim).SetValue(motion.trim);
  SpinOf(Parameter::kLeftStop).SetValue(motion.left_stop);
  SpinOf(Parameter::kRightStop).SetValue(motion.right_stop);
  SpinOf(Parameter::kDefaultPosition).SetValue(motion.default_position);
  RecalcParameters();

  // The fixed limits at 0 give way to a record whose range is reversed or whose stops lie on one side.
  const auto at_least_0 = [](BoundedValue& spin) { spin.SetMinimum(std::min(0, spin.Value())); };
  at_least_0(SpinOf(Parameter::kVirtualRange));
  at_least_0(SpinOf(Parameter::kRightStop));
  BoundedValue& left_stop = SpinOf(Parameter::kLeftStop);
  left_stop.SetMaximum(std::max(0, left_stop.Value()));
}

void ChannelEditor::SetPortType(std::int16_t kind) {
  if (state_.channel) working_.At(*state_.channel).PortType = kind;
}

void ChannelEditor::SetPowerUpOption(std::int32_t option) {
  ForEachTarget([&](ChannelConfig& record) { record.PowerUPOpt = option; });
}

void ChannelEditor::SetLostCommOption(std::int32_t option) {
  ForEachTarget([&](ChannelConfig& record) { record.LostCommOption = option; });
}

void ChannelEditor::ApplyPreset(const Preset& preset) {
  for (std::size_t channel = 0; channel < kPortCount; ++channel) SetFromPreset(preset, working_.At(channel));
  Load(working_.At(state_.channel.value_or(0)));
}

}  // namespace tendril
