#include "simulator/servo_dial.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <limits>

#include "platform/rounding.h"
#include "platform/runtime_error.h"

namespace tendril {
namespace {

constexpr double kMicrosecondsPerDegree = 10.0;

constexpr DialColour kBodyFill = 0xE0E0E0;

// Proportions of the picture.
constexpr double kBodyLeft = 1.0 / 3.0;
constexpr double kBodyRight = 0.667;
constexpr double kBodyTop = 0.3;
constexpr double kBodyBottom = 0.95;
constexpr double kCaptionTop = 0.65;
constexpr double kTextTop = 0.62;  // of the first row of angle texts
constexpr double kTextRow = 0.11;  // from row to row
constexpr double kInnerBodyInset = 2;
constexpr double kBaseLineWidth = 1;
// Separates arm and default marker from all arcs and from a light window.
constexpr DialColour kPointerOutline = 0x404040;
constexpr double kPointerOutlineWidth = 0.75;
// A picture whose aspect ratio is larger is drawn in its middle part only, so that the servo is not distorted.
constexpr double kMaxAspect = 2;

// The control negates angles for its arcs, and minus zero is not negative: an angle of exactly 0 is moved by an
// invisible amount.
constexpr double kNearlyZeroAngle = 0.00001 * kDialPi;
constexpr double kNearlyZeroRange = 1e-08;

std::int32_t Checked(std::int64_t value) {
  if (value < std::numeric_limits<std::int32_t>::min() || value > std::numeric_limits<std::int32_t>::max()) {
    throw RuntimeError(kErrOverflow, "Overflow");
  }
  return static_cast<std::int32_t>(value);
}

double Drawable(double angle) { return angle == 0 ? kNearlyZeroAngle : angle; }

// The ends of `arc` as seen from the centre.
double LeftEnd(const ServoDial::Arc& arc) { return arc.clockwise > 0 ? arc.start : arc.end; }
double RightEnd(const ServoDial::Arc& arc) { return arc.clockwise > 0 ? arc.end : arc.start; }

// A drawing angle (0 to a full turn) as signed servo degrees: "+50°", "0°", "−50°" (with the true minus sign).
std::string DegreesText(double angle) {
  double from_top = angle - kDialPi / 2;
  if (from_top > kDialPi) from_top -= 2 * kDialPi;
  const long degrees = std::lround(-from_top / kDialPi * 180);
  const char* sign = degrees > 0 ? "+" : degrees < 0 ? "\u2212" : "";
  return sign + std::to_string(std::labs(degrees)) + "\u00B0";
}

}  // namespace

// Collects the elements of one picture.
class ServoDial::Picture {
 public:
  Picture(double width, double height, const DialSizes& sizes)
      : sizes_(sizes),
        width_(std::min(width, height * kMaxAspect)),
        height_(std::min(height, width * kMaxAspect)),
        left_((width - width_) / 2),
        top_((height - height_) / 2) {}

  double Width() const { return width_; }
  double X(double fraction) const { return left_ + fraction * width_; }
  double Y(double fraction) const { return top_ + fraction * height_; }
  // Half the height, or half the width if that is less: no arc is cut off.
  double Half() const { return std::min(width_, height_) / 2; }

  void AddBox(DialPart part, double inset, DialColour fill) {
    const DialPoint top_left = {X(kBodyLeft) + inset, Y(kBodyTop) + inset};
    const DialPoint bottom_right = {X(kBodyRight) - inset, Y(kBodyBottom) - inset};
    if (top_left.x >= bottom_right.x || top_left.y >= bottom_right.y) return;
    const bool body = part == DialPart::kBody;
    elements_.push_back({.part = part,
                         .shape = DialShape::kBox,
                         .from = top_left,
                         .to = bottom_right,
                         .fill = fill,
                         .outline = kBodyOutline,
                         .line_width = body ? static_cast<double>(sizes_.outline) : 0,
                         // Keeps the inner body visible where it covers the arcs.
                         .outline_width = body ? 0 : kBaseLineWidth});
  }

