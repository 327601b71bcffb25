// SummaryEditor: what the summary computes and stores, without its controls.
#pragma once

#include <array>
#include <cstddef>
#include <optional>
#include <string>

#include "config/channel_config.h"
#include "ui/model/bounded_value.h"
#include "ui/model/motion.h"

namespace tendril {

// The fields of a row that the number entry can change.
enum class SummaryField { kActualRange, kVirtualRange, kStops, kDefaultPosition, kNeutralTrim };

// The table's rows, and the number entry that changes one value of one channel. Every change goes to that channel's
// record at once, whatever is ticked, and brings all its parameters into the bounds of Motion. Unlike in the editor
// the positions stay where they are when the trim changes, as far as the bounds allow.
class SummaryEditor {
 public:
  // The value whose number entry is open.
  struct Entry {
    std::size_t channel;
    SummaryField field;
  };

  // `working` are the records, which must outlive it.
  explicit SummaryEditor(ChannelTable& working) : working_(working) {}

  // Brings the record of `channel`, 0 to 7, into the bounds; the row is about to be shown.
  void Normalise(std::size_t channel);

  // Opens the number entry for a value of `channel`, or moves it there. The limits are those of the start: for the
  // virtual range and the trim they are wider than after the first change.
  void OpenNumberEntry(std::size_t channel, SummaryField field);
  // No value is being changed any more.
  void CloseNumberEntry() { entry_.reset(); }
  // The value that is being changed, if one is.
  const std::optional<Entry>& OpenEntry() const { return entry_; }
  // The person set spin button `index` (0, or 1 for the right stop) to `value`. Nothing without an open entry.
  void ChangeEntry(std::size_t index, int value);

  // The number entry's title, its spin buttons, how many of them are shown, and what stands beside each; for an
  // open entry.
  std::string Title() const;
  const BoundedValue& Spin(std::size_t index) const { return spins_[index]; }
  std::size_t ShownSpins() const { return entry_ && entry_->field == SummaryField::kStops ? 2 : 1; }
  std::array<std::string, 2> Readings() const;

 private:
  void ApplySummaryEntry(std::size_t channel, std::optional<SummaryField> field);

  ChannelTable& working_;
  std::optional<Entry> entry_;
  std::array<BoundedValue, 2> spins_;
};

}  // namespace tendril
