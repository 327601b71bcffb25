// ChannelEditor: the model of the editor.
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

// Holds the spin buttons of the edited channel. They satisfy the constraints of Motion at all times: each one's limits
// follow the others. Whatever record is loaded, a unit can hold the working values: the actual half width is 0 to
// kMaxHalfWidth, and all else lies within the actual range. A reversed virtual range (high end first), and stops on one
// side of the neutral position, are kept within it.
//
// An edit stores only the edited parameter's own fields in the record. All eight fields are stored when another channel
// is selected or an apply box is clicked. Until the first SelectChannel() no channel is edited, and nothing is stored.
class ChannelEditor {
 public:
  // All that the editor holds beside the records.
  struct State {
    std::array<BoundedValue, kParameterCount> spins;
    std::optional<std::size_t> channel;
    std::array<bool, kPortCount> ticked{};
    bool all_ticked = false;
  };

  // `working` are the records; they must outlive the editor. The spin buttons have their start-up values.
  explicit ChannelEditor(ChannelTable& working);

  const State& Current() const { return state_; }
  // Goes back to a state that it had, and stores nothing. The caller sets the records.
  void Restore(const State& state) { state_ = state; }

  // Value and limits of the spin button of `parameter`.
  const BoundedValue& Spin(Parameter parameter) const {
    return state_.spins[static_cast<std::size_t>(parameter)];
  }
  // The record that the spin buttons describe. Only its eight pulse fields are valid.
  ChannelConfig WorkingValues() const;
  // The edited channel, 0 to 7.
  std::optional<std::size_t> Channel() const { return state_.channel; }
  // Whether edits also go to `channel`, 0 to 7.
  bool Ticked(std::size_t channel) const { return state_.ticked[channel]; }
  // Whether "ALL" is ticked.
  bool AllTicked() const { return state_.all_ticked; }

  // The user set a spin button to `value`: recalculates, and stores the parameter's own fields in the records of the
  // edited channel and of the ticked ones.
  FollowUp Change(Parameter parameter, int value);

  // The user clicked the apply box of a channel, 0 to 7, or "ALL": the ticked channels get the eight working values.
  // The edited channel's own box cannot be cleared.
  void ClickApplyBox(std::size_t channel, bool ticked);
  void ClickAllBox(bool ticked);

  // Stores the working values in the channel edited so far, and edits `channel` alone.
  void SelectChannel(std::size_t channel);
  // Loads the edited channel's record again and stores nothing. Called when the record has changed.
  void ReloadChannel();

  // The user chose the output kind (0 to 2, of the edited channel alone), the power-up option (1 to 3) or the lost
  // communications option (1 to 4; both of the ticked channels too). No effect while no channel is edited.
  void SetPortType(std::int16_t kind);
  void SetPowerUpOption(std::int32_t option);
  void SetLostCommOption(std::int32_t option);

  // Stores the preset in all eight records and loads it.
  void ApplyPreset(const Preset& preset);

 private:
  BoundedValue& SpinOf(Parameter parameter) { return state_.spins[static_cast<std::size_t>(parameter)]; }
  void RecalcParameters();
  void Load(const ChannelConfig& record);
  void StoreInTicked();
  // Calls `store` with the record of each channel that edits go to.
  template <typename Store>
  void ForEachTarget(Store&& store);

  ChannelTable& working_;
  State state_;
};

}  // namespace tendril
