// The pulse scale: what stands where, whatever the values are.
#include "ui/model/pulse_scale_layout.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cctype>
#include <map>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

namespace tendril {
namespace {

constexpr double kLine = 14;

// Actual range, virtual range, stops, neutral and default position, arm.
ScaleValues Values(PulsePair actual, PulsePair virtual_range, PulsePair stops, Microseconds neutral,
                   Microseconds default_position, Microseconds arm) {
  ChannelConfig shown;
  shown.ActualRange = actual;
  shown.VirtualRange = virtual_range;
  shown.VirtualStops = stops;
  shown.NeutralPosition = neutral;
  shown.DefaultPosition = default_position;
  return {shown, arm};
}

const ScaleValues kCases[] = {
    Values({600, 2400}, {1100, 2100}, {1250, 2100}, 1600, 1400, 1660),
    Values({500, 2500}, {500, 2500}, {500, 2500}, 2500, 2490, 500),
    Values({1500, 1500}, {1500, 1500}, {1500, 1500}, 1500, 1500, 1500),
    Values({600, 2400}, {2000, 1000}, {2000, 2000}, 1500, 1510, 1000),
    Values({10, 2550}, {10, 2550}, {10, 10}, 10, 10, 2550),
    Values({2480, 2550}, {2550, 2550}, {2540, 2550}, 2550, 2540, 10),
    Values({600, 2400}, {1450, 1550}, {1490, 1500}, 1490, 1500, 1495),
};

std::vector<ScaleElement> LayOut(const ScaleValues& values, double width, double height) {
  const auto text_width = [](const std::string& text) { return 6.0 * static_cast<double>(text.size()); };
  return LayOutPulseScale(values, {width, height, kLine, text_width});
}

TEST(PulseScaleLayout, TextsAreFreeAndEverythingIsInside) {
  for (const ScaleValues& values : kCases) {
    for (const double width : {380.0, 640.0, 1200.0}) {
      const double height = width < 1000 ? MinimumScaleHeight(kLine) : MaximumScaleHeight(kLine);
      const auto elements = LayOut(values, width, height);
      for (const ScaleElement& text : elements) {
        EXPECT_TRUE(text.x >= 0 && text.Right() <= width && text.y >= 0 && text.Bottom() <= height)
            << text.text;
        if (text.text.empty()) continue;
        for (const ScaleElement& other : elements) {
          const bool own_bar = other.shape == ScaleShape::kBar && text.shape == ScaleShape::kNumber;
          const bool apart = text.x >= other.Right() || other.x >= text.Right() || text.y >= other.Bottom() ||
                             other.y >= text.Bottom();
          EXPECT_TRUE(apart || own_bar || &text == &other)
              << text.text << " and part " << static_cast<int>(other.part) << " " << other.text;
        }
      }
    }
  }
}

TEST(PulseScaleLayout, BarsAndLinesAreWhereTheNumbersOfTheAxisSay) {
  for (const ScaleValues& values : kCases) {
    std::map<ScalePart, std::pair<double, double>> ends;
    std::vector<std::pair<double, double>> numbers;
    for (const ScaleElement& element : LayOut(values, 700, 120)) {
      if (element.shape == ScaleShape::kBar || element.shape == ScaleShape::kLine)
        ends[element.part] = {element.x, element.Right()};
      if (element.part == ScalePart::kAxis && isdigit(element.text[0]) != 0)
        numbers.emplace_back(std::stod(element.text), element.x + element.width / 2);
    }
    const auto& first = numbers.front();
    const auto& last = numbers.back();
    const auto place = [&](double pulse) {
      return first.second + (last.second - first.second) * (pulse - first.first) / (last.first - first.first);
    };
    const ChannelConfig& shown = values.shown;
    for (const auto& [part, one, two] :
         {std::tuple(ScalePart::kActual, shown.ActualRange[0], shown.ActualRange[1]),
          {ScalePart::kVirtual, shown.VirtualRange[0], shown.VirtualRange[1]},
          {ScalePart::kStops, shown.VirtualStops[0], shown.VirtualStops[1]},
          {ScalePart::kNeutral, shown.NeutralPosition, shown.NeutralPosition},
          {ScalePart::kDefault, shown.DefaultPosition, shown.DefaultPosition},
          {ScalePart::kArm, values.arm, values.arm}}) {
      EXPECT_NEAR(ends.at(part).first, place(std::min(one, two)), kArmLine / 2 + 2) << static_cast<int>(part);
      EXPECT_NEAR(ends.at(part).second, place(std::max(one, two)), kArmLine / 2 + 2)
          << static_cast<int>(part);
    }
  }
}

}  // namespace
}  // namespace tendril
