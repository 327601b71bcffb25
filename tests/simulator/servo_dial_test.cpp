#include "simulator/servo_dial.h"

#include <gmock/gmock.h>

#include <limits>
#include <tuple>
#include <utility>
#include <vector>

#include "platform/runtime_error.h"

namespace tendril {
namespace {

using Numbers = std::vector<std::pair<std::int32_t, std::int32_t>>;

TEST(ServoDial, DegreesAndPulseWidths_BecomeDrawingAngles) {
  // Drawing angles in degrees.
  for (const auto& [degrees, expected] :
       Numbers{{0, 90}, {360, 90}, {-360, 90}, {90, 0}, {-90, 180}, {-450, 180}, {95, 355}, {-95, 185}}) {
    EXPECT_DOUBLE_EQ(ServoDial::Convert(degrees), expected / 180.0 * kDialPi) << degrees;
  }
  EXPECT_EQ(ServoDial::Convert(-90), 3.141592653238);
  EXPECT_THROW(ServoDial::Convert(std::numeric_limits<std::int32_t>::min()), RuntimeError);
  ServoDial dial;
  for (const auto& [pulse, degrees] :  // halves to even
       Numbers{{1500, 0}, {1000, 50}, {2000, -50}, {1505, 0}, {1495, 0}, {1515, -2}, {1485, 2}, {1506, -1}}) {
    EXPECT_EQ(dial.ToDegrees(pulse), degrees) << pulse;
  }
  dial.SetRangeUS(1000, 2000);
  dial.SetLimitUS(1100, 1900);
  dial.SetStopsUS(1200, 1800);
  EXPECT_EQ(dial.range().start, ServoDial::Convert(-50));
  EXPECT_EQ(dial.range().end, ServoDial::Convert(50));
  EXPECT_EQ(dial.limit().start, ServoDial::Convert(-40));
  EXPECT_EQ(dial.stops().start, ServoDial::Convert(-30));
}

TEST(ServoDial, NeutralPulse_IsMarkedByTheOldOneAndUsedFromThenOn) {
  ServoDial dial;
  dial.SetNeutralPositionUS(1520);
  EXPECT_EQ(dial.neutral_angle(), ServoDial::Convert(0));
  dial.SetMovingArmPositionUS(1520);
  EXPECT_EQ(dial.arm_angle(), ServoDial::Convert(0));
  dial.SetDefaultPositionUS(1500);
  EXPECT_EQ(dial.default_angle(), ServoDial::Convert(2));
  dial.SetNeutralPositionUS(1500);  // 1500 is 20 below the neutral pulse so far
  EXPECT_EQ(dial.neutral_angle(), ServoDial::Convert(2));
}

TEST(ServoDial, Picture_IsDrawnInItsOrderAndColours) {
  using Colours = std::vector<DialColour>;
  const Colours unmarked = {0xE0E0E0, 0x80FFFF, 0x00C0C0, 0xD0D0D0, 0xFFC0C0, 0x0000FF, 0xD0D0D0};
  const Colours marked = {0xE0E0E0, 0x80FFFF, 0x00C0C0, 0xD0D0D0, 0xFFC0C0,
                          0xC0C0FF, 0xFFFFFF, 0x000000, 0x0000FF, 0xD0D0D0};
  ServoDial dial;
  dial.DisplayCaption("CHAN 1");
  const auto drawn = [&] {
    Colours colours;
    for (const DialElement& element : dial.Draw(200, 200)) colours.push_back(element.fill);
    return colours;
  };
  EXPECT_EQ(drawn(), unmarked) << "no marker is set yet";
  dial.SetNeutralPosition(0);
  dial.SetDefaultPosition(10);
  for (const std::int32_t size : {2, 3, -1, 1}) {
    dial.DisplaySize(size);
    EXPECT_EQ(drawn(), size == 1 ? unmarked : marked);
  }
}

TEST(ServoDial, Arc_SpansItsDegreesInEitherOrder) {
  // The pulse widths; start and sweep in degrees.
  for (const auto& [low, high, start, sweep] : {std::tuple(600, 2400, 0, 180),
                                                {1000, 2000, 40, 100},
                                                {1700, 2400, 110, 70},
                                                {10, 2550, 301, 254},
                                                {3100, 3500, 250, 40},  // through straight down
                                                {-3000, 1500, 0, 360}}) {
    for (const bool reversed : {false, true}) {
      ServoDial dial;
      dial.SetStopsUS(reversed ? high : low, reversed ? low : high);
      const DialElement pie = dial.Draw(300, 200).at(4);
      ASSERT_EQ(pie.part, DialPart::kStopsArc);
      EXPECT_NEAR(pie.start_angle / kDialPi * 180, start, 0.01) << low;
      EXPECT_NEAR(pie.sweep_angle / kDialPi * 180, sweep, 0.01) << low;
    }
  }
  ServoDial dial;
  dial.SetRange(90, 90);  // drawing angles of 0
  EXPECT_EQ(dial.Draw(300, 200).at(1).sweep_angle, 0);
  EXPECT_EQ(dial.range().start, 1e-08);
  EXPECT_EQ(dial.range().end, 1e-08);
}

TEST(ServoDial, SizesAndProportions_FollowTheDisplaySize) {
  for (const auto& [size, sizes] :
       {std::pair<int, DialSizes>(1, {3, 0, 6, 2}), {2, {5, 1, 10, 4}}, {0, {8, 2, 20, 4}}}) {
    ServoDial dial;
    dial.DisplaySize(size);
    EXPECT_EQ(dial.sizes(), sizes) << size;
    dial.SetNeutralPosition(0);
    dial.DisplayCaption("CHAN 1");
    const std::vector<DialElement> drawn = dial.Draw(300, 200);
    const auto expect_line = [](const DialElement& e, const std::vector<double>& points_and_pen) {
      EXPECT_THAT((std::vector{e.from.x, e.from.y, e.to.x, e.to.y, e.line_width}),
                  testing::Pointwise(testing::DoubleNear(0.01), points_and_pen));
    };
    const double arm = sizes.arm;
    expect_line(drawn.front(), {100, 60, 200.1, 190, static_cast<double>(sizes.outline)});
    expect_line(drawn.end()[-2], {150, 100, 150, arm, arm + 1});
    if (sizes.marker > 0)
      expect_line(drawn.end()[-3], {150, 100, 150, arm, static_cast<double>(sizes.marker)});
    EXPECT_EQ(std::pair(drawn.back().from.x, drawn.back().from.y), std::pair(150.0, 130.0));
    EXPECT_EQ(drawn[1].radius, 100 - (sizes.margin - sizes.arm));
    EXPECT_EQ(drawn[2].radius, drawn[1].radius - sizes.arm);
  }
}

TEST(ServoDial, Picture_IsNeverCutOff) {
  ServoDial dial;
  dial.SetRange(170, -170);
  dial.SetMovingArm(-90);
  for (const auto& [width, height] :
       Numbers{{300, 300}, {62, 62}, {1000, 60}, {60, 1000}, {12, 9}, {0, 0}, {-4, 20}}) {
    for (const DialElement& element : dial.Draw(width, height)) {
      for (const DialPoint& point : {element.from, element.to}) {
        const double radius = element.radius;
        EXPECT_TRUE(point.x >= radius && point.x <= width - radius && point.y >= radius &&
                    point.y <= height - radius)
            << width << " x " << height << ", part " << static_cast<int>(element.part);
        if (element.shape == DialShape::kPie) break;  // has one point
      }
    }
  }
}

TEST(ServoDial, ServoText_PrintsEachAngleInsteadOfTheCaption) {
  ServoDial dial;
  dial.SetDisplayServoText(true);
  dial.DisplayCaption("CHAN 1");
  dial.SetMovingArmPositionUS(1620);
  dial.SetNeutralPosition(0);
  dial.SetDefaultPosition(10);
  std::string texts;
  for (const DialElement& element : dial.Draw(300, 300)) texts += element.text + "|";
  EXPECT_THAT(texts, testing::EndsWith("|Stops −45°|Stops +45°|Arm −12°|Neutral 0°|Default +10°|"));
}

}  // namespace
}  // namespace tendril
