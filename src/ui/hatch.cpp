#include "ui/hatch.h"

#include <cmath>

namespace tendril {
namespace {

constexpr double kHatchStep = 5;

}  // namespace

void PaintHatch(QPainter& painter, const QRectF& box, const QColor& colour) {
  painter.save();
  painter.setClipRect(box, Qt::IntersectClip);
  painter.setRenderHint(QPainter::Antialiasing);
  painter.setPen(QPen(colour, 1));
  // From the same origin everywhere, so that a bar that grows does not flicker.
  const double first = kHatchStep * std::floor((box.left() - box.height()) / kHatchStep);
  for (double x = first; x < box.right(); x += kHatchStep)
    painter.drawLine(QPointF(x, box.bottom()), QPointF(x + box.height(), box.top()));
  painter.restore();
}

}  // namespace tendril
