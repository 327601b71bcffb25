// ServoDial: the state of a drawn servo, and the geometry of its picture.
//
// Servo degrees are whole numbers: 0 is straight up, positive turns clockwise (to the right). Drawing angles are
// radians, counterclockwise from 3 o'clock, computed with kDialPi. A longer pulse turns the arm to the left.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "config/channel_config.h"

namespace tendril {

// The approximation of pi in every drawing angle. It is less exact than it could be on purpose.
inline constexpr double kDialPi = 3.141592653238;

// A colour as 0x00BBGGRR.
using DialColour = std::uint32_t;
inline constexpr DialColour kArmFill = 0x0000FF;
inline constexpr DialColour kRangeFill = 0x80FFFF;
inline constexpr DialColour kLimitFill = 0x00C0C0;
inline constexpr DialColour kStopsFill = 0xFFC0C0;
inline constexpr DialColour kNeutralFill = 0x000000;
inline constexpr DialColour kDefaultFill = 0xC0C0FF;
inline constexpr DialColour kDefaultOutline = 0xFFFFFF;
inline constexpr DialColour kInnerBodyFill = 0xD0D0D0;
inline constexpr DialColour kBodyOutline = 0x707070;
inline constexpr DialColour kSelectedBackground = 0xFF0000;  // blue

// A row of drawing sizes, in device-independent units.
struct DialSizes {
  std::int32_t arm;      // width of the arm, and the step from one radius to the next smaller one
  std::int32_t marker;   // width of the marker lines; 0 draws none
  std::int32_t margin;   // less `arm`, the space between the outer arc and the edge of the picture
  std::int32_t outline;  // line width of the outline of the servo body
  friend bool operator==(const DialSizes&, const DialSizes&) = default;
};
inline constexpr DialSizes kSmallSizes = {3, 0, 6, 2};
inline constexpr DialSizes kMediumSizes = {5, 1, 10, 4};
inline constexpr DialSizes kNormalSizes = {8, 2, 20, 4};

struct DialPoint {
  double x = 0;
  double y = 0;
};

// The parts of the picture.
enum class DialPart {
  kBody,
  kRangeArc,
  kLimitArc,
  kInnerBody,
  kStopsArc,
  kDefaultMarker,
  kDefaultMarkerOutline,
  kNeutralMarker,
  kArm,
  kAngleText,
  kCaption,
};

// How an element is drawn.
enum class DialShape {
  kBox,          // filled, from `from` (top left) to `to` (bottom right)
  kPie,          // filled, around `from`, with its two radii
  kLine,         // from `from` to `to`
  kLineOutline,  // the contour of the same line, outside it
  kText,         // one line of black text on a plate, `from` the middle of its top edge
};

// One element of the picture. Positions are device-independent units from the top left corner of the picture.
struct DialElement {
  DialPart part{};
  DialShape shape{};
  DialPoint from{};
  DialPoint to{};            // box and lines
  double radius = 0;         // pie
  double start_angle = 0;    // pie: radians; the pie lies counterclockwise from here
  double sweep_angle = 0;    // pie: radians, 0 or more
  DialColour fill = 0;       // box and pie: the area; lines: the stroke; text: the plate
  DialColour outline = 0;    // box, pie and line
  double line_width = 0;     // lines: of the line; box and pie: of the outline centred on the edge
  double outline_width = 0;  // box, line and line outline: of the outline outside the edge
  double room = 0;           // text: the width that it should not exceed while it stays readable
  std::string text{};        // UTF-8
};

// The state of one drawn servo. Pulse widths are microseconds. Every operation that converts raises
// RuntimeError(kErrOverflow) where 32-bit arithmetic overflows, and then changes nothing.
class ServoDial {
 public:
  struct Arc {
    double start = 0;  // drawing angles
    double end = 0;
    std::int64_t clockwise = 0;  // servo degrees from start to end; negative counterclockwise
  };

  ServoDial();

  // The drawing angle of `degrees`: at least 0 and less than a full turn.
  static double Convert(std::int32_t degrees);
  // Servo degrees of a pulse width, measured from the current neutral pulse; a half is rounded to the even degree.
  std::int32_t ToDegrees(Microseconds pulse) const;

  // The arcs. The ...US forms take the lower pulse width first, which is the reverse order of the forms in degrees.
  void SetRange(std::int32_t first, std::int32_t second) { range_ = ArcOf(first, second); }
  void SetRangeUS(Microseconds first, Microseconds second) { range_ = ArcOfUS(first, second); }
  void SetLimit(std::int32_t first, std::int32_t second) { limit_ = ArcOf(first, second); }
  void SetLimitUS(Microseconds first, Microseconds second) { limit_ = ArcOfUS(first, second); }
  void SetStops(std::int32_t first, std::int32_t second) { stops_ = ArcOf(first, second); }
  void SetStopsUS(Microseconds first, Microseconds second) { stops_ = ArcOfUS(first, second); }

  // The arm.
  void SetMovingArm(std::int32_t degrees);
  void SetMovingArmPositionUS(Microseconds pulse);

  // The markers. Once set they stay visible.
  void SetNeutralPosition(std::int32_t degrees) { neutral_angle_ = Convert(degrees); }
  void SetDefaultPosition(std::int32_t degrees) { default_angle_ = Convert(degrees); }
  // Places the marker where 1500 is under the neutral pulse so far. From then on `pulse` is 0 degrees.
  void SetNeutralPositionUS(Microseconds pulse);
  void SetDefaultPositionUS(Microseconds pulse) { default_angle_ = Convert(ToDegrees(pulse)); }

  // Selects the row of drawing sizes: 1 small, 2 medium, any other value normal.
  void DisplaySize(std::int32_t size);
  void DisplayCaption(std::string_view text) { caption_ = text; }
  void SelectServo(bool selected) { selected_ = selected; }
  void SetDisplayServoText(bool display) { display_servo_text_ = display; }
  // The effect of a resize: range and limit get their initial values, the arm 0 degrees.
  void ResetAfterResize();

  bool DisplayServoText() const { return display_servo_text_; }
  bool selected() const { return selected_; }
  const std::string& caption() const { return caption_; }
  const DialSizes& sizes() const { return sizes_; }
  Microseconds neutral_pulse() const { return neutral_pulse_; }
  double arm_angle() const { return arm_angle_; }
  const std::optional<double>& neutral_angle() const { return neutral_angle_; }
  const std::optional<double>& default_angle() const { return default_angle_; }
  const Arc& range() const { return range_; }
  const Arc& limit() const { return limit_; }
  const Arc& stops() const { return stops_; }
  // The pulse width of the arm: the one given, or that of the degrees given.
  std::int64_t arm_pulse() const { return arm_pulse_; }

  // The picture of `width` by `height` units, in drawing order. An element that does not fit is left out. Replaces a
  // range angle of exactly 0 in the state.
  std::vector<DialElement> Draw(std::int32_t width, std::int32_t height);

 private:
  class Picture;

  static Arc ArcOf(std::int32_t first, std::int32_t second);
  Arc ArcOfUS(Microseconds first, Microseconds second) const;
  void AddAngleTexts(Picture& picture) const;

  bool display_servo_text_ = false;
  bool selected_ = false;
  std::string caption_;
  double arm_angle_ = 0;
  std::int64_t arm_pulse_ = 0;
  Microseconds neutral_pulse_ = kCentrePulseWidth;
  std::optional<double> neutral_angle_;  // of the marker
  std::optional<double> default_angle_;
  Arc range_;
  Arc limit_;
  Arc stops_;
  DialSizes sizes_ = kNormalSizes;
};

}  // namespace tendril
