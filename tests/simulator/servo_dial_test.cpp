#include "simulator/servo_dial.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>
#include <functional>
#include <limits>

#include "platform/runtime_error.h"

namespace tendril {
namespace {

using testing::AllOf;
using testing::Contains;
using testing::ElementsAre;
using testing::Not;

constexpr std::int32_t kLowest = std::numeric_limits<std::int32_t>::min();
constexpr std::int32_t kHighest = std::numeric_limits<std::int32_t>::max();

std::vector<DialPart> PartsOf(const std::vector<DialElement>& elements) {
  std::vector<DialPart> parts;
  parts.reserve(elements.size());
  for (const DialElement& element : elements) parts.push_back(element.part);
  return parts;
}

DialElement ElementOf(ServoDial& dial, DialPart part, std::int32_t width = 300, std::int32_t height = 200) {
  for (const DialElement& element : dial.Draw(width, height)) {
    if (element.part == part) return element;
  }
  ADD_FAILURE() << "no element for part " << static_cast<int>(part);
  return {};
}

double LengthOf(const DialElement& line) {
  return std::hypot(line.to.x - line.from.x, line.to.y - line.from.y);
}

TEST(ServoDial, Degrees_ConvertToDrawingAngles) {
  struct Case {
    std::int32_t degrees;
    double expected;
  };
  for (const auto& [degrees, expected] : std::vector<Case>{{0, kDialPi / 2},
                                                           {360, kDialPi / 2},
                                                           {-360, kDialPi / 2},
                                                           {90, 0},
                                                           {-90, kDialPi},
                                                           {-450, kDialPi},
                                                           {95, 355 / 180.0 * kDialPi},
                                                           {-95, 185 / 180.0 * kDialPi},
                                                           {kHighest - 270, ServoDial::Convert(217)}}) {
    EXPECT_DOUBLE_EQ(ServoDial::Convert(degrees), expected) << degrees;
  }
  EXPECT_EQ(ServoDial::Convert(-90), 3.141592653238);
}

TEST(ServoDial, PulseWidths_BecomeDegreesWithHalvesToEven) {
  const ServoDial dial;
  for (const auto& [pulse, degrees] : std::vector<std::pair<std::int32_t, std::int32_t>>{
           {1500, 0}, {1000, 50}, {2000, -50}, {1505, 0}, {1495, 0}, {1515, -2}, {1485, 2}, {1506, -1}}) {
    EXPECT_EQ(dial.ToDegrees(pulse), degrees) << pulse;
  }
}

TEST(ServoDial, OverflowingConversion_RaisesAndKeepsTheAngle) {
  ServoDial dial;
  for (const auto& operation : std::vector<std::function<void()>>{
           [&] { dial.SetMovingArm(kLowest); }, [&] { dial.SetMovingArm(kHighest); },
           [&] { dial.SetMovingArm(kHighest - 269); }, [&] { dial.SetMovingArmPositionUS(kLowest); },
           [&] { dial.SetRange(0, kLowest); }, [&] { dial.SetRangeUS(kLowest, 0); }}) {
    try {
      operation();
      ADD_FAILURE() << "no overflow";
    } catch (const RuntimeError& error) {
      EXPECT_EQ(error.number(), kErrOverflow);
      EXPECT_EQ(error.description(), "Overflow");
    }
  }
  EXPECT_EQ(dial.arm_angle(), ServoDial::Convert(0));
  EXPECT_EQ(dial.arm_pulse(), 1500);
  EXPECT_EQ(dial.range_start(), ServoDial::Convert(95));
}

TEST(ServoDial, PulseFormsOfArcs_StoreInReverseOrder) {
  ServoDial dial;
  dial.SetRangeUS(1000, 2000);
  dial.SetLimitUS(1100, 1900);
  dial.SetStopsUS(1200, 1800);
  EXPECT_EQ(dial.range_start(), ServoDial::Convert(-50));
  EXPECT_EQ(dial.range_end(), ServoDial::Convert(50));
  EXPECT_EQ(dial.limit_start(), ServoDial::Convert(-40));
  EXPECT_EQ(dial.limit_end(), ServoDial::Convert(40));
  EXPECT_EQ(dial.stops_start(), ServoDial::Convert(-30));
  EXPECT_EQ(dial.stops_end(), ServoDial::Convert(30));
}

TEST(ServoDial, NeutralPulse_MarksUnderTheOldNeutralAndGovernsTheRest) {
  ServoDial dial;
  dial.SetNeutralPositionUS(1520);
  EXPECT_EQ(dial.neutral_angle(), ServoDial::Convert(0));
  dial.SetMovingArmPositionUS(1520);
  EXPECT_EQ(dial.arm_angle(), ServoDial::Convert(0));
  dial.SetDefaultPositionUS(1500);
  EXPECT_EQ(dial.default_angle(), ServoDial::Convert(2));
  dial.SetNeutralPositionUS(1500);  // 1500 lay 20 below the neutral in force
  EXPECT_EQ(dial.neutral_angle(), ServoDial::Convert(2));
}

TEST(ServoDial, Picture_IsDrawnInItsOrder) {
  ServoDial dial;
  dial.DisplayCaption("CHAN 1");
  EXPECT_THAT(PartsOf(dial.Draw(200, 200)),
              ElementsAre(DialPart::kBody, DialPart::kRangeArc, DialPart::kLimitArc, DialPart::kInnerBody,
                          DialPart::kStopsArc, DialPart::kArm, DialPart::kCaption));
  dial.SetNeutralPosition(0);
  dial.SetDefaultPosition(10);
  for (const std::int32_t size : {2, 3, -1}) {
    dial.DisplaySize(size);
    EXPECT_THAT(PartsOf(dial.Draw(200, 200)),
                ElementsAre(DialPart::kBody, DialPart::kRangeArc, DialPart::kLimitArc, DialPart::kInnerBody,
                            DialPart::kStopsArc, DialPart::kDefaultMarker, DialPart::kDefaultMarkerOutline,
                            DialPart::kNeutralMarker, DialPart::kArm, DialPart::kCaption))
        << size;
  }
  dial.DisplaySize(1);
  EXPECT_THAT(PartsOf(dial.Draw(200, 200)),
              AllOf(Not(Contains(DialPart::kNeutralMarker)), Not(Contains(DialPart::kDefaultMarker))));
}

TEST(ServoDial, Parts_HaveTheirColours) {
  ServoDial dial;
  dial.SetNeutralPosition(0);
  dial.SetDefaultPosition(10);
  for (const auto& [part, colour] :
       std::vector<std::pair<DialPart, DialColour>>{{DialPart::kBody, 0xE0E0E0},
                                                    {DialPart::kRangeArc, 0x80FFFF},
                                                    {DialPart::kLimitArc, 0x00C0C0},
                                                    {DialPart::kInnerBody, 0xD0D0D0},
                                                    {DialPart::kStopsArc, 0xFFC0C0},
                                                    {DialPart::kDefaultMarker, 0xC0C0FF},
                                                    {DialPart::kDefaultMarkerOutline, 0xFFFFFF},
                                                    {DialPart::kNeutralMarker, 0x000000},
                                                    {DialPart::kArm, 0x0000FF}}) {
    EXPECT_EQ(ElementOf(dial, part).fill, colour) << static_cast<int>(part);
  }
}

TEST(ServoDial, Proportions_FollowThePicture) {
  ServoDial dial;
  dial.DisplayCaption("CHAN 1");
  const DialElement body = ElementOf(dial, DialPart::kBody);
  EXPECT_DOUBLE_EQ(body.from.x, 100);
  EXPECT_DOUBLE_EQ(body.from.y, 60);
  EXPECT_DOUBLE_EQ(body.to.x, 200.1);
  EXPECT_DOUBLE_EQ(body.to.y, 190);
  EXPECT_EQ(body.line_width, 4);
  const DialElement inner = ElementOf(dial, DialPart::kInnerBody);
  EXPECT_DOUBLE_EQ(inner.from.x, 102);
  EXPECT_DOUBLE_EQ(inner.to.y, 188);
  const DialElement caption = ElementOf(dial, DialPart::kCaption);
  EXPECT_DOUBLE_EQ(caption.from.x, 150);
  EXPECT_DOUBLE_EQ(caption.from.y, 130);

  struct Case {
    std::int32_t size;
    double range, limit, stops, arm_length, arm_width;
  };
  for (const Case& c :
       {Case{0, 88, 80, 80 - 12, 92, 9}, Case{1, 97, 94, 91, 97, 4}, Case{2, 95, 90, 85, 95, 6}}) {
    dial.DisplaySize(c.size);
    EXPECT_EQ(ElementOf(dial, DialPart::kRangeArc).radius, c.range) << c.size;
    EXPECT_EQ(ElementOf(dial, DialPart::kLimitArc).radius, c.limit) << c.size;
    EXPECT_EQ(ElementOf(dial, DialPart::kStopsArc).radius, c.stops) << c.size;
    EXPECT_DOUBLE_EQ(LengthOf(ElementOf(dial, DialPart::kArm)), c.arm_length) << c.size;
    EXPECT_EQ(ElementOf(dial, DialPart::kArm).line_width, c.arm_width) << c.size;
  }
}

TEST(ServoDial, Arc_IsTheSameInEitherOrderAndKeepsClearOfStraightDown) {
  struct Case {
    std::int32_t low, high;
    double start, sweep;  // degrees
  };
  for (const Case& c : {Case{600, 2400, 0, 180}, Case{1000, 2000, 40, 100}, Case{1700, 2400, 110, 70},
                        Case{10, 2550, 301, 254}}) {
    ServoDial dial;
    dial.SetStopsUS(c.low, c.high);
    const DialElement pie = ElementOf(dial, DialPart::kStopsArc);
    EXPECT_NEAR(pie.start_angle / kDialPi * 180, c.start, 0.01) << c.low;
    EXPECT_NEAR(pie.sweep_angle / kDialPi * 180, c.sweep, 0.01) << c.low;
    dial.SetStopsUS(c.high, c.low);
    EXPECT_EQ(ElementOf(dial, DialPart::kStopsArc).start_angle, pie.start_angle) << c.low;
    EXPECT_EQ(ElementOf(dial, DialPart::kStopsArc).sweep_angle, pie.sweep_angle) << c.low;
  }
}

TEST(ServoDial, AnglesOfZero_AreReplaced) {
  ServoDial dial;
  dial.SetRange(90, -90);
  dial.SetLimit(90, -90);
  dial.SetMovingArm(90);
  const DialElement limit = ElementOf(dial, DialPart::kLimitArc);
  EXPECT_EQ(dial.range_start(), 1e-08);
  EXPECT_EQ(limit.start_angle, 0.00001 * kDialPi);
  EXPECT_EQ(dial.limit_start(), 0);
  EXPECT_LT(ElementOf(dial, DialPart::kArm).to.y, 100);
  dial.SetRange(-90, 90);
  dial.Draw(200, 200);
  EXPECT_EQ(dial.range_end(), 1e-08);
}

TEST(ServoDial, AnyPicture_IsNotCutAndLeavesOutWhatHasNoRoom) {
  ServoDial dial;
  dial.SetRange(170, -170);
  dial.SetNeutralPosition(-90);
  dial.SetDefaultPosition(90);
  dial.SetMovingArm(-90);
  for (const std::int32_t size : {0, 1, 2}) {
    dial.DisplaySize(size);
    for (const auto& [width, height] : std::vector<std::pair<std::int32_t, std::int32_t>>{{300, 300},
                                                                                          {62, 62},
                                                                                          {300, 100},
                                                                                          {100, 300},
                                                                                          {1000, 60},
                                                                                          {60, 1000},
                                                                                          {12, 9},
                                                                                          {1, 1},
                                                                                          {0, 0},
                                                                                          {-4, 20}}) {
      for (const DialElement& element : dial.Draw(width, height)) {
        const double reach = element.shape == DialShape::kPie ? element.radius : 0;
        EXPECT_GE(reach, 0);
        for (const DialPoint& point :
             {element.from, element.shape == DialShape::kBox || element.shape == DialShape::kLine
                                ? element.to
                                : element.from}) {
          EXPECT_GE(point.x - reach, 0) << width << " x " << height;
          EXPECT_LE(point.x + reach, width) << width << " x " << height;
          EXPECT_GE(point.y - reach, 0) << width << " x " << height;
          EXPECT_LE(point.y + reach, height) << width << " x " << height;
        }
      }
    }
  }
}

TEST(ServoDial, ServoText_PrintsEachAngleInPlaceOfTheCaption) {
  ServoDial dial;
  dial.DisplayCaption("CHAN 1");
  dial.SetDisplayServoText(true);
  dial.SetRangeUS(600, 2400);
  dial.SetMovingArmPositionUS(1620);
  dial.SetNeutralPosition(0);
  std::vector<std::string> texts;
  for (const DialElement& element : dial.Draw(300, 300)) {
    if (element.shape == DialShape::kText) texts.push_back(element.text);
  }
  EXPECT_THAT(texts, ElementsAre("Range −90°", "Range +90°", "Limit −50°", "Limit +50°", "Stops −45°",
                                 "Stops +45°", "Arm −12°", "Neutral 0°"));
}

TEST(ServoDial, Resize_DiscardsRangeLimitAndArmOnly) {
  ServoDial dial;
  dial.SetNeutralPositionUS(1600);
  dial.SetRangeUS(600, 2400);
  dial.SetLimitUS(600, 2400);
  dial.SetStopsUS(1200, 1800);
  dial.SetMovingArmPositionUS(2000);
  dial.ResetAfterResize();
  EXPECT_EQ(dial.range_start(), ServoDial::Convert(95));
  EXPECT_EQ(dial.limit_end(), ServoDial::Convert(-50));
  EXPECT_EQ(dial.arm_angle(), ServoDial::Convert(0));
  EXPECT_EQ(dial.arm_pulse(), 1600);
  EXPECT_EQ(dial.stops_end(), ServoDial::Convert(40));
  EXPECT_EQ(dial.neutral_pulse(), 1600);
}

}  // namespace
}  // namespace tendril
