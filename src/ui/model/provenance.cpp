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

void Provenance::ReadFrom(std::uint8_t unit, const std::string& time) {
  Begin("Read from " + HexByte(unit) + " at " + time);
}

void Provenance::SentTo(std::uint8_t unit, const std::string& time) {
  Begin("Sent to " + HexByte(unit) + " at " + time);
  ++state_.sends;
}

void Provenance::Begin(std::string origin) {
  state_.origin = std::move(origin);
  state_.records = working_;
}

std::vector<std::size_t> Provenance::ChangedChannels() const {
  std::vector<std::size_t> changed;
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    if (working_.At(channel) != state_.records.At(channel)) changed.push_back(channel);
  }
  return changed;
}

std::string Provenance::Sentence() const {
  const auto changed = ChangedChannels();
  return changed.empty() ? state_.origin : state_.origin + "; " + ChannelsInWords(changed) + " changed since";
}

}  // namespace tendril
