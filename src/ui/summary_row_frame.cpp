#include "ui/summary_row_frame.h"

#include <QAbstractButton>
#include <QPainter>

#include "simulator/marks.h"

namespace tendril {
namespace {

constexpr QSizeF kBadge(13, 9);
constexpr double kBadgeSign = 7;  // in whole pixels its lines are crisp
constexpr double kEdge = 2;       // around a value
constexpr double kOptionSign = 10;
constexpr double kOptionGap = 3;

void PaintBadge(QPainter& painter, const QPointF& corner, const QPalette& palette) {
  const QRectF badge(corner, kBadge);
  painter.fillRect(badge, palette.color(QPalette::WindowText));
  PaintDiffers(painter, QRectF(corner + QPointF(3, 1), QSizeF(kBadgeSign, kBadgeSign)),
               palette.color(QPalette::Window));
}

}  // namespace

void SummaryRowFrame::ShowDiffers(bool row, const std::vector<const QWidget*>& controls) {
  if (row == row_differs_ && controls == controls_) return;
  row_differs_ = row;
  controls_ = controls;
  update();
}

// The outline keeps away from the edge, which is cut off where a pixel is not a whole number of device pixels.
void SummaryRowFrame::paintEvent(QPaintEvent* /*event*/) {
  QPainter painter(this);
  painter.setPen(QPen(palette().color(QPalette::Mid), 0));
  painter.drawRect(rect().adjusted(1, 1, -2, -2));
  if (row_differs_) PaintBadge(painter, {1, 1}, palette());
  for (const QWidget* control : controls_) {
    const QRectF place = control->geometry().translated(-pos());
    if (qobject_cast<const QAbstractButton*>(control) != nullptr) {
      PaintDiffers(
          painter,
          QRectF(place.right() + kOptionGap, place.center().y() - kOptionSign / 2, kOptionSign, kOptionSign),
          palette().color(QPalette::WindowText));
    } else {
      painter.setPen(QPen(palette().color(QPalette::WindowText), kEdge));
      painter.drawRect(place.adjusted(-kEdge / 2, -kEdge / 2, kEdge / 2, kEdge / 2));
      PaintBadge(painter, {place.left() + 1, place.top() - kBadge.height() + 1}, palette());
    }
  }
}

}  // namespace tendril
