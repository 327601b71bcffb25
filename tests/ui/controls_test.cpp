#include "ui/controls.h"

#include <gtest/gtest.h>

#include <QColor>
#include <QImage>
#include <algorithm>
#include <cstdlib>

namespace tendril {
namespace {

QImage Picture(QGroupBox& box, bool enabled) {
  box.setTitle(QStringLiteral("Title"));
  box.setEnabled(enabled);
  box.resize(300, 200);
  return box.grab().toImage();
}

int LargestDifference(const QImage& a, const QImage& b) {
  int largest = 0;
  for (int y = 0; y < a.height(); ++y) {
    for (int x = 0; x < a.width(); ++x) {
      const QColor left = a.pixelColor(x, y);
      const QColor right = b.pixelColor(x, y);
      for (const int difference : {left.red() - right.red(), left.green() - right.green(),
                                   left.blue() - right.blue(), left.alpha() - right.alpha()}) {
        largest = std::max(largest, std::abs(difference));
      }
    }
  }
  return largest;
}

TEST(FrameBox, PaintedByItself_LooksLikeTheStylesGroupBox) {
  for (const bool enabled : {true, false}) {
    SCOPED_TRACE(enabled);
    FrameBox frame;
    QGroupBox plain;
    const QImage shown = Picture(frame, enabled);
    const QImage expected = Picture(plain, enabled);
    ASSERT_EQ(shown.size(), expected.size());
    EXPECT_LE(LargestDifference(shown, expected), 1);  // rounded otherwise; nobody sees that
  }
}

}  // namespace
}  // namespace tendril
