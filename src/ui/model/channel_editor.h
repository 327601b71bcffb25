// ChannelEditor: what the editor computes and stores, without its controls.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>

#include "config/channel_config.h"
#include "ui/model/bounded_value.h"
#include "ui/model/motion.h"

namespace tendril {

// The six parameters that spin buttons set, in microseconds, relative to the centre or to the neutral position.
enum class Parameter { kActualRange, kVirtualRange, kNeutralTrim, kLeftStop, kRightStop, kDefaultPosition };
inline constexpr std::size_t kParameterCount = 6;

// What the window has to do after an edit.
enum class FollowUp { kUpdateSimulators, kRefreshLivePosition };

// Holds the working values of the channel that is edited. They keep the bounds of Motion at all times, and each
// spin button's limits follow the others'. Whatever record is loaded, a unit can hold the working values: the actual
// half width is 0 to kMaxHalfWidth, and all else lies within the actual range. A reversed virtual range (high end
// first), and stops that lie on one side of the neutral position, are kept within it.
//
// The record gets of an edit only the edited parameter's own fields; all eight when the channel is left, or when an
// apply box is clicked. Until the first SelectChannel() no channel is edited, and nothing is stored.
class ChannelEditor {
 public:
  // `working` are the records, which must outlive the editor. The spin buttons have the values of the start.
  explicit ChannelEditor(ChannelTable& working);

  // The spin button of `parameter`: value and limits.
  const BoundedValue& Spin(Parameter parameter) const { return spins_[static_cast<std::size_t>(parameter)]; }
  // The working values; only the eight pulse fields mean something.
  const ChannelConfig& WorkingValues() const { return values_; }
  // The channel that is edited, 0 to 7.
  std::optional<std::size_t> Channel() const { return channel_; }
  // Whether edits go to `channel`, 0 to 7, too.
  bool Ticked(std::size_t channel) const { return ticked_[channel]; }
  // Whether "ALL" is ticked.
  bool AllTicked() const { return all_ticked_; }

  // The person set a spin button to `value`: recalculates, and stores the parameter's own fields in the records of
  // the edited channel and of the ticked ones.
  FollowUp Change(Parameter parameter, int value);

  // The person clicked the apply box of a channel, 0 to 7, or "ALL": the ticked channels get the eight working
  // values. The edited channel's own box cannot be cleared.
  void ClickApplyBox(std::size_t channel, bool ticked);
  void ClickAllBox(bool ticked);

  // Leaves the channel that was edited, storing its working values, and edits `channel` alone.
  void SelectChannel(std::size_t channel);
  // Loads the edited channel's record again, storing nothing: its record was replaced, or the working values were.
  void ReloadChannel();

  // The person chose the output kind (0 to 2; the edited channel's alone), what happens at power-up (1 to 3) or
  // when communication is lost (1 to 4; the ticked channels' too). Nothing without a channel.
  void SetPortType(std::int16_t kind);
  void SetPowerUpOption(std::int32_t option);
  void SetLostCommOption(std::int32_t option);

  // Puts the preset into all eight records, and shows it.
  void ApplyPreset(const Preset& preset);

 private:
  BoundedValue& SpinOf(Parameter parameter) { return spins_[static_cast<std::size_t>(parameter)]; }
  // What the spin buttons say.
  Motion Entered() const;
  void RecalcParameters();
  void Load(const ChannelConfig& record);
  void StoreInTicked();
  // Calls `store` with the record of each channel that edits go to.
  template <typename Store>
  void ForEachTarget(Store&& store);

  ChannelTable& working_;
  std::array<BoundedValue, kParameterCount> spins_;
  ChannelConfig values_;
  std::optional<std::size_t> channel_;
  std::array<bool, kPortCount> ticked_{};
  bool all_ticked_ = false;
};

}  // namespace tendril
