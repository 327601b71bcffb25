// The geometry of the pulse scale: one axis in microseconds, and what the editor shows on it.
//
//                  default  neutral
//    Actual  [600     |        |            2400]
//   Virtual        [1100       |      2100]
//     Stops           [1250    |      2100]
//            |------------|------------|----------|
//      µs   500          1000         1500 ...
//            shorter pulse            longer pulse
#pragma once

#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "config/channel_config.h"

namespace tendril {

// What an element of the scale stands for.
enum class ScalePart { kAxis, kActual, kVirtual, kStops, kDefault, kNeutral, kArm };

// How an element is drawn.
enum class ScaleShape {
  kBar,        // filled, with an outline inside its edge
  kLine,       // filled
  kNumber,     // text on the bar of its part
  kText,       // text beside the bars
  kTurnRight,  // an arrow that turns to the right
  kTurnLeft,
};

// One element. Positions are device-independent units from the top left corner of the scale.
struct ScaleElement {
  double Right() const { return x + width; }
  double Bottom() const { return y + height; }

  ScalePart part{};
  ScaleShape shape{};
  double x = 0;
  double y = 0;
  double width = 0;
  double height = 0;
  std::string text{};  // UTF-8
};

// What the scale shows.
struct ScaleValues {
  ChannelConfig shown;  // only its pulse fields are valid
  Microseconds arm = kCentrePulseWidth;
  friend bool operator==(const ScaleValues&, const ScaleValues&) = default;
};

// The room for the scale, in device-independent units, and the type that it is written in.
struct ScaleRoom {
  double width = 0;
  double height = 0;
  double line_height = 0;
  std::function<double(const std::string&)> text_width;
};

// Widths of the lines, including their edges.
inline constexpr double kMarkerLine = 4;
inline constexpr double kArmLine = 5;

// The height at which the texts just fit, and the one at which the bars stop growing.
double MinimumScaleHeight(double line_height);
double MaximumScaleHeight(double line_height);
// The width at which the texts below the axis just fit.
double MinimumScaleWidth(const ScaleRoom& room);

// The elements in drawing order. The axis spans 500 to 2500 µs, or more when a value lies outside. Lines leave out the
// texts that they would cross. Without values there is only the axis.
std::vector<ScaleElement> LayOutPulseScale(const std::optional<ScaleValues>& values, const ScaleRoom& room);

}  // namespace tendril
