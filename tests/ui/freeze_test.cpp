#include "ui/freeze.h"

#include <gtest/gtest.h>

#include <QCoreApplication>
#include <QTest>
#include <memory>

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

TEST_F(FreezeTest, SeveralOnOneWindow_TheLastToEndLetsItPaint) {
  for (const bool reverse_order : {true, false}) {
    child_.paints = 0;
    auto first = std::make_unique<Freeze>();
    auto second = std::make_unique<Freeze>();
    first->SetForm(&window_);
    second->SetForm(&window_);
    ChangeChild();
    (reverse_order ? second : first).reset();
    ChangeChild();
    EXPECT_EQ(child_.paints, 0) << reverse_order;
    (reverse_order ? first : second).reset();
    Settle();
    EXPECT_EQ(child_.paints, 1) << reverse_order;
  }
}

TEST_F(FreezeTest, FormDestroyedMeanwhile_EndsWithoutTouchingIt) {
  Freeze freeze;
  auto form = std::make_unique<QWidget>();
  freeze.SetForm(form.get());
  form.reset();
  freeze.SetForm(&window_);
  ChangeChild();
  EXPECT_EQ(child_.paints, 0);
}

}  // namespace
}  // namespace tendril
