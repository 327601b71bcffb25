#include "ui/model/unstored.h"

#include <algorithm>

namespace tendril {

Unstored::Unstored(const ChannelEditor& editor, const ChannelTable& working) {
  if (!editor.Channel()) return;
  const ChannelConfig shown = editor.WorkingValues();
  const ChannelConfig& record = working.At(*editor.Channel());
  const auto note = [this](Parameter parameter, bool differs) {
    differs_[static_cast<std::size_t>(parameter)] = differs;
  };
  note(Parameter::kActualRange, shown.ActualRange != record.ActualRange);
  note(Parameter::kVirtualRange, shown.VirtualRange != record.VirtualRange);
  note(Parameter::kNeutralTrim, shown.NeutralPosition != record.NeutralPosition);
  note(Parameter::kLeftStop, shown.VirtualStops[0] != record.VirtualStops[0]);
  note(Parameter::kRightStop, shown.VirtualStops[1] != record.VirtualStops[1]);
  note(Parameter::kDefaultPosition, shown.DefaultPosition != record.DefaultPosition);
}

bool Unstored::Any() const { return std::find(differs_.begin(), differs_.end(), true) != differs_.end(); }

std::string Unstored::Sentence() const {
  std::string list;
  const auto add = [&list](bool differs, const char* what) {
    if (differs) list += (list.empty() ? "" : ", ") + std::string(what);
  };
  const bool left = Has(Parameter::kLeftStop);
  const bool right = Has(Parameter::kRightStop);
  add(Has(Parameter::kActualRange), "actual range");
  add(Has(Parameter::kVirtualRange), "virtual range");
  add(Has(Parameter::kNeutralTrim), "neutral");
  add(left && right, "stops");
  add(left && !right, "left stop");
  add(right && !left, "right stop");
  add(Has(Parameter::kDefaultPosition), "default");
  return list.empty() ? list : "Shown, not stored yet: " + list + ". SEND would write what is stored.";
}

std::string StoreCaption(const ChannelEditor& editor) {
  std::string list;
  std::size_t count = 0;
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    if (!editor.Ticked(channel)) continue;
    list += (list.empty() ? "" : ", ") + std::to_string(channel + 1);
    ++count;
  }
  return "Store to " + (count == kPortCount ? "all eight" : list);
}

}  // namespace tendril
