#include "simulator/marks.h"

#include <QPainter>
#include <algorithm>
#include <array>

namespace tendril {
namespace {

constexpr double kDotSize = 7;
constexpr double kSignSize = 9;
constexpr double kSignLine = 0.15;
// The sign lies in a square with sides of 1.
constexpr std::array kSign{QLineF(0.1, 0.36, 0.9, 0.36), QLineF(0.1, 0.66, 0.9, 0.66),
                           QLineF(0.7, 0.05, 0.3, 0.95)};

// The left edge of the picture in the middle of `rect`.
double LeftOfPicture(const QRectF& rect) {
  return rect.center().x() - std::min(rect.width(), rect.height()) / 2;
}

}  // namespace

void PaintMark(QPainter& painter, const QRectF& rect, const QColor& colour) {
  painter.setRenderHint(QPainter::Antialiasing);
  painter.setPen(Qt::NoPen);
  painter.setBrush(colour);
  painter.drawEllipse(QRectF(LeftOfPicture(rect) + kDotSize, rect.top() + kDotSize, kDotSize, kDotSize));
}

void PaintDiffersMark(QPainter& painter, const QRectF& rect, const QColor& colour) {
  PaintDiffers(
      painter,
      QRectF(LeftOfPicture(rect) + kDotSize, rect.bottom() - kDotSize - kSignSize, kSignSize, kSignSize),
      colour);
}

void PaintDiffers(QPainter& painter, const QRectF& box, const QColor& colour) {
  painter.save();
  painter.setRenderHint(QPainter::Antialiasing);
  painter.setPen(QPen(colour, kSignLine, Qt::SolidLine, Qt::FlatCap));
  painter.translate(box.topLeft());
  painter.scale(box.width(), box.height());
  painter.drawLines(kSign.data(), static_cast<int>(kSign.size()));
  painter.restore();
}

}  // namespace tendril
