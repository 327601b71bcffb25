#include "simulator/servo_simulator.h"

#include <gtest/gtest.h>

#include <QAccessible>
#include <QImage>
#include <QSignalSpy>
#include <QTest>
#include <cmath>

namespace tendril {
namespace {

// Counts its paints and keeps the range of the last one.
class WatchedServo : public ServoSimulator {
 public:
  int paints = 0;
  double painted_range_start = 0;

 protected:
  void paintEvent(QPaintEvent* event) override {
    ++paints;
    ServoSimulator::paintEvent(event);
    painted_range_start = dial().range().start;
  }
};

QImage Painted(ServoSimulator& servo) {
  QImage image(servo.size(), QImage::Format_ARGB32_Premultiplied);
  servo.render(&image);
  return image;
}

void Show(ServoSimulator& servo) {
  servo.resize(110, 110);
  servo.show();
  ASSERT_TRUE(QTest::qWaitForWindowActive(&servo));
}

TEST(ServoSimulator, Picture_ShowsEachPartInItsPlace) {
  ServoSimulator servo;
  servo.resize(210, 210);  // the picture is 200 x 200, its centre at (105, 105)
  Painted(servo);          // delivers the resize, which resets the arm
  servo.SetStops(30, -30);
  servo.SetMovingArmPositionUS(2000);
  const QImage image = Painted(servo);
  const auto at = [&image](double degrees, double radius) {
    const double angle = degrees / 180 * kDialPi;
    return image.pixel(static_cast<int>(105 + radius * std::sin(angle)),
                       static_cast<int>(105 - radius * std::cos(angle)));
  };
  EXPECT_EQ(at(-50, 60), qRgb(255, 0, 0)) << "a longer pulse turns the arm left";
  EXPECT_EQ(at(10, 60), qRgb(192, 192, 255)) << "stops";
  EXPECT_EQ(at(40, 70), qRgb(192, 192, 0)) << "limit";
  EXPECT_EQ(at(80, 70), qRgb(255, 255, 128)) << "range";
  EXPECT_EQ(at(180, 20), qRgb(0xD0, 0xD0, 0xD0)) << "body";
}

TEST(ServoSimulator, SelectionAndFocus_AreVisibleAroundThePicture) {
  ServoSimulator servo;
  const QColor face(40, 40, 40);
  servo.setPalette(QPalette(face));
  Show(servo);
  servo.setAttribute(Qt::WA_UnderMouse, false);
  for (const bool selected : {false, true, false}) {
    servo.clearFocus();
    servo.SelectServo(selected);
    const QImage image = Painted(servo);
    EXPECT_EQ(image.pixel(0, 55), selected ? QColor(Qt::white).rgb() : face.rgb()) << "outline on dark";
    for (const QPoint& point : {QPoint(2, 55), QPoint(4, 55), QPoint(55, 4), QPoint(107, 55)})
      EXPECT_EQ(image.pixel(point), selected ? qRgb(0, 0, 255) : face.rgb())
          << point.x() << ", " << point.y();
    EXPECT_EQ(image.pixel(5, 55 + 40), face.rgb());
    servo.setFocus(Qt::TabFocusReason);
    EXPECT_NE(Painted(servo), image) << selected;
  }
}

TEST(ServoSimulator, Resize_LetsTheContainerRestoreBeforeThePaint) {
  WatchedServo servo;
  Show(servo);
  servo.SetRangeUS(1000, 2000);
  servo.SetLimitUS(1000, 2000);
  servo.SetStopsUS(1200, 1800);
  servo.SetMovingArmPositionUS(2000);
  servo.resize(150, 150);
  EXPECT_EQ(servo.dial().range().start, ServoDial::Convert(95)) << "no container restores it";
  EXPECT_EQ(servo.dial().limit().end, ServoDial::Convert(-50));
  EXPECT_EQ(servo.dial().stops().end, ServoDial::Convert(30));
  EXPECT_EQ(servo.dial().arm_pulse(), 1500);

  QObject::connect(&servo, &ServoSimulator::Resized, &servo, [&servo] { servo.SetRangeUS(1000, 2000); });
  servo.paints = 0;
  servo.resize(200, 180);
  ASSERT_TRUE(QTest::qWaitFor([&servo] { return servo.paints > 0; }));
  EXPECT_EQ(servo.painted_range_start, ServoDial::Convert(-50));
  EXPECT_EQ(servo.paints, 1);
}

TEST(ServoSimulator, Button_HasANameAndAValueAndIsClickedInAnyWay) {
  ServoSimulator servo;
  Show(servo);
  servo.DisplayCaption(QStringLiteral("CHAN 3"));
  QAccessibleInterface* accessible = QAccessible::queryAccessibleInterface(&servo);
  EXPECT_EQ(accessible->role(), QAccessible::Button);
  EXPECT_EQ(accessible->text(QAccessible::Name), QStringLiteral("Channel 3"));
  EXPECT_EQ(accessible->text(QAccessible::Value), QStringLiteral("1500 µs"));
  servo.SelectServo(true);
  EXPECT_TRUE(accessible->state().selected);

  servo.SetMovingArmPositionUS(1620);
  EXPECT_EQ(accessible->text(QAccessible::Value), QStringLiteral("1620 µs"));
  servo.SetMovingArm(-10);
  EXPECT_EQ(accessible->text(QAccessible::Value), QStringLiteral("1600 µs"));
  QSignalSpy clicked(&servo, &ServoSimulator::Clicked);
  accessible->actionInterface()->doAction(QAccessibleActionInterface::pressAction());
  QTest::mouseClick(&servo, Qt::LeftButton, {}, {1, 1});
  QTest::keyClick(&servo, Qt::Key_Enter);
  EXPECT_EQ(clicked.count(), 3);
}

}  // namespace
}  // namespace tendril