  // The degrees say on which side of the circle the servo travels, the drawing angles do not. The pie is the same
  // whichever end is stored first.
  void AddPie(DialPart part, const Arc& arc, double radius, DialColour fill) {
    if (radius <= 0) return;
    const auto degrees = static_cast<double>(std::min<std::int64_t>(std::abs(arc.clockwise), 360));
    elements_.push_back({.part = part,
                         .shape = DialShape::kPie,
                         .from = Centre(),
                         .radius = radius,
                         .start_angle = Drawable(RightEnd(arc)),
                         .sweep_angle = degrees / 180 * kDialPi,
                         .fill = fill,
                         .outline = kBodyOutline,
                         .line_width = kBaseLineWidth});
  }

  void AddRadius(DialPart part, double angle, double width, DialColour fill) {
    const double length = Half() - sizes_.arm;
    if (length <= 0) return;
    const DialPoint centre = Centre();
    const double drawn = Drawable(angle);
    const bool outline = part == DialPart::kDefaultMarkerOutline;
    const double dark_outline = part == DialPart::kArm             ? kPointerOutlineWidth
                                : part == DialPart::kDefaultMarker ? kBaseLineWidth + kPointerOutlineWidth
                                                                   : 0;
    elements_.push_back({.part = part,
                         .shape = outline ? DialShape::kLineOutline : DialShape::kLine,
                         .from = centre,
                         .to = {centre.x + length * std::cos(drawn), centre.y - length * std::sin(drawn)},
                         .fill = fill,
                         .outline = kPointerOutline,
                         .line_width = width,
                         .outline_width = outline ? kBaseLineWidth : dark_outline});
  }

  void AddText(DialPart part, DialPoint middle_top, double room, DialColour plate, std::string_view text) {
    if (text.empty() || room <= 0) return;
    elements_.push_back({.part = part,
                         .shape = DialShape::kText,
                         .from = middle_top,
                         .fill = plate,
                         .room = room,
                         .text = std::string(text)});
  }

  std::vector<DialElement> TakeElements() { return std::move(elements_); }

 private:
  DialPoint Centre() const { return {X(0.5), Y(0.5)}; }

