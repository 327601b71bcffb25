#include "simulator/servo_dial.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <limits>

#include "platform/rounding.h"
#include "platform/runtime_error.h"

namespace tendril {
namespace {

constexpr std::int32_t kCentrePulse = 1500;

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
// A picture longer than this many times its other side is drawn in its middle part only, so that no servo is
// stretched beyond recognition.
constexpr double kMaxAspect = 2;

// The host's arcs take every angle negated, and minus zero is no negative number: an angle of exactly 0 is
// moved by an amount that nobody sees.
constexpr double kNearlyZeroAngle = 0.00001 * kDialPi;
constexpr double kNearlyZeroRange = 1e-08;

std::int32_t Checked(std::int64_t value) {
  if (value < std::numeric_limits<std::int32_t>::min() || value > std::numeric_limits<std::int32_t>::max()) {
    throw RuntimeError(kErrOverflow, "Overflow");
  }
  return static_cast<std::int32_t>(value);
}

double Drawable(double angle) { return angle == 0 ? kNearlyZeroAngle : angle; }

// The angle of the drawing angle `angle` (0 to a full turn) from straight up, counterclockwise, more than minus half a
// turn up to half a turn.
double FromTop(double angle) {
  const double from_top = angle - kDialPi / 2;
  return from_top > kDialPi ? from_top - 2 * kDialPi : from_top;
}

DialColour ColourOf(DialInk ink) { return kDialColours.at(static_cast<std::size_t>(ink)); }

// A drawing angle in servo degrees with its sign: "+50°", "0°", "−50°" (with the true minus sign).
std::string DegreesText(double angle) {
  const long degrees = std::lround(-FromTop(angle) / kDialPi * 180);
  const char* sign = degrees > 0 ? "+" : degrees < 0 ? "\u2212" : "";
  return sign + std::to_string(std::labs(degrees)) + "\u00B0";
}

}  // namespace

// The part of the picture that is drawn in: the whole of it unless it is very long.
struct ServoDial::Frame {
  double left;
  double top;
  double width;
  double height;

