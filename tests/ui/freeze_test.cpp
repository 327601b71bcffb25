#include "ui/freeze.h"

#include <gtest/gtest.h>

#include <QCoreApplication>
#include <QTest>

namespace tendril {
namespace {

class PaintCounter : public QWidget {
 public:
  using QWidget::QWidget;
  int paints = 0;

 protected:
  void paintEvent(QPaintEvent*) override { ++paints; }
};

// A window with a child, shown and painted; the child counts its paints.
class FreezeTest : public testing::Test {
 protected:
  void SetUp() override {
    window_.resize(200, 100);
    child_.resize(50, 50);
    window_.show();
    ASSERT_TRUE(QTest::qWaitForWindowExposed(&window_));
    Settle();
    child_.paints = 0;
  }

  // Runs the event loop until nothing is left to be painted.
  void Settle() {
    for (int i = 0; i < 3; ++i) QCoreApplication::processEvents();
  }

  // Changes the child as a program would that runs the event loop in between.
  void ChangeChild() {
    for (int i = 0; i < 5; ++i) {
      child_.update();
      Settle();
    }
    child_.repaint();
  }

  QWidget window_;
  PaintCounter child_{&window_};
};

TEST_F(FreezeTest, WhileItLives_NothingIsPaintedAndThenWhatChangedOnce) {
  {
    Freeze freeze;
    freeze.SetForm(&child_);  // a control of the form stands for its window
    ChangeChild();
    EXPECT_EQ(child_.paints, 0);
  }
  Settle();
  EXPECT_EQ(child_.paints, 1);
  child_.update();
  Settle();
  EXPECT_EQ(child_.paints, 2) << "the window is back to normal";
}

}  // namespace
}  // namespace tendril
