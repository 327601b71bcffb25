#include "ui/hatch.h"

#include <QLineF>
#include <QVarLengthArray>
#include <cmath>

namespace tendril {
namespace {

constexpr double kHatchStep = 5;
constexpr int kUsualLines = 200;

}  // namespace

// Without smoothing: it costs most of the time, and diagonals need none.
void PaintHatch(QPainter& painter, const QRectF& box, const QColor& colour) {
  // From the same origin everywhere, so that a bar that grows does not flicker.
  const double first = kHatchStep * std::floor((box.left() - box.height()) / kHatchStep);
  QVarLengthArray<QLineF, kUsualLines> lines;
  const int count = static_cast<int>(std::ceil((box.right() - first) / kHatchStep));
  for (int line = 0; line < count; ++line) {
    const double x = first + line * kHatchStep;
    lines.append(QLineF(x, box.bottom(), x + box.height(), box.top()));
  }
  painter.save();
  painter.setClipRect(box, Qt::IntersectClip);
  painter.setRenderHint(QPainter::Antialiasing, false);
  painter.setPen(QPen(colour, 1));
  painter.drawLines(lines.constData(), static_cast<int>(lines.size()));
  painter.restore();
}

}  // namespace tendril
