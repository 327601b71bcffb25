#include "ui/model/record_remarks.h"

#include <optional>
#include <variant>

#include "config/option_bytes.h"

namespace tendril {
namespace {

std::string Start(std::size_t channel) { return "Channel " + std::to_string(channel + 1) + ": "; }

}  // namespace

void RecordRemarks::AcceptEdit() {
  if (!editor_.Channel()) return;  // nothing was stored
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    if (editor_.Ticked(channel)) given_.At(channel) = Shown(channel, true);
  }
}

ChannelConfig RecordRemarks::Shown(std::size_t channel, bool editor_shown) const {
  return editor_shown && editor_.Channel() == channel ? editor_.WorkingValues() : working_.At(channel);
}

void RecordRemarks::AddDifferences(std::size_t channel, bool editor_shown,
                                   std::vector<std::string>& sentences) const {
  const auto given = PulseFieldTexts(given_.At(channel));
  const auto shown = PulseFieldTexts(Shown(channel, editor_shown));
  for (std::size_t field = 0; field < given.size(); ++field) {
    if (given[field].value == shown[field].value) continue;
    sentences.push_back(Start(channel) + given[field].InWords() + " is shown as " + shown[field].value);
  }
}

std::vector<std::string> RecordRemarks::Sentences(bool editor_shown) const {
  std::vector<std::string> sentences;
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    const auto encoded = EncodeOptions(working_.At(channel));
    if (const auto* invalid = std::get_if<InvalidRecord>(&encoded))
      sentences.push_back(Start(channel) + invalid->field + " cannot be sent");
  }
  const auto edited = editor_shown ? editor_.Channel() : std::nullopt;
  if (edited) AddDifferences(*edited, editor_shown, sentences);
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    if (channel != edited) AddDifferences(channel, editor_shown, sentences);
  }
  return sentences;
}

}  // namespace tendril
