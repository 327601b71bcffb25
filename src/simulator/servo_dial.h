// ServoDial: what a drawn servo shows, and the geometry of its picture.
//
// Servo degrees are whole numbers, 0 straight up, positive clockwise (to the right). Drawing angles are
// radians, counterclockwise from 3 o'clock, made with the program's own pi. A longer pulse turns the arm to
// the left.
#pragma once

#include <array>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace tendril {

// The approximation of pi behind every drawing angle. It is kept as it stands on purpose.
inline constexpr double kDialPi = 3.141592653238;

// A colour as the colour table holds it: 0x00BBGGRR.
using DialColour = std::uint32_t;

// The colour table, in its stored order.
enum class DialInk {
  kArm,
  kDefaultOutline,
  kRange,
  kLimit,
  kStops,
  kSpareBlack,  // stored, drawn by nothing
  kSpareWhite,  // stored, drawn by nothing
  kNeutral,
  kDefault,
};
inline constexpr std::array<DialColour, 9> kDialColours = {0x0000FF, 0xFFFFFF, 0x80FFFF, 0x00C0C0, 0xFFC0C0,
                                                           0x000000, 0xFFFFFF, 0x000000, 0xC0C0FF};
inline constexpr DialColour kBodyFill = 0xE0E0E0;
inline constexpr DialColour kBodyOutline = 0x707070;
inline constexpr DialColour kInnerBodyFill = 0xD0D0D0;
inline constexpr DialColour kSelectedBackground = 0xFF0000;  // blue

// A row of drawing sizes, in device-independent units.
struct DialSizes {
  std::int32_t arm;      // width of the arm, and the step from one radius to the next smaller one
  std::int32_t marker;   // width of the marker lines; 0 draws none
  std::int32_t margin;   // less `arm`, the space between the outer arc and the picture's edge
  std::int32_t spare;    // stored, drawn by nothing
  std::int32_t outline;  // line width of the servo body's outline
  friend bool operator==(const DialSizes&, const DialSizes&) = default;
};
inline constexpr DialSizes kSmallSizes = {3, 0, 6, 2, 2};
inline constexpr DialSizes kMediumSizes = {5, 1, 10, 3, 4};
inline constexpr DialSizes kNormalSizes = {8, 2, 20, 6, 4};

struct DialPoint {
  double x = 0;
  double y = 0;
};

// What an element of the picture stands for.
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

// One element of the picture. Lengths are device-independent units from the picture's top left corner.
struct DialElement {
  DialPart part{};
  DialShape shape{};
  DialPoint from{};
  DialPoint to{};            // box and lines
  double radius = 0;         // pie
  double start_angle = 0;    // pie: it lies counterclockwise from here, radians
  double sweep_angle = 0;    // pie: radians, 0 or more
  DialColour fill = 0;       // box and pie: the area; lines: the stroke; text: the plate
  DialColour outline = 0;    // box and pie
  double line_width = 0;     // lines: of the line; box and pie: of the outline that straddles the edge
  double outline_width = 0;  // box and line outline: of the outline that lies outside the edge
  double room = 0;           // text: the width that it should keep to while it can be read
  std::string text;          // UTF-8
};

// The state of one drawn servo. Pulse widths are microseconds. Every operation that converts raises
// RuntimeError(kErrOverflow) where 32-bit arithmetic overflows; the angle that it would have set stays as it
// was.
class ServoDial {
 public:
  static constexpr double kMicrosecondsPerDegree = 10.0;

  ServoDial();

  // The drawing angle of `degrees`, 0 or more and less than a full turn.
  static double Convert(std::int32_t degrees);
  // Servo degrees of a pulse width under the neutral pulse now in force; a half rounds to the even degree.
  std::int32_t ToDegrees(std::int32_t microseconds) const;

