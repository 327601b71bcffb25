#include "ui/model/summary_editor.h"

#include <algorithm>

namespace tendril {
namespace {

constexpr std::array kFieldNames = {"Actual Range", "Virtual Range", "Stops", "Default Position",
                                    "Neutral Trim"};  // by SummaryField

}  // namespace

void SummaryEditor::Normalise(std::size_t channel) { ApplySummaryEntry(channel, std::nullopt); }

void SummaryEditor::OpenNumberEntry(std::size_t channel, SummaryField field) {
  const ChannelConfig& record = working_.At(channel);
  entry_ = Entry{channel, field};
  spins_.fill({});
  const Motion motion = MotionOf(record);
  const int actual_width = record.ActualRange[1] - record.ActualRange[0];
  const int virtual_width = record.VirtualRange[1] - record.VirtualRange[0];
  const int half = motion.virtual_half_width;
  const auto start = [](BoundedValue& spin, int minimum, int maximum, int value) {
    spin.SetMinimum(minimum);
    spin.SetMaximum(maximum);
    spin.SetValue(value);
  };
  switch (field) {
    case SummaryField::kActualRange:
      start(spins_[0], 0, kMaxHalfWidth, motion.actual_half_width);
      break;
    case SummaryField::kVirtualRange:
      start(spins_[0], 0, actual_width, half);
      break;
    case SummaryField::kStops:
      start(spins_[0], -half, 0, motion.left_stop);
      start(spins_[1], 0, half, motion.right_stop);
      break;
    case SummaryField::kDefaultPosition:
      start(spins_[0], -half, half, motion.default_position);
      break;
    case SummaryField::kNeutralTrim:
      start(spins_[0], -(actual_width - virtual_width), actual_width - virtual_width, motion.trim);
      break;
  }
}

void SummaryEditor::ChangeEntry(std::size_t index, int value) {
  if (!entry_) return;
  spins_[index].SetValue(value);
  ApplySummaryEntry(entry_->channel, entry_->field);
}

void SummaryEditor::ApplySummaryEntry(std::size_t channel, std::optional<SummaryField> field) {
  ChannelConfig& record = working_.At(channel);
  Motion motion = MotionOf(record);

  if (field == SummaryField::kActualRange) motion.actual_half_width = spins_[0].Value();

  if (field == SummaryField::kVirtualRange) {
    spins_[0].SetMaximum(motion.actual_half_width);
    motion.virtual_half_width = spins_[0].Value();
  }
  motion.virtual_half_width = std::min(motion.virtual_half_width, motion.actual_half_width);
  const int half = motion.virtual_half_width;

  const int max_trim = motion.actual_half_width - half;
  if (field == SummaryField::kNeutralTrim) {
    spins_[0].SetLimits(-max_trim, max_trim);
    motion.trim = spins_[0].Value();
  }
  motion.trim = std::clamp(motion.trim, -max_trim, max_trim);

  // Stops and default position stay where they are: they are measured again, from the new neutral position.
  const Microseconds neutral = kCentrePulseWidth + motion.trim;
  motion.left_stop = record.VirtualStops[0] - neutral;
  motion.right_stop = record.VirtualStops[1] - neutral;
  if (field == SummaryField::kStops) {
    spins_[0].SetMinimum(-half);
    spins_[1].SetMaximum(half);
    motion.left_stop = spins_[0].Value();
    motion.right_stop = spins_[1].Value();
  }
  motion.left_stop = std::max(motion.left_stop, -half);
  motion.right_stop = std::min(motion.right_stop, half);

  const bool default_entered = field == SummaryField::kDefaultPosition;
  motion.default_position = default_entered ? spins_[0].Value() : record.DefaultPosition - neutral;
  // Not std::clamp: when a record's stops are crossed, the right one decides.
  motion.default_position = std::min(std::max(motion.default_position, motion.left_stop), motion.right_stop);
  if (default_entered) {
    spins_[0].SetValue(motion.default_position);
    spins_[0].SetMinimum(-half);
    spins_[0].SetMaximum(half);
  }

  StoreMotion(motion, record);
}

std::string SummaryEditor::Title() const {
  if (!entry_) return {};
  return "Channel " + std::to_string(entry_->channel + 1) + " " +
         kFieldNames[static_cast<std::size_t>(entry_->field)];
}

std::array<std::string, 2> SummaryEditor::Readings() const {
  if (!entry_) return {};
  const ChannelConfig& record = working_.At(entry_->channel);
  const Motion motion = MotionOf(record);
  const auto text = [](int value) { return std::to_string(value); };
  switch (entry_->field) {
    case SummaryField::kActualRange:
      return {text(record.ActualRange[0]), text(record.ActualRange[1])};
    case SummaryField::kVirtualRange:
      return {"+/-" + text(motion.virtual_half_width), ""};
    case SummaryField::kStops:
      return {text(motion.left_stop), "+" + text(motion.right_stop)};
    case SummaryField::kDefaultPosition:
      return {text(motion.default_position), ""};
    case SummaryField::kNeutralTrim:
      return {text(motion.trim), text(record.NeutralPosition)};
  }
  return {};
}

std::pair<NumberMeaning, int> SummaryEditor::Meaning() const {
  if (!entry_) return {};
  const SummaryField field = entry_->field;
  const bool half = field == SummaryField::kActualRange || field == SummaryField::kVirtualRange;
  const bool from_centre = field == SummaryField::kActualRange || field == SummaryField::kNeutralTrim;
  return {half ? NumberMeaning::kHalfWidth : NumberMeaning::kDistance,
          from_centre ? kCentrePulseWidth : working_.At(entry_->channel).NeutralPosition};
}

}  // namespace tendril