  double X(double fraction) const { return left + fraction * width; }
  double Y(double fraction) const { return top + fraction * height; }
  DialPoint Centre() const { return {X(0.5), Y(0.5)}; }
  // Half the height; half the width where that is less, so that no arc is cut.
  double Half() const { return std::min(width, height) / 2; }
};

ServoDial::ServoDial() {
  SetRange(95, -95);
  SetLimit(50, -50);
  SetStops(45, -45);
  SetMovingArm(0);
  DisplaySize(0);
}

double ServoDial::Convert(std::int32_t degrees) {
  if (degrees < 0) degrees = 360 - Checked(-static_cast<std::int64_t>(degrees)) % 360;
  std::int32_t angle = 360 - Checked(static_cast<std::int64_t>(degrees) + 270) % 360;
  if (angle == 360) angle = 0;
  return angle / 180.0 * kDialPi;
}

std::int32_t ServoDial::ToDegrees(std::int32_t microseconds) const {
  const std::int32_t below_neutral = Checked(static_cast<std::int64_t>(neutral_pulse_) - microseconds);
  return RoundHalfToEven(below_neutral / kMicrosecondsPerDegree);
}

ServoDial::Arc ServoDial::ArcOf(std::int32_t first, std::int32_t second) {
  return {Convert(first), Convert(second), static_cast<std::int64_t>(second) - first};
}

ServoDial::Arc ServoDial::ArcOfUS(std::int32_t first, std::int32_t second) const {
  // Deliberately the other way round than in degrees: callers pass the lower pulse width first.
  return ArcOf(ToDegrees(second), ToDegrees(first));
}

void ServoDial::SetRange(std::int32_t first, std::int32_t second) { range_ = ArcOf(first, second); }

void ServoDial::SetRangeUS(std::int32_t first, std::int32_t second) { range_ = ArcOfUS(first, second); }

void ServoDial::SetLimit(std::int32_t first, std::int32_t second) {
  limit_ = ArcOf(first, second);
  limit_shown_ = true;
}

void ServoDial::SetLimitUS(std::int32_t first, std::int32_t second) {
  limit_ = ArcOfUS(first, second);
  limit_shown_ = true;
}

void ServoDial::SetStops(std::int32_t first, std::int32_t second) {
  stops_ = ArcOf(first, second);
  stops_shown_ = true;
}

void ServoDial::SetStopsUS(std::int32_t first, std::int32_t second) {
  stops_ = ArcOfUS(first, second);
  stops_shown_ = true;
}

void ServoDial::SetMovingArm(std::int32_t degrees) {
  arm_angle_ = Convert(degrees);
  arm_pulse_ = neutral_pulse_ - static_cast<std::int64_t>(kMicrosecondsPerDegree) * degrees;
}

void ServoDial::SetMovingArmPositionUS(std::int32_t microseconds) {
  arm_angle_ = Convert(ToDegrees(microseconds));
  arm_pulse_ = microseconds;
}

void ServoDial::SetNeutralPosition(std::int32_t degrees) {
  neutral_shown_ = true;
  neutral_angle_ = Convert(degrees);
}

void ServoDial::SetDefaultPosition(std::int32_t degrees) {
  default_shown_ = true;
  default_angle_ = Convert(degrees);
}

void ServoDial::SetNeutralPositionUS(std::int32_t microseconds) {
  // In exactly this order: the marker is placed by the old neutral pulse, everything later by the new one.
  neutral_shown_ = true;
  neutral_angle_ = Convert(ToDegrees(kCentrePulse));
  neutral_pulse_ = microseconds;
}

void ServoDial::SetDefaultPositionUS(std::int32_t microseconds) {
  default_shown_ = true;
  default_angle_ = Convert(ToDegrees(microseconds));
}

void ServoDial::DisplaySize(std::int32_t size) {
  sizes_ = size == 1 ? kSmallSizes : size == 2 ? kMediumSizes : kNormalSizes;
}

void ServoDial::ResetAfterResize() {
  SetRange(95, -95);
  SetLimit(50, -50);
  SetMovingArm(0);
}

const std::vector<DialElement>& ServoDial::Draw(std::int32_t width, std::int32_t height) {
  if (range_.start == 0) range_.start = kNearlyZeroRange;
  if (range_.end == 0) range_.end = kNearlyZeroRange;

  const double frame_width = std::min<double>(width, height * kMaxAspect);
  const double frame_height = std::min<double>(height, width * kMaxAspect);
  const Frame frame = {(width - frame_width) / 2, (height - frame_height) / 2, frame_width, frame_height};
  const double outer = frame.Half() - (sizes_.margin - sizes_.arm);

  elements_.clear();
  AddBox(DialPart::kBody, frame, 0, kBodyFill);
  AddPie(DialPart::kRangeArc, frame, range_, outer, DialInk::kRange);
  if (limit_shown_) AddPie(DialPart::kLimitArc, frame, limit_, outer - sizes_.arm, DialInk::kLimit);
  AddBox(DialPart::kInnerBody, frame, kInnerBodyInset, kInnerBodyFill);
  if (stops_shown_) AddPie(DialPart::kStopsArc, frame, stops_, outer - sizes_.margin, DialInk::kStops);
  if (default_shown_ && sizes_.marker > 0) {
    AddRadius(DialPart::kDefaultMarker, frame, default_angle_, sizes_.marker, DialInk::kDefault);
    AddRadius(DialPart::kDefaultMarkerOutline, frame, default_angle_, sizes_.marker,
              DialInk::kDefaultOutline);
  }
  if (neutral_shown_ && sizes_.marker >= 1) {
    AddRadius(DialPart::kNeutralMarker, frame, neutral_angle_, sizes_.marker, DialInk::kNeutral);
  }
  AddRadius(DialPart::kArm, frame, arm_angle_, sizes_.arm + kBaseLineWidth, DialInk::kArm);
  if (display_servo_text_) {
    AddAngleTexts(frame);
  } else {
    // The caption is a label above the picture, so it comes after everything that is painted on the picture.
    AddText(DialPart::kCaption, {frame.X(0.5), frame.Y(kCaptionTop)},
            (kBodyRight - kBodyLeft) * frame.width - sizes_.outline, kInnerBodyFill, caption_);
  }
  return elements_;
}

DialElement& ServoDial::Add(DialPart part, DialShape shape, DialColour fill) {
  DialElement& element = elements_.emplace_back();
  element.part = part;
  element.shape = shape;
  element.fill = fill;
  return element;
}

void ServoDial::AddBox(DialPart part, const Frame& frame, double inset, DialColour fill) {
  const DialPoint top_left = {frame.X(kBodyLeft) + inset, frame.Y(kBodyTop) + inset};
  const DialPoint bottom_right = {frame.X(kBodyRight) - inset, frame.Y(kBodyBottom) - inset};
  if (top_left.x >= bottom_right.x || top_left.y >= bottom_right.y) return;
  DialElement& box = Add(part, DialShape::kBox, fill);
  box.from = top_left;
  box.to = bottom_right;
  box.outline = kBodyOutline;
  if (part == DialPart::kBody) {
    box.line_width = sizes_.outline;
  } else {
    box.outline_width = kBaseLineWidth;  // keeps the case visible where it covers the arcs
  }
}

void ServoDial::AddPie(DialPart part, const Frame& frame, const Arc& arc, double radius, DialInk ink) {
  if (radius <= 0) return;
  // The drawing angles do not say on which side of the circle the servo travels; the degrees do. That makes the arc
  // the same whichever of its two ends is stored first.
  DialElement& pie = Add(part, DialShape::kPie, ColourOf(ink));
  pie.from = frame.Centre();
  pie.radius = radius;
  pie.start_angle = Drawable(arc.RightEnd());
  pie.sweep_angle = static_cast<double>(std::min<std::int64_t>(std::abs(arc.clockwise), 360)) / 180 * kDialPi;
  pie.outline = kBodyOutline;
  pie.line_width = kBaseLineWidth;
}

void ServoDial::AddRadius(DialPart part, const Frame& frame, double angle, double width, DialInk ink) {
  const double length = frame.Half() - sizes_.arm;
  if (length <= 0) return;
  const DialPoint centre = frame.Centre();
  const double drawn = Drawable(angle);
  const bool contour = part == DialPart::kDefaultMarkerOutline;
  DialElement& line = Add(part, contour ? DialShape::kLineOutline : DialShape::kLine, ColourOf(ink));
  line.from = centre;
  line.to = {centre.x + length * std::cos(drawn), centre.y - length * std::sin(drawn)};
  line.line_width = width;
  if (contour) line.outline_width = kBaseLineWidth;
}

void ServoDial::AddText(DialPart part, DialPoint middle_top, double room, DialColour plate,
                        std::string_view text) {
  if (text.empty() || room <= 0) return;
  DialElement& element = Add(part, DialShape::kText, plate);
  element.from = middle_top;
  element.room = room;
  element.text = text;
}

void ServoDial::AddAngleTexts(const Frame& frame) {
  // Left and right of the body the two ends of each arc, on the body the arm and the markers. The small
  // picture has room for the numbers only; the plates' colours tell them apart.
  const bool with_names = sizes_ != kSmallSizes;
  const double column = frame.width / 3 - 2 * kInnerBodyInset;
  const auto add = [&](double middle, int row, const char* name, double angle, DialColour plate) {
    const std::string text = (with_names ? std::string(name) + " " : std::string()) + DegreesText(angle);
    AddText(DialPart::kAngleText, {frame.X(middle), frame.Y(kTextTop + row * kTextRow)}, column, plate, text);
  };
  const auto add_arc = [&](int row, const char* name, const Arc& arc, DialInk ink) {
    add(1.0 / 6, row, name, arc.LeftEnd(), ColourOf(ink));
    add(5.0 / 6, row, name, arc.RightEnd(), ColourOf(ink));
  };
  add_arc(0, "Range", range_, DialInk::kRange);
  if (limit_shown_) add_arc(1, "Limit", limit_, DialInk::kLimit);
  if (stops_shown_) add_arc(2, "Stops", stops_, DialInk::kStops);
  add(0.5, 0, "Arm", arm_angle_, kBodyFill);
  if (neutral_shown_ && sizes_.marker >= 1) add(0.5, 1, "Neutral", neutral_angle_, kBodyFill);
  if (default_shown_ && sizes_.marker > 0)
    add(0.5, 2, "Default", default_angle_, ColourOf(DialInk::kDefault));
}

}  // namespace tendril
