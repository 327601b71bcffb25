// What the editor shows of the edited channel and its record does not hold.
#pragma once

#include <array>
#include <string>

#include "config/channel_config.h"
#include "ui/model/channel_editor.h"

namespace tendril {

// An edit stores its own fields only. What it changes beyond them is shown, and reaches the record when the channel is
// left or an apply box is clicked.
class Unstored {
 public:
  Unstored() = default;  // all is stored
  // `working` are the records that `editor` edits.
  Unstored(const ChannelEditor& editor, const ChannelTable& working);

  bool Any() const;
  // Whether the record differs from what is shown for `parameter`.
  bool Has(Parameter parameter) const { return differs_[static_cast<std::size_t>(parameter)]; }
  // "Shown, not stored yet: virtual range, stops. SEND would write what is stored."; empty when all is stored.
  std::string Sentence() const;

  friend bool operator==(const Unstored&, const Unstored&) = default;

 private:
  std::array<bool, kParameterCount> differs_{};
};

// The button that stores, with the channels that it stores to: "Store to 1, 2, 5", or "Store to all eight".
std::string StoreCaption(const ChannelEditor& editor);

}  // namespace tendril
