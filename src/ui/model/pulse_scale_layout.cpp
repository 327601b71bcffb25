#include "ui/model/pulse_scale_layout.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <utility>

namespace tendril {
namespace {

constexpr Microseconds kFirst = 500;
constexpr Microseconds kLast = 2500;
constexpr int kNumberStep = 500;
constexpr int kTickStep = 100;

constexpr double kTextGap = 6;            // between two texts side by side
constexpr double kNumberInset = 4;        // from the end of a bar to its number
constexpr double kArrowGap = 4;           // from an arrow to its text
constexpr double kMinBar = kArmLine + 4;  // to be seen beside the lines that cross it
constexpr double kTick = 3;
constexpr double kLongTick = 5;
constexpr double kSpace = 2;        // below the words, and between the bars and the axis
constexpr double kMinRowSlack = 1;  // of a bar's row, above the height of its text
constexpr double kMaxRowSlack = 10;

constexpr char kShorter[] = "shorter pulse: turns right";
constexpr char kLonger[] = "longer pulse: turns left";
constexpr char kUnit[] = "µs";

struct Row {
  ScalePart part;
  const char* name;
  PulsePair ChannelConfig::*ends;
};
constexpr std::array<Row, 3> kRows{{{ScalePart::kActual, "Actual", &ChannelConfig::ActualRange},
                                    {ScalePart::kVirtual, "Virtual", &ChannelConfig::VirtualRange},
                                    {ScalePart::kStops, "Stops", &ChannelConfig::VirtualStops}}};

// All but the rows of the bars: words, axis, its numbers, and its directions.
double FixedHeight(double line_height) { return 3 * line_height + 2 * kSpace + kLongTick; }

double HeightWith(double row_slack, double line_height) {
  return FixedHeight(line_height) + static_cast<double>(kRows.size()) * (line_height + row_slack);
}

class Layout {
 public:
  Layout(const std::optional<ScaleValues>& values, const ScaleRoom& room) : values_(values), room_(room) {
    const double rows = (room.height - FixedHeight(room.line_height)) / static_cast<double>(kRows.size());
    row_height_ = std::clamp(rows, room.line_height + kMinRowSlack, room.line_height + kMaxRowSlack);
    for (const Row& row : kRows) left_ = std::max(left_, Width(row.name) + kTextGap);
    if (values) Include(*values);
    width_ = std::max(1.0, room.width - left_ - Width(std::to_string(last_)) / 2);
    top_ = room.line_height + kSpace;
    axis_ = top_ + static_cast<double>(kRows.size()) * row_height_ + kSpace;
  }

  std::vector<ScaleElement> Take() {
    AddAxis();
    if (!values_) return std::move(elements_);
    for (std::size_t row = 0; row < kRows.size(); ++row) AddBar(row);
    AddWords();
    AddLine(ScalePart::kDefault, values_->shown.DefaultPosition, kMarkerLine);
    AddLine(ScalePart::kNeutral, values_->shown.NeutralPosition, kMarkerLine);
    AddLine(ScalePart::kArm, values_->arm, kArmLine);
    return std::move(elements_);
  }

 private:
  double Width(const std::string& text) const { return room_.text_width(text); }

  // Widens the axis to whole steps.
  void Include(const ScaleValues& values) {
    const ChannelConfig& shown = values.shown;
    const auto [low, high] = std::minmax({shown.ActualRange[0], shown.ActualRange[1], shown.VirtualRange[0],
                                          shown.VirtualRange[1], shown.VirtualStops[0], shown.VirtualStops[1],
                                          shown.DefaultPosition, shown.NeutralPosition, values.arm});
    while (first_ > low) first_ -= kNumberStep;
    while (last_ < high) last_ += kNumberStep;
  }

  double PlaceOf(Microseconds pulse) const {
    return left_ + width_ * static_cast<double>(pulse - first_) / static_cast<double>(last_ - first_);
  }

  void Add(ScalePart part, ScaleShape shape, double x, double y, double width, double height) {
    elements_.push_back({part, shape, x, y, width, height});
  }
  void AddText(ScalePart part, ScaleShape shape, double x, double y, const std::string& text) {
    elements_.push_back({part, shape, x, y, Width(text), room_.line_height, text});
  }

  void AddAxis() {
    Add(ScalePart::kAxis, ScaleShape::kLine, left_, axis_, width_, 1);
    // Numbers stand at so many steps that they do not touch.
    const double widest = std::max(Width(std::to_string(first_)), Width(std::to_string(last_)));
    int step = kNumberStep;
    while (step < last_ - first_ && PlaceOf(first_ + step) - left_ < widest + kTextGap) step += kNumberStep;
    const double below = axis_ + kLongTick;
    for (Microseconds pulse = first_; pulse <= last_; pulse += kTickStep) {
      const bool number = (pulse - first_) % step == 0;
      const double place = PlaceOf(pulse);
      Add(ScalePart::kAxis, ScaleShape::kLine, place, axis_, 1, number ? kLongTick : kTick);
      const std::string text = std::to_string(pulse);
      if (number) AddText(ScalePart::kAxis, ScaleShape::kText, place - Width(text) / 2, below, text);
    }
    const double before = left_ - Width(std::to_string(first_)) / 2 - kTextGap - Width(kUnit);
    if (before >= 0) AddText(ScalePart::kAxis, ScaleShape::kText, before, below, kUnit);
    AddDirections(below + room_.line_height);
  }

