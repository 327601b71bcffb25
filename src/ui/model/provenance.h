// Provenance: where the working configuration comes from, and what has changed since.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "config/channel_config.h"

namespace tendril {

// "channel 2", "channels 2 and 5", "channels 1, 2 and 5", "all channels": channels 0 to 7 in words.
std::string ChannelsInWords(const std::vector<std::size_t>& channels);

// Keeps the records as they were when a preset, a unit or a send last gave or took all of them.
class Provenance {
 public:
  struct State {
    std::string origin;
    ChannelTable records;
    int sends = 0;  // so far
  };

  // `working` are the records; they must outlive this object.
  explicit Provenance(const ChannelTable& working) : working_(working) {}

  const State& Current() const { return state_; }
  // Goes back to a state that it had, unless there was a send since: no undo takes that back.
  void Restore(const State& state) {
    if (state.sends == state_.sends) state_ = state;
  }

  // The records are those of the preset called `name`.
  void FromPreset(std::string_view name) { Begin("Preset " + std::string(name)); }
  // They were read from `unit`, or sent to it, at `time` ("14:02").
  void ReadFrom(std::uint8_t unit, const std::string& time);
  void SentTo(std::uint8_t unit, const std::string& time);

  // The channels whose records have changed since, in order.
  std::vector<std::size_t> ChangedChannels() const;
  // "Read from 0A at 14:02; channels 2 and 5 changed since".
  std::string Sentence() const;

 private:
  void Begin(std::string origin);

  const ChannelTable& working_;
  State state_;
};

}  // namespace tendril
