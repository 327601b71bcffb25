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

// Runs the event loop until nothing is left to be painted.
void Settle() {
  for (int i = 0; i < 3; ++i) QCoreApplication::processEvents();
}

TEST(Freeze, PaintsNothingWhileItLivesAndWhatChangedOnceAfterwards) {
  QWidget window;
  PaintCounter child(&window);
  child.resize(50, 50);
  window.show();
  ASSERT_TRUE(QTest::qWaitForWindowExposed(&window));
  Settle();
  child.paints = 0;
  {
    Freeze freeze;
    freeze.SetForm(&child);  // stands for its window
    for (int i = 0; i < 5; ++i, Settle()) child.update();
    child.repaint();
    EXPECT_EQ(child.paints, 0);
  }
  Settle();
  EXPECT_EQ(child.paints, 1);
  child.update();
  Settle();
  EXPECT_EQ(child.paints, 2) << "the window is back to normal";
}

}  // namespace
}  // namespace tendril