  // Which way the servo turns, at both ends. The arrows are squares.
  void AddDirections(double y) {
    const double arrow = room_.line_height;
    const double text = arrow + kArrowGap;
    Add(ScalePart::kAxis, ScaleShape::kTurnRight, 0, y, arrow, arrow);
    AddText(ScalePart::kAxis, ScaleShape::kText, text, y, kShorter);
    AddText(ScalePart::kAxis, ScaleShape::kText, room_.width - text - Width(kLonger), y, kLonger);
    Add(ScalePart::kAxis, ScaleShape::kTurnLeft, room_.width - arrow, y, arrow, arrow);
  }

  double TopOf(std::size_t row) const { return top_ + static_cast<double>(row) * row_height_; }
  double TextTopOf(std::size_t row) const { return TopOf(row) + (row_height_ - room_.line_height) / 2; }

  void AddBar(std::size_t row) {
    const auto& [part, name, ends] = kRows[row];
    const auto [low, high] =
        std::minmax({PlaceOf((values_->shown.*ends)[0]), PlaceOf((values_->shown.*ends)[1])});
    const double missing = std::max(0.0, kMinBar - (high - low));
    const double gap = std::max(kMinRowSlack, std::round(row_height_ / 8));
    Add(part, ScaleShape::kBar, low - missing / 2, TopOf(row) + gap / 2, high - low + missing,
        row_height_ - gap);
    AddText(part, ScaleShape::kText, left_ - kTextGap - Width(name), TextTopOf(row), name);
    AddNumbers(row);
  }

  // The ends' numbers in the bar; or, where they do not fit, both of them beside it.
  void AddNumbers(std::size_t row) {
    const auto& [part, name, ends] = kRows[row];
    const auto [first, second] = values_->shown.*ends;
    const std::string low = std::to_string(std::min(first, second));
    const std::string high = std::to_string(std::max(first, second));
    const double left = PlaceOf(std::min(first, second));
    const double right = PlaceOf(std::max(first, second));
    const double y = TextTopOf(row);
    if (right - left >= Width(low) + Width(high) + 2 * kNumberInset + kTextGap) {
      AddText(part, ScaleShape::kNumber, left + kNumberInset, y, low);
      AddText(part, ScaleShape::kNumber, right - kNumberInset - Width(high), y, high);
      return;
    }
    const std::string both = std::to_string(first) + " to " + std::to_string(second);
    const double after = right + kNumberInset + kMinBar;
    const bool fits = after + Width(both) <= room_.width;
    AddText(part, ScaleShape::kText, fits ? after : left - kNumberInset - kMinBar - Width(both), y, both);
  }

  // Above their lines, and pushed apart where these are too close.
  void AddWords() {
    const auto word = [this](ScalePart part, Microseconds pulse, const char* text) {
      const double x = PlaceOf(pulse) - Width(text) / 2;
      return ScaleElement{part, ScaleShape::kText, x, 0, Width(text), room_.line_height, text};
    };
    ScaleElement left = word(ScalePart::kDefault, values_->shown.DefaultPosition, "default");
    ScaleElement right = word(ScalePart::kNeutral, values_->shown.NeutralPosition, "neutral");
    if (values_->shown.DefaultPosition > values_->shown.NeutralPosition) std::swap(left, right);
    const double overlap = std::max(0.0, left.Right() + kTextGap - right.x);
    left.x = std::max(0.0, left.x - overlap / 2);
    right.x = std::min(std::max(right.x + overlap / 2, left.Right() + kTextGap), room_.width - right.width);
    left.x = std::min(left.x, right.x - kTextGap - left.width);
    elements_.push_back(left);
    elements_.push_back(right);
  }

  // From the words to the axis, around the numbers.
  void AddLine(ScalePart part, Microseconds pulse, double width) {
    const double x = PlaceOf(pulse) - width / 2;
    double y = top_;
    const auto add_to = [&](double bottom) {
      if (bottom > y) Add(part, ScaleShape::kLine, x, y, width, bottom - y);
    };
    for (std::size_t i = 0; i < elements_.size(); ++i) {
      const ScaleElement element = elements_[i];
      const bool text = element.shape == ScaleShape::kNumber || element.shape == ScaleShape::kText;
      if (!text || element.y < top_ || element.Right() <= x - 1 || element.x >= x + width + 1) continue;
      if (element.y >= axis_) continue;
      add_to(element.y);
      y = element.Bottom();
    }
    add_to(axis_);
  }

  const std::optional<ScaleValues>& values_;
  const ScaleRoom& room_;
  Microseconds first_ = kFirst;
  Microseconds last_ = kLast;
  double left_ = 0;  // of the axis
  double width_ = 0;
  double top_ = 0;  // of the first bar's row
  double row_height_ = 0;
  double axis_ = 0;
  std::vector<ScaleElement> elements_;
};

}  // namespace

double MinimumScaleHeight(double line_height) { return HeightWith(kMinRowSlack, line_height); }

double MaximumScaleHeight(double line_height) { return HeightWith(kMaxRowSlack, line_height); }

double MinimumScaleWidth(const ScaleRoom& room) {
  return room.text_width(kShorter) + 2 * (room.line_height + kArrowGap + kTextGap) + room.text_width(kLonger);
}

std::vector<ScaleElement> LayOutPulseScale(const std::optional<ScaleValues>& values, const ScaleRoom& room) {
  return Layout(values, room).Take();
}

}  // namespace tendril