  const DialSizes& sizes_;
  // The part of the picture that is drawn in.
  const double width_, height_, left_, top_;
  std::vector<DialElement> elements_;
};

ServoDial::ServoDial() {
  ResetAfterResize();
  SetStops(45, -45);
}

double ServoDial::Convert(std::int32_t degrees) {
  if (degrees < 0) degrees = 360 - Checked(-static_cast<std::int64_t>(degrees)) % 360;
  std::int32_t angle = 360 - Checked(static_cast<std::int64_t>(degrees) + 270) % 360;
  if (angle == 360) angle = 0;
  return angle / 180.0 * kDialPi;
}

std::int32_t ServoDial::ToDegrees(Microseconds pulse) const {
  const std::int32_t below_neutral = Checked(static_cast<std::int64_t>(neutral_pulse_) - pulse);
  return RoundHalfToEven(below_neutral / kMicrosecondsPerDegree);
}

ServoDial::Arc ServoDial::ArcOf(std::int32_t first, std::int32_t second) {
  return {Convert(first), Convert(second), static_cast<std::int64_t>(second) - first};
}

ServoDial::Arc ServoDial::ArcOfUS(Microseconds first, Microseconds second) const {
  // The other way round than in degrees on purpose: callers pass the lower pulse width first.
  return ArcOf(ToDegrees(second), ToDegrees(first));
}

void ServoDial::SetMovingArm(std::int32_t degrees) {
  arm_angle_ = Convert(degrees);
  arm_pulse_ = neutral_pulse_ - static_cast<std::int64_t>(kMicrosecondsPerDegree) * degrees;
}

void ServoDial::SetMovingArmPositionUS(Microseconds pulse) {
  arm_angle_ = Convert(ToDegrees(pulse));
  arm_pulse_ = pulse;
}

void ServoDial::SetNeutralPositionUS(Microseconds pulse) {
  // In this order: the old neutral pulse places the marker, the new one everything that follows.
  neutral_angle_ = Convert(ToDegrees(kCentrePulseWidth));
  neutral_pulse_ = pulse;
}

void ServoDial::DisplaySize(std::int32_t size) {
  sizes_ = size == 1 ? kSmallSizes : size == 2 ? kMediumSizes : kNormalSizes;
}

void ServoDial::ResetAfterResize() {
  SetRange(95, -95);
  SetLimit(50, -50);
  SetMovingArm(0);
}

std::vector<DialElement> ServoDial::Draw(std::int32_t width, std::int32_t height) {
  if (range_.start == 0) range_.start = kNearlyZeroRange;
  if (range_.end == 0) range_.end = kNearlyZeroRange;

  Picture picture(width, height, sizes_);
  const double outer = picture.Half() - (sizes_.margin - sizes_.arm);
  picture.AddBox(DialPart::kBody, 0, kBodyFill);
  picture.AddPie(DialPart::kRangeArc, range_, outer, kRangeFill);
  picture.AddPie(DialPart::kLimitArc, limit_, outer - sizes_.arm, kLimitFill);
  picture.AddBox(DialPart::kInnerBody, kInnerBodyInset, kInnerBodyFill);
  picture.AddPie(DialPart::kStopsArc, stops_, outer - sizes_.margin, kStopsFill);
  if (default_angle_ && sizes_.marker > 0) {
    picture.AddRadius(DialPart::kDefaultMarker, *default_angle_, sizes_.marker, kDefaultFill);
    picture.AddRadius(DialPart::kDefaultMarkerOutline, *default_angle_, sizes_.marker, kDefaultOutline);
  }
  if (neutral_angle_ && sizes_.marker > 0)
    picture.AddRadius(DialPart::kNeutralMarker, *neutral_angle_, sizes_.marker, kNeutralFill);
  picture.AddRadius(DialPart::kArm, arm_angle_, sizes_.arm + kBaseLineWidth, kArmFill);
  if (display_servo_text_) {
    AddAngleTexts(picture);
  } else {
    // The caption is a label above the picture, so it comes last.
    picture.AddText(DialPart::kCaption, {picture.X(0.5), picture.Y(kCaptionTop)},
                    (kBodyRight - kBodyLeft) * picture.Width() - sizes_.outline, kInnerBodyFill, caption_);
  }
  return picture.TakeElements();
}

void ServoDial::AddAngleTexts(Picture& picture) const {
  // The two ends of each arc are left and right of the body, arm and markers on it. The small picture has room for the
  // numbers only: the colours of the plates tell them apart.
  const bool with_names = sizes_ != kSmallSizes;
  const double column = picture.Width() / 3 - 2 * kInnerBodyInset;
  const auto add = [&](double middle, int row, const char* name, double angle, DialColour plate) {
    const std::string text = (with_names ? std::string(name) + " " : std::string()) + DegreesText(angle);
    picture.AddText(DialPart::kAngleText, {picture.X(middle), picture.Y(kTextTop + row * kTextRow)}, column,
                    plate, text);
  };
  const auto add_arc = [&](int row, const char* name, const Arc& arc, DialColour plate) {
    add(1.0 / 6, row, name, LeftEnd(arc), plate);
    add(5.0 / 6, row, name, RightEnd(arc), plate);
  };
  add_arc(0, "Range", range_, kRangeFill);
  add_arc(1, "Limit", limit_, kLimitFill);
  add_arc(2, "Stops", stops_, kStopsFill);
  add(0.5, 0, "Arm", arm_angle_, kBodyFill);
  if (neutral_angle_ && sizes_.marker > 0) add(0.5, 1, "Neutral", *neutral_angle_, kBodyFill);
  if (default_angle_ && sizes_.marker > 0) add(0.5, 2, "Default", *default_angle_, kDefaultFill);
}

}  // namespace tendril
