#include "ui/controls.h"

#include <gtest/gtest.h>

#include <QImage>
#include <algorithm>
#include <cstdlib>

namespace tendril {
namespace {

QImage Picture(QGroupBox& box, bool enabled) {
  box.setTitle(QStringLiteral("Title"));
  box.setEnabled(enabled);
  box.resize(300, 200);
  return box.grab().toImage().convertToFormat(QImage::Format_ARGB32);
}

TEST(FrameBox, LooksLikeTheGroupBoxOfTheStyle) {
  for (const bool enabled : {true, false}) {
    FrameBox frame;
    QGroupBox plain;
    const QImage shown = Picture(frame, enabled);
    const QImage expected = Picture(plain, enabled);
    ASSERT_EQ(shown.sizeInBytes(), expected.sizeInBytes());
    int largest = 0;
    for (qsizetype i = 0; i < shown.sizeInBytes(); ++i)
      largest = std::max(largest, std::abs(shown.constBits()[i] - expected.constBits()[i]));
    EXPECT_LE(largest, 1) << "rounding alone may differ";
  }
}

}  // namespace
}  // namespace tendril
