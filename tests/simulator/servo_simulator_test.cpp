#include "simulator/servo_simulator.h"

#include <gtest/gtest.h>

#include <QAccessible>
#include <QImage>
#include <QSet>
#include <QSignalSpy>
#include <QTest>
#include <cmath>

namespace tendril {
namespace {

// Counts its paints and keeps what the last one showed.
class WatchedServo : public ServoSimulator {
 public:
  int paints = 0;
  double painted_range_start = 0;

 protected:
  void paintEvent(QPaintEvent* event) override {
    ++paints;
    ServoSimulator::paintEvent(event);
    painted_range_start = dial().range_start();
  }
};

QImage Painted(ServoSimulator& servo, double scale = 1) {
  QImage image((QSizeF(servo.size()) * scale).toSize(), QImage::Format_ARGB32_Premultiplied);
  image.setDevicePixelRatio(scale);
  servo.render(&image);
  return image;
}

// Gives the control its size at once, as when it is shown. What a resize resets is reset.
void Resize(ServoSimulator& servo, int width, int height) {
  servo.resize(width, height);
  Painted(servo);
}

QRgb Rgb(const QColor& colour) { return colour.rgb(); }

TEST(ServoSimulator, Picture_ShowsEachPartInItsPlace) {
  ServoSimulator servo;
  Resize(servo, 210, 210);  // the picture is 200 x 200, its centre at (105, 105)
  servo.SetStops(30, -30);
  servo.SetMovingArmPositionUS(2000);
  const QImage image = Painted(servo);
  const auto at = [&image](double degrees, double radius) {
    const double angle = degrees / 180 * kDialPi;
    return image.pixel(static_cast<int>(105 + radius * std::sin(angle)),
                       static_cast<int>(105 - radius * std::cos(angle)));
  };
  EXPECT_EQ(at(-50, 60), qRgb(255, 0, 0)) << "a longer pulse turns the arm left";
  EXPECT_EQ(at(40, 60), at(45, 60)) << "nothing is on the right";
  EXPECT_EQ(at(10, 60), qRgb(192, 192, 255)) << "stops";
  EXPECT_EQ(at(40, 70), qRgb(192, 192, 0)) << "limit";
  EXPECT_EQ(at(80, 70), qRgb(255, 255, 128)) << "range";
  EXPECT_EQ(at(180, 20), qRgb(0xD0, 0xD0, 0xD0)) << "body";
  EXPECT_EQ(at(180, 90), qRgb(0x70, 0x70, 0x70)) << "body outline";
  EXPECT_EQ(at(130, 90), Rgb(servo.palette().color(QPalette::Button))) << "background";
}

TEST(ServoSimulator, BodyEdges_AreCrispAtEveryScale) {
  ServoSimulator servo;
  Resize(servo, 137, 121);
  const QSet<QRgb> allowed = {Rgb(servo.palette().color(QPalette::Button)), qRgb(0x70, 0x70, 0x70),
                              qRgb(0xE0, 0xE0, 0xE0), qRgb(0xD0, 0xD0, 0xD0)};
  for (const std::int32_t size : {0, 1, 2}) {
    servo.DisplaySize(size);
    for (const double scale : {1.0, 1.25, 1.5, 1.75, 2.0, 3.0}) {
      const QImage image = Painted(servo, scale);
      QSet<QRgb> seen;
      int left = 0;  // pixels of the outline on either side
      int right = 0;
      for (int x = 0; x < image.width(); ++x) {
        const QRgb colour = image.pixel(x, image.height() * 8 / 10);
        seen.insert(colour);
        if (colour == qRgb(0x70, 0x70, 0x70)) ++(x < image.width() / 2 ? left : right);
      }
      EXPECT_TRUE(allowed.contains(seen)) << "blended colours at scale " << scale;
      EXPECT_GE(left, 2 * scale) << scale;
      if (scale == std::floor(scale)) {
        EXPECT_EQ(left, right) << scale;
      }
    }
  }
}

TEST(ServoSimulator, Selected_TurnsTheMarginBlueAndLeavesThePicture) {
  for (const QColor& face : {QColor(239, 239, 239), QColor(40, 40, 40)}) {
    ServoSimulator servo;
    servo.setPalette(QPalette(face));
    Resize(servo, 110, 110);
    EXPECT_EQ(Painted(servo).pixel(2, 55), Rgb(face));
    servo.SelectServo(true);
    const QImage image = Painted(servo);
    for (const QPoint& point :
         {QPoint(0, 55), QPoint(4, 55), QPoint(55, 4), QPoint(109, 55), QPoint(55, 105)}) {
      EXPECT_EQ(image.pixel(point), qRgb(0, 0, 255)) << point.x() << ", " << point.y();
    }
    EXPECT_EQ(image.pixel(5, 55 + 40), Rgb(face));
    servo.SelectServo(false);
    EXPECT_EQ(Painted(servo).pixel(2, 55), Rgb(face));
  }
}

TEST(ServoSimulator, Caption_StaysInsideThePictureAndLightBehindIt) {
  for (const QString& caption :
       {QStringLiteral("CHAN 1"), QStringLiteral("A caption that is far too long for it")}) {
    ServoSimulator servo;
    servo.DisplaySize(1);
    servo.setPalette(QPalette(QColor(40, 40, 40)));
    Resize(servo, 72, 72);
    const QImage without = Painted(servo);
    servo.DisplayCaption(caption);
    const QImage with = Painted(servo);
    int changed = 0;
    int light = 0;
    for (int y = 0; y < 72; ++y) {
      for (int x = 0; x < 72; ++x) {
        if (with.pixel(x, y) == without.pixel(x, y)) continue;
        ++changed;
        EXPECT_TRUE(servo.rect().adjusted(5, 5, -5, -5).contains(x, y)) << x << ", " << y;
      }
    }
    // The line of pixels along the caption's top rim holds no letters: it is light even beside the body.
    for (int x = 26; x < 46; ++x) light += qGray(with.pixel(x, 5 + 40 + 1)) > 0xC0 ? 1 : 0;
    EXPECT_GT(changed, 100);
    EXPECT_EQ(light, 20);
  }
}

TEST(ServoSimulator, Focus_IsShownAndDiffersFromSelected) {
  QWidget window;
  ServoSimulator servo(&window);
  Resize(servo, 110, 110);
  for (const bool selected : {false, true}) {
    servo.clearFocus();
    servo.SelectServo(selected);
    window.show();
    const QImage plain = Painted(servo);
    window.activateWindow();
    servo.setFocus(Qt::TabFocusReason);
    ASSERT_TRUE(QTest::qWaitForWindowActive(&window));
    ASSERT_TRUE(servo.hasFocus());
    EXPECT_NE(Painted(servo), plain) << selected;
  }
}

TEST(ServoSimulator, ClicksAndKeys_RaiseClickedOnce) {
  QWidget window;
  ServoSimulator servo(&window);
  servo.resize(110, 110);
  window.show();
  ASSERT_TRUE(QTest::qWaitForWindowExposed(&window));
  QSignalSpy clicked(&servo, &ServoSimulator::Clicked);
  QTest::mouseClick(&servo, Qt::LeftButton, {}, {1, 1});
  EXPECT_EQ(clicked.count(), 1);
  EXPECT_TRUE(servo.hasFocus());
  for (const Qt::Key key : {Qt::Key_Space, Qt::Key_Return, Qt::Key_Enter}) {
    clicked.clear();
    QTest::keyClick(&servo, key);
    EXPECT_EQ(clicked.count(), 1) << key;
  }
  clicked.clear();
  QTest::mousePress(&servo, Qt::LeftButton, {}, {50, 50});
  QTest::mouseRelease(&servo, Qt::LeftButton, {}, {500, 50});
  QTest::mouseClick(&servo, Qt::RightButton);
  QTest::keyClick(&servo, Qt::Key_A);
  EXPECT_EQ(clicked.count(), 0);
}

TEST(ServoSimulator, Resize_ContainerReappliesBeforeThePaint) {
  WatchedServo servo;
  servo.resize(110, 110);
  servo.show();
  ASSERT_TRUE(QTest::qWaitForWindowExposed(&servo));
  servo.SetRangeUS(1000, 2000);
  servo.resize(150, 150);
  EXPECT_EQ(servo.dial().range_start(), ServoDial::Convert(95)) << "nobody re-applies";

  const auto range_start = ServoDial::Convert(-50);
  QObject::connect(&servo, &ServoSimulator::Resized, &servo, [&servo] { servo.SetRangeUS(1000, 2000); });
  servo.paints = 0;
  servo.resize(200, 180);
  ASSERT_TRUE(QTest::qWaitFor([&servo] { return servo.paints > 0; }));
  EXPECT_EQ(servo.painted_range_start, range_start);
  EXPECT_EQ(servo.paints, 1);
}

TEST(ServoSimulator, ManyOperations_PaintOnce) {
  WatchedServo servo;
  servo.resize(110, 110);
  servo.show();
  ASSERT_TRUE(QTest::qWaitForWindowExposed(&servo));
  ASSERT_TRUE(QTest::qWaitFor([&servo] { return servo.paints > 0; }));
  QCoreApplication::processEvents();
  servo.paints = 0;
  servo.SetRangeUS(600, 2400);
  servo.SetLimitUS(700, 2300);
  servo.SetStopsUS(800, 2200);
  servo.SetMovingArm(10);
  QCoreApplication::processEvents();
  EXPECT_EQ(servo.paints, 0) << "these set without drawing";
  servo.SetNeutralPositionUS(1520);
  servo.SetDefaultPositionUS(1480);
  servo.DisplaySize(1);
  servo.SetMovingArmPositionUS(1600);
  servo.DrawServo();
  QCoreApplication::processEvents();
  EXPECT_EQ(servo.paints, 1);
}

TEST(ServoSimulator, ServoText_TakesTheCaptionsPlace) {
  ServoSimulator servo;
  Resize(servo, 210, 210);
  servo.DisplayCaption(QStringLiteral("CHAN 1"));
  const QImage caption = Painted(servo);
  QSignalSpy changed(&servo, &ServoSimulator::DisplayServoTextChanged);
  servo.SetDisplayServoText(true);
  EXPECT_TRUE(servo.DisplayServoText());
  EXPECT_EQ(changed.count(), 1);
  EXPECT_NE(Painted(servo), caption);
}

TEST(ServoSimulator, AssistiveTechnology_FindsNameValueAndPress) {
  ServoSimulator servo;
  servo.DisplayCaption(QStringLiteral("CHAN 3"));
  QAccessibleInterface* accessible = QAccessible::queryAccessibleInterface(&servo);
  ASSERT_NE(accessible, nullptr);
  EXPECT_EQ(accessible->role(), QAccessible::Button);
  EXPECT_EQ(accessible->text(QAccessible::Name), QStringLiteral("Channel 3"));
  EXPECT_EQ(accessible->text(QAccessible::Value), QStringLiteral("1500 µs"));
  servo.setAccessibleName(QStringLiteral("Current channel"));
  EXPECT_EQ(accessible->text(QAccessible::Name), QStringLiteral("Current channel"));
  servo.SelectServo(true);
  EXPECT_TRUE(accessible->state().selected);

  servo.SetMovingArmPositionUS(1620);
  EXPECT_EQ(accessible->text(QAccessible::Value), QStringLiteral("1620 µs"));
  servo.SetMovingArm(-10);
  EXPECT_EQ(accessible->text(QAccessible::Value), QStringLiteral("1600 µs"));
  ASSERT_NE(accessible->valueInterface(), nullptr);
  EXPECT_EQ(accessible->valueInterface()->currentValue().toInt(), 1600);

  QSignalSpy clicked(&servo, &ServoSimulator::Clicked);
  accessible->actionInterface()->doAction(QAccessibleActionInterface::pressAction());
  EXPECT_EQ(clicked.count(), 1);
}

}  // namespace
}  // namespace tendril
