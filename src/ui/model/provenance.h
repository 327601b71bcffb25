// Provenance: where the working configuration comes from, and what has changed since.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "config/channel_config.h"

namespace tendril {

// "channel 2", "channels 2 and 5", "channels 1, 2 and 5", "all channels": channels 0 to 7 in words.
std::string ChannelsInWords(const std::vector<std::size_t>& channels);

// The channels, 0 to 7, whose records differ between `a` and `b`, in order.
std::vector<std::size_t> ChannelsThatDiffer(const ChannelTable& a, const ChannelTable& b);

// "14:02" of "2026-11-22T14:02:31+01:00".
std::string ClockTime(const std::string& iso_time);

// Keeps the records as they were when a preset, a unit or a send last gave or took all of them.
class Provenance {
 public:
  struct Reading {
    std::uint8_t unit;
    std::string time;  // "2026-11-22T14:02:31+01:00"
  };
  struct State {
    std::string origin;
    std::optional<Reading> reading;  // if the records were read
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
  // They were read from `unit` at `time` ("2026-11-22T14:02:31+01:00"), or sent to it at `time` ("14:02").
  void ReadFrom(std::uint8_t unit, const std::string& time);
  void SentTo(std::uint8_t unit, const std::string& time);

  // From which unit and when the records were read, while none of them has changed since.
  std::optional<Reading> UnchangedReading() const;
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
