#include "ui/model/provenance.h"

#include <utility>

#include "platform/hex_text.h"

namespace tendril {

std::string ChannelsInWords(const std::vector<std::size_t>& channels) {
  if (channels.size() == kPortCount) return "all channels";
  std::string text = channels.size() == 1 ? "channel " : "channels ";
  for (std::size_t i = 0; i < channels.size(); ++i) {
    if (i > 0) text += i + 1 == channels.size() ? " and " : ", ";
    text += std::to_string(channels[i] + 1);
  }
  return text;
}

std::vector<std::size_t> ChannelsThatDiffer(const ChannelTable& a, const ChannelTable& b) {
  std::vector<std::size_t> channels;
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    if (a.At(channel) != b.At(channel)) channels.push_back(channel);
  }
  return channels;
}

std::string ClockTime(const std::string& iso_time) { return iso_time.substr(11, 5); }

void Provenance::ReadFrom(std::uint8_t unit, const std::string& time) {
  Begin("Read from " + HexByte(unit) + " at " + ClockTime(time));
  state_.reading = {unit, time};
}

void Provenance::SentTo(std::uint8_t unit, const std::string& time) {
  Begin("Sent to " + HexByte(unit) + " at " + time);
  ++state_.sends;
}

void Provenance::Begin(std::string origin) {
  state_.origin = std::move(origin);
  state_.reading.reset();
  state_.records = working_;
}

std::optional<Provenance::Reading> Provenance::UnchangedReading() const {
  return ChangedChannels().empty() ? state_.reading : std::nullopt;
}

std::vector<std::size_t> Provenance::ChangedChannels() const {
  return ChannelsThatDiffer(working_, state_.records);
}

std::string Provenance::Sentence() const {
  const auto changed = ChangedChannels();
  return changed.empty() ? state_.origin : state_.origin + "; " + ChannelsInWords(changed) + " changed since";
}

}  // namespace tendril
