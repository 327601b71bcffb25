// SummaryEditor: the model of the summary.
#pragma once

#include <array>
#include <cstddef>
#include <optional>
#include <string>
#include <utility>

#include "config/channel_config.h"
#include "ui/model/bounded_value.h"
#include "ui/model/motion.h"
#include "ui/model/typed_number.h"

namespace tendril {

// The fields of a row that the number entry can change.
enum class SummaryField { kActualRange, kVirtualRange, kStops, kDefaultPosition, kNeutralTrim };

// The rows of the table, and the number entry that changes one value of one channel. Each change is stored in that
// channel's record at once, whatever is ticked, and applies the constraints of Motion to all its parameters. Unlike in
// the editor, stops and default position stay where they are when the trim changes, as far as the constraints allow.
class SummaryEditor {
 public:
  // The value that the number entry changes.
  struct Entry {
    std::size_t channel;
    SummaryField field;
  };

  // `working` are the records; they must outlive this object.
  explicit SummaryEditor(ChannelTable& working) : working_(working) {}

  // Applies the constraints to the record of `channel`, 0 to 7. Called before its row is shown.
  void Normalise(std::size_t channel);

  // Opens the number entry for a value of `channel`, or moves it there. The first limits of the virtual range and of
  // the trim are wider than those after the first change.
  void OpenNumberEntry(std::size_t channel, SummaryField field);
  void CloseNumberEntry() { entry_.reset(); }
  // The value that the open number entry changes.
  const std::optional<Entry>& OpenEntry() const { return entry_; }
  // The user set spin button `index` (0, or 1 for the right stop) to `value`. No effect while no entry is open.
  void ChangeEntry(std::size_t index, int value);

  // The open number entry: its title, its spin buttons, how many of them it shows, and the text beside each.
  std::string Title() const;
  const BoundedValue& Spin(std::size_t index) const { return spins_[index]; }
  std::size_t ShownSpins() const { return entry_ && entry_->field == SummaryField::kStops ? 2 : 1; }
  std::array<std::string, 2> Readings() const;
  // What its numbers mean, and the pulse width that they are relative to.
  std::pair<NumberMeaning, int> Meaning() const;

 private:
  void ApplySummaryEntry(std::size_t channel, std::optional<SummaryField> field);

  ChannelTable& working_;
  std::optional<Entry> entry_;
  std::array<BoundedValue, 2> spins_;
};

}  // namespace tendril