  // The arcs. The ...US forms store their two angles in the reverse order of the forms in degrees.
  void SetRange(std::int32_t first, std::int32_t second);
  void SetRangeUS(std::int32_t first, std::int32_t second);
  void SetLimit(std::int32_t first, std::int32_t second);
  void SetLimitUS(std::int32_t first, std::int32_t second);
  void SetStops(std::int32_t first, std::int32_t second);
  void SetStopsUS(std::int32_t first, std::int32_t second);

  // The arm.
  void SetMovingArm(std::int32_t degrees);
  void SetMovingArmPositionUS(std::int32_t microseconds);

  // The markers. Once set they stay shown.
  void SetNeutralPosition(std::int32_t degrees);
  void SetDefaultPosition(std::int32_t degrees);
  // Puts the marker where 1500 lay under the neutral pulse so far; `microseconds` then means 0 degrees for
  // every later conversion.
  void SetNeutralPositionUS(std::int32_t microseconds);
  void SetDefaultPositionUS(std::int32_t microseconds);

  // Takes the row of drawing sizes: 1 small, 2 medium, any other value normal.
  void DisplaySize(std::int32_t size);
  void DisplayCaption(std::string_view text) { caption_ = text; }
  void SelectServo(bool selected) { selected_ = selected; }
  void SetDisplayServoText(bool display) { display_servo_text_ = display; }
  // What a resize does: range and limit back to their first values, the arm to 0 degrees.
  void ResetAfterResize();

  bool DisplayServoText() const { return display_servo_text_; }
  bool selected() const { return selected_; }
  const std::string& caption() const { return caption_; }
  const DialSizes& sizes() const { return sizes_; }
  std::int32_t neutral_pulse() const { return neutral_pulse_; }
  double arm_angle() const { return arm_angle_; }
  double neutral_angle() const { return neutral_angle_; }
  double default_angle() const { return default_angle_; }
  double range_start() const { return range_.start; }
  double range_end() const { return range_.end; }
  double limit_start() const { return limit_.start; }
  double limit_end() const { return limit_.end; }
  double stops_start() const { return stops_.start; }
  double stops_end() const { return stops_.end; }
  // The pulse width that the arm stands for: the one given, or that of the degrees given.
  std::int64_t arm_pulse() const { return arm_pulse_; }

  // The picture of `width` by `height` units, in order of drawing. An element that has no room is left out.
  // A range angle of exactly 0 is replaced in the state. The list is valid until the next call.
  const std::vector<DialElement>& Draw(std::int32_t width, std::int32_t height);

 private:
  struct Arc {
    double start = 0;  // drawing angles
    double end = 0;
    std::int64_t clockwise = 0;  // servo degrees from start to end; negative counterclockwise

    // The ends as an observer at the centre sees them.
    double LeftEnd() const { return clockwise > 0 ? start : end; }
    double RightEnd() const { return clockwise > 0 ? end : start; }
  };
  struct Frame;  // the measures of one picture

  static Arc ArcOf(std::int32_t first, std::int32_t second);
  Arc ArcOfUS(std::int32_t first, std::int32_t second) const;
  DialElement& Add(DialPart part, DialShape shape, DialColour fill);
  void AddBox(DialPart part, const Frame& frame, double inset, DialColour fill);
  void AddPie(DialPart part, const Frame& frame, const Arc& arc, double radius, DialInk ink);
  void AddRadius(DialPart part, const Frame& frame, double angle, double width, DialInk ink);
  void AddText(DialPart part, DialPoint middle_top, double room, DialColour plate, std::string_view text);
  void AddAngleTexts(const Frame& frame);

  bool display_servo_text_ = false;
  bool selected_ = false;
  std::string caption_;
  double arm_angle_ = 0;
  std::int64_t arm_pulse_ = 0;
  bool neutral_shown_ = false;
  double neutral_angle_ = 0;
  std::int32_t neutral_pulse_ = 1500;
  bool default_shown_ = false;
  double default_angle_ = 0;
  Arc range_;
  bool limit_shown_ = false;
  Arc limit_;
  bool stops_shown_ = false;
  Arc stops_;
  DialSizes sizes_{};
  std::vector<DialElement> elements_;
};

}  // namespace tendril
